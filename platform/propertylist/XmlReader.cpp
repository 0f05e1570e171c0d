#include "platform/propertylist/XmlReader.h"

#include "platform/propertylist/Limits.h"
#include "support/Base64.h"
#include "support/Format.h"

#include <expat.h>

#include <algorithm>
#include <charconv>
#include <cmath>
#include <memory>

namespace kestrum::propertylist {
namespace {

constexpr bool isBlank(char character)
{
    return character == ' ' || character == '\t' || character == '\n' || character == '\r';
}

std::string_view trimmed(std::string_view text)
{
    while (!text.empty() && isBlank(text.front()))
        text.remove_prefix(1);
    while (!text.empty() && isBlank(text.back()))
        text.remove_suffix(1);
    return text;
}

/// The whole text as a number, or nothing.
template <typename Number, typename... Form>
std::optional<Number> number(std::string_view text, Form... form)
{
    Number value{};
    const auto [end, error] = std::from_chars(text.data(), text.data() + text.size(), value, form...);
    return error == std::errc{} && end == text.data() + text.size() ? std::optional(value) : std::nullopt;
}

std::string_view withoutPlus(std::string_view text)
{
    return text.starts_with('+') && !text.substr(1).starts_with('-') ? text.substr(1) : text;
}

/// A decimal number, or a hexadecimal one after "0x", from -2^63 to 2^64-1.
Value integerFrom(std::string_view text)
{
    text = withoutPlus(trimmed(text));
    const bool hexadecimal = text.starts_with("0x") || text.starts_with("0X");
    if (const auto value = hexadecimal ? number<std::uint64_t>(text.substr(2), 16) : number<std::uint64_t>(text))
        return *value;
    if (const auto value = number<std::int64_t>(text))
        return *value;
    throw Refusal{"not an integer of 64 bits"};
}

/// A decimal number, "nan", "inf" or "infinity". Nothing for a number that would be rounded to infinity or to zero.
Value realFrom(std::string_view text)
{
    text = withoutPlus(trimmed(text));
    const auto value = number<double>(text, std::chars_format::general);
    const auto mantissa = text.substr(0, text.find_first_of("eE"));
    const bool digits = text.find_first_of("0123456789") != std::string_view::npos;
    if (!value || text.ends_with(')') || (digits && std::isinf(*value)) ||
        (*value == 0 && mantissa.find_first_of("123456789") != std::string_view::npos))
        throw Refusal{"not a real number of 64 bits"};
    return *value;
}

Value dateFrom(std::string_view text)
{
    if (const auto date = dateFromIso(trimmed(text)))
        return *date;
    throw Refusal{"not a date"};
}

Value dataFrom(std::string_view text)
{
    if (auto bytes = bytesFromBase64(text))
        return Data(std::move(*bytes));
    throw Refusal{"not base64"};
}

Value booleanFrom(std::string_view text, bool value)
{
    if (!trimmed(text).empty())
        throw Refusal{"text inside a boolean"};
    return value;
}

struct FreeParser {
    void operator()(XML_Parser parser) const { XML_ParserFree(parser); }
};

/// An expat parser, reset after each list. Each thread keeps one: a telephony service sends many lists, and a new
/// parser makes many allocations.
class Parser {
public:
    explicit Parser(std::size_t bytesToRead) : _parser(std::move(spare())), _isKept(bytesToRead <= kKeptUpTo)
    {
        if (_parser == nullptr || XML_ParserReset(_parser.get(), nullptr) != XML_TRUE)
            _parser.reset(XML_ParserCreate(nullptr));
    }
    ~Parser()
    {
        if (_isKept)
            spare() = std::move(_parser);
    }
    Parser(const Parser&) = delete;
    Parser& operator=(const Parser&) = delete;

    XML_Parser get() const { return _parser.get(); }

private:
    static constexpr std::size_t kKeptUpTo = 1 << 20; // bytes; after a longer list the parser is freed with its buffers

    using Owner = std::unique_ptr<XML_ParserStruct, FreeParser>;
    static Owner& spare()
    {
        thread_local Owner kept;
        return kept;
    }

    Owner _parser;
    bool _isKept;
};

class XmlReader {
public:
    XmlReader(Bytes bytes, Value spent) : _bytes(bytes), _parser(bytes.size()), _root(std::move(spent)) {}

    Value read()
    {
        XML_SetUserData(_parser.get(), this);
        XML_SetElementHandler(
            _parser.get(), [](void* self, const char* name, const char**) { guarded(self, &XmlReader::start, name); },
            [](void* self, const char*) { guarded(self, &XmlReader::end); });
        XML_SetCharacterDataHandler(_parser.get(), [](void* self, const char* text, int length) {
            guarded(self, &XmlReader::characters, std::string_view(text, static_cast<std::size_t>(length)));
        });
        // A DOCTYPE may name a DTD, which is not read. Declarations inside the document are refused: entities could
        // expand without limit, attributes could slow every element down.
        XML_SetStartDoctypeDeclHandler(_parser.get(), [](void* self, const char*, const char*, const char*, int own) {
            guarded(self, &XmlReader::doctype, own != 0);
        });
        XML_SetSkippedEntityHandler(_parser.get(),
                                    [](void* self, const char*, int) { guarded(self, &XmlReader::refuseEntity); });

        const auto status = XML_Parse(_parser.get(), textOf(_bytes).data(), static_cast<int>(_bytes.size()), XML_TRUE);
        if (_refusal)
            throw *_refusal;
        if (status != XML_STATUS_OK)
            throw Refusal{XML_ErrorString(XML_GetErrorCode(_parser.get())), offset()};
        return std::move(_root);
    }

private:
    enum class Element { Plist, Dict, Array, Key, String, Integer, Real, Date, Data, True, False };

    /// An open element with children; <plist> holds the root. The container that it fills is already part of the root.
    struct Container {
        Array* array = nullptr;
        Dictionary* dictionary = nullptr;
        std::string key = {};
        bool awaitsValue = false; ///< a key was read, its value was not
    };

    /// Runs a handler. Exceptions must not pass through expat, so a refusal is stored and thrown when expat returns.
    template <typename... Parameters, typename... Arguments>
    static void guarded(void* self, void (XmlReader::*handler)(Parameters...), Arguments... arguments)
    {
        auto& reader = *static_cast<XmlReader*>(self);
        if (reader._refusal)
            return; // a stopped parser may still report the end of an empty element
        try {
            (reader.*handler)(arguments...);
        } catch (const Refusal& refusal) {
            reader._refusal = Refusal{refusal.reason, reader.offset()};
        } catch (const std::exception& failure) {
            reader._refusal = Refusal{failure.what(), reader.offset()};
        }
        if (reader._refusal)
            XML_StopParser(reader._parser.get(), XML_FALSE);
    }

    std::size_t offset() const
    {
#if XML_MAJOR_VERSION > 2 || XML_MINOR_VERSION >= 9 // the other name is deprecated there
        const auto index = XML_GetCurrentByteIndex64(_parser.get());
#else
        const auto index = XML_GetCurrentByteIndex(_parser.get());
#endif
        return index < 0 ? 0 : static_cast<std::size_t>(index); // negative before the first byte
    }

    static Element elementNamed(std::string_view name)
    {
        static constexpr std::pair<std::string_view, Element> kElements[] = {
            {"key", Element::Key},     {"string", Element::String}, {"integer", Element::Integer},
            {"dict", Element::Dict},   {"array", Element::Array},   {"true", Element::True},
            {"false", Element::False}, {"real", Element::Real},     {"date", Element::Date},
            {"data", Element::Data},   {"plist", Element::Plist}};
        for (const auto& [known, element] : kElements)
            if (known == name)
                return element;
        throw Refusal{formatted("unknown element <%s>", name)};
    }

    void start(const char* name)
    {
        const Element element = elementNamed(name);
        if (element == Element::Plist ? !_open.empty() : !mayHold(element))
            throw Refusal{formatted("<%s> is not allowed here", name)};
        if (element != Element::Plist && element != Element::Key)
            _budget.takeNode();
        if (element == Element::Dict || element == Element::Array)
            checkDepth(_open.size() - 1); // <plist> does not count
        if (element == Element::Dict)
            _open.push_back({.dictionary = &slot().becomeDictionary()});
        else if (element == Element::Array)
            _open.push_back({.array = &slot().becomeArray()});
        else if (element == Element::Plist)
            _open.emplace_back();
        else
            _leaf = element;
        _text.clear();
    }

    /// Whether the innermost open element may hold the element at this point.
    bool mayHold(Element element) const
    {
        if (_open.empty() || _leaf)
            return false;
        const Container& inner = _open.back();
        if (inner.dictionary != nullptr)
            return (element == Element::Key) != inner.awaitsValue;
        return element != Element::Key && (inner.array != nullptr || !_hasRoot);
    }

    void characters(std::string_view text)
    {
        if (_leaf)
            _text += text;
        else if (!std::ranges::all_of(text, isBlank))
            throw Refusal{"text is not allowed here"};
    }

    void end()
    {
        if (const auto leaf = std::exchange(_leaf, std::nullopt)) {
            if (*leaf == Element::Key)
                takeKey();
            else if (*leaf == Element::String)
                slot().assignText(_text);
            else
                slot() = valueOf(*leaf);
            return;
        }
        const Container& closed = _open.back();
        if (closed.awaitsValue)
            throw Refusal{"a key without a value"};
        if (closed.dictionary != nullptr)
            closed.dictionary->dropSpares();
        else if (closed.array != nullptr)
            closed.array->dropSpares();
        else if (!_hasRoot)
            throw Refusal{"no value inside <plist>"};
        _open.pop_back();
    }

    /// Swaps the strings, so that the next text reuses memory.
    void takeKey()
    {
        Container& inner = _open.back();
        inner.key.swap(_text);
        inner.awaitsValue = true;
    }

    /// The value of the text read, for all leaves except keys and strings.
    Value valueOf(Element leaf)
    {
        switch (leaf) {
        case Element::Integer:
            return integerFrom(_text);
        case Element::Real:
            return realFrom(_text);
        case Element::Date:
            return dateFrom(_text);
        case Element::Data:
            return dataFrom(_text);
        default:
            return booleanFrom(_text, leaf == Element::True);
        }
    }

    /// The place of the next value in the innermost open element.
    Value& slot()
    {
        Container& inner = _open.back();
        inner.awaitsValue = false;
        if (inner.array != nullptr)
            return inner.array->slot();
        if (inner.dictionary != nullptr)
            return inner.dictionary->slot(inner.key);
        _hasRoot = true;
        return _root;
    }

    void doctype(bool declaresAnything)
    {
        if (declaresAnything)
            throw Refusal{"a DOCTYPE with declarations"};
    }

    void refuseEntity() { throw Refusal{"entities other than the standard ones are not supported"}; }

    Bytes _bytes;
    Parser _parser;
    std::optional<Refusal> _refusal;
    std::vector<Container> _open;
    std::optional<Element> _leaf; ///< inside the innermost open element
    std::string _text;            ///< of the leaf
    Value _root;                  ///< holds the spent value until the root element begins
    bool _hasRoot = false;
    Budget _budget{PropertyListCodec::kMaxNodes, PropertyListCodec::kMaxBytes};
};

} // namespace

Value readXml(Bytes bytes, Value spent)
{
    return XmlReader(bytes, std::move(spent)).read();
}

} // namespace kestrum::propertylist
