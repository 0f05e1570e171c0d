#include "platform/propertylist/XmlReader.h"

#include "platform/propertylist/Limits.h"
#include "support/Base64.h"
#include "support/Format.h"

#include <expat.h>

#include <charconv>
#include <cmath>
#include <memory>

namespace kestrum::propertylist {
namespace {

constexpr std::string_view kBlanks = " \t\n\r";

std::string_view trimmed(std::string_view text)
{
    const auto first = text.find_first_not_of(kBlanks);
    return first == std::string_view::npos ? "" : text.substr(first, text.find_last_not_of(kBlanks) - first + 1);
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

/// Decimal, or hexadecimal behind "0x", from -2^63 to 2^64-1.
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

/// Decimal, "nan", "inf" or "infinity". A number so large or so small that it would become infinite or zero is none.
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

class XmlReader {
public:
    Value read(Bytes bytes)
    {
        XML_SetUserData(_parser.get(), this);
        XML_SetElementHandler(
            _parser.get(), [](void* self, const char* name, const char**) { guarded(self, &XmlReader::start, name); },
            [](void* self, const char*) { guarded(self, &XmlReader::end); });
        XML_SetCharacterDataHandler(_parser.get(), [](void* self, const char* text, int length) {
            guarded(self, &XmlReader::characters, std::string_view(text, static_cast<std::size_t>(length)));
        });
        // A DOCTYPE may name the usual DTD, which is not read. Declarations of the document's own could grow without
        // end (entities) or slow every element down (attributes).
        XML_SetStartDoctypeDeclHandler(_parser.get(), [](void* self, const char*, const char*, const char*, int own) {
            guarded(self, &XmlReader::doctype, own != 0);
        });
        XML_SetSkippedEntityHandler(_parser.get(),
                                    [](void* self, const char*, int) { guarded(self, &XmlReader::refuseEntity); });

        const auto status = XML_Parse(_parser.get(), textOf(bytes).data(), static_cast<int>(bytes.size()), XML_TRUE);
        if (_refusal)
            throw *_refusal;
        if (status != XML_STATUS_OK)
            throw Refusal{XML_ErrorString(XML_GetErrorCode(_parser.get())), offset()};
        return std::move(_root);
    }

private:
    enum class Element { Plist, Dict, Array, Key, String, Integer, Real, Date, Data, True, False };

    struct Open {
        Element element;
        ArrayRef array = nullptr;
        DictionaryRef dictionary = nullptr;
        std::optional<std::string> key = std::nullopt; ///< read, its value still to come
    };

    struct FreeParser {
        void operator()(XML_Parser parser) const { XML_ParserFree(parser); }
    };

    /// Runs a handler. Nothing may be thrown through expat, so a refusal waits here until it has returned.
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

    std::size_t offset() const { return static_cast<std::size_t>(XML_GetCurrentByteIndex(_parser.get())); }

    static Element elementNamed(std::string_view name)
    {
        constexpr std::pair<std::string_view, Element> kElements[] = {
            {"plist", Element::Plist},     {"dict", Element::Dict}, {"array", Element::Array}, {"key", Element::Key},
            {"string", Element::String},   {"real", Element::Real}, {"date", Element::Date},   {"data", Element::Data},
            {"integer", Element::Integer}, {"true", Element::True}, {"false", Element::False}};
        for (const auto& [known, element] : kElements)
            if (known == name)
                return element;
        throw Refusal{format("unknown element <%s>", name)};
    }

    static bool isContainer(Element element)
    {
        return element == Element::Plist || element == Element::Dict || element == Element::Array;
    }

    void start(const char* name)
    {
        const Element element = elementNamed(name);
        if (element == Element::Plist ? !_open.empty() : !mayHold(element))
            throw Refusal{format("<%s> is out of place", name)};
        Open opened{element};
        if (element == Element::Dict || element == Element::Array) {
            checkDepth(_open.size() - 1); // <plist> is no level of its own
            opened.array = element == Element::Array ? makeArray() : nullptr;
            opened.dictionary = element == Element::Dict ? makeDictionary() : nullptr;
        }
        if (element != Element::Plist && element != Element::Key)
            _budget.takeNode();
        _open.push_back(std::move(opened));
        _text.clear();
    }

    /// Whether the innermost open element may hold the element at this point.
    bool mayHold(Element element) const
    {
        if (_open.empty())
            return false;
        const Open& inner = _open.back();
        switch (inner.element) {
        case Element::Plist:
            return element != Element::Key && _root.isNull();
        case Element::Array:
            return element != Element::Key;
        case Element::Dict:
            return (element == Element::Key) != inner.key.has_value();
        default:
            return false;
        }
    }

    void characters(std::string_view text)
    {
        if (!_open.empty() && !isContainer(_open.back().element))
            _text += text;
        else if (!trimmed(text).empty())
            throw Refusal{"text out of place"};
    }

    void end()
    {
        const Open closed = std::move(_open.back());
        _open.pop_back();
        switch (closed.element) {
        case Element::Plist:
            if (_root.isNull())
                throw Refusal{"no value inside <plist>"};
            return;
        case Element::Key:
            _open.back().key = std::move(_text);
            return;
        case Element::Dict:
            if (closed.key)
                throw Refusal{"a key without a value"};
            return add(closed.dictionary);
        case Element::Array:
            return add(closed.array);
        case Element::String:
            return add(std::move(_text));
        case Element::Integer:
            return add(integerFrom(_text));
        case Element::Real:
            return add(realFrom(_text));
        case Element::Date:
            return add(dateFrom(_text));
        case Element::Data:
            return add(dataFrom(_text));
        case Element::True:
            return add(booleanFrom(_text, true));
        case Element::False:
            return add(booleanFrom(_text, false));
        }
    }

    /// Gives a complete value to the element that holds it.
    void add(Value value)
    {
        Open& inner = _open.back();
        if (inner.array)
            inner.array->append(std::move(value));
        else if (inner.dictionary)
            inner.dictionary->set(*std::exchange(inner.key, std::nullopt), std::move(value));
        else
            _root = std::move(value);
    }

    void doctype(bool declaresAnything)
    {
        if (declaresAnything)
            throw Refusal{"a DOCTYPE with declarations"};
    }

    void refuseEntity() { throw Refusal{"entities other than the standard ones are not read"}; }

    std::unique_ptr<XML_ParserStruct, FreeParser> _parser{XML_ParserCreate(nullptr)};
    std::optional<Refusal> _refusal;
    std::vector<Open> _open;
    std::string _text; ///< of the innermost element, when that is no container
    Value _root;
    Budget _budget{PropertyListCodec::kMaxNodes, PropertyListCodec::kMaxBytes};
};

} // namespace

Value readXml(Bytes bytes)
{
    return XmlReader().read(bytes);
}

} // namespace kestrum::propertylist
