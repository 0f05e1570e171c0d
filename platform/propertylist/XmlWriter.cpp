#include "platform/propertylist/XmlWriter.h"

#include "platform/propertylist/Limits.h"
#include "support/Base64.h"
#include "support/Format.h"
#include "support/Utf8.h"

#include <charconv>
#include <cmath>

namespace kestrum::propertylist {
namespace {

constexpr std::string_view kReplacement = "\uFFFD";
constexpr std::size_t kLineLength = 76; // of base64, as in mail

bool isPlain(char character)
{
    return character >= ' ' && character < '\x7F' && character != '&' && character != '<' && character != '>';
}

/// XML 1.0, production 2 (Char).
bool isAllowed(char32_t character)
{
    return character >= 0x20 ? character != 0xFFFE && character != 0xFFFF
                             : character == '\t' || character == '\n' || character == '\r';
}

std::string realText(double real)
{
    if (std::isnan(real))
        return "nan";
    char digits[32]; // the shortest text that reads back as the same number
    return {digits, std::to_chars(digits, digits + sizeof digits, real).ptr};
}

class XmlWriter {
public:
    std::string write(const Value& root)
    {
        _out = "<?xml version=\"1.0\" encoding=\"UTF-8\"?>\n<plist version=\"1.0\">\n";
        open(root);
        while (!_open.empty())
            step();
        append("</plist>\n");
        return std::move(_out);
    }

private:
    /// A container whose closing tag is not written. Borrowed.
    struct Open {
        const Array* array;
        const Dictionary* dictionary;
        std::size_t next = 0;
    };

    /// Writes the innermost container's next child, or its end.
    void step()
    {
        Open& inner = _open.back();
        if (inner.array != nullptr && inner.next < inner.array->size())
            return child((*inner.array)[inner.next++]);
        if (inner.dictionary != nullptr && inner.next < inner.dictionary->size()) {
            const auto& entry = inner.dictionary->begin()[static_cast<std::ptrdiff_t>(inner.next++)];
            return child(entry.value, &entry.key);
        }
        const std::string_view end = inner.array != nullptr ? "</array>\n" : "</dict>\n";
        _open.pop_back();
        indent();
        append(end);
    }

    void child(const Value& value, const std::string* key = nullptr)
    {
        if (value.isNull())
            return;
        if (key != nullptr) {
            indent();
            element("key", *key);
        }
        open(value);
    }

    /// Writes a value; of a container only the opening tag.
    void open(const Value& value)
    {
        _budget.takeNode();
        indent();
        switch (value.kind()) {
        case Value::Kind::Array:
            return container("array", value.array()->empty(), {value.array().get(), nullptr});
        case Value::Kind::Dictionary:
            return container("dict", value.dictionary()->empty(), {nullptr, value.dictionary().get()});
        case Value::Kind::String:
            return element("string", *value.text());
        case Value::Kind::Integer:
            return element("integer", value.integer() ? formatted("%ld", *value.integer())
                                                      : formatted("%lu", *value.unsignedInteger()));
        case Value::Kind::Real:
            return element("real", realText(*value.real()));
        case Value::Kind::Boolean:
            return append(*value.boolean() ? "<true/>\n" : "<false/>\n");
        case Value::Kind::Date:
            return date(*value.date());
        case Value::Kind::Data:
            return data(value.data()->bytes());
        case Value::Kind::Null:
            break; // child() leaves nulls out; a null root was refused before
        }
    }

    void container(std::string_view tag, bool empty, Open opened)
    {
        checkDepth(_open.size());
        append("<");
        append(tag);
        append(empty ? "/>\n" : ">\n");
        if (!empty)
            _open.push_back(opened);
    }

    void element(std::string_view tag, std::string_view text)
    {
        append("<");
        append(tag);
        append(">");
        escaped(text);
        append("</");
        append(tag);
        append(">\n");
    }

    void date(Date date)
    {
        const std::string text = isoText(date);
        if (!dateFromIso(text))
            throw Refusal{"a date outside the years 0 to 9999"};
        element("date", text);
    }

    void data(Bytes bytes)
    {
        append("<data>\n");
        const std::string text = base64(bytes);
        for (std::size_t at = 0; at < text.size(); at += kLineLength) {
            indent();
            append(std::string_view(text).substr(at, kLineLength));
            append("\n");
        }
        indent();
        append("</data>\n");
    }

    void escaped(std::string_view text)
    {
        for (std::size_t at = 0; at < text.size();) {
            const std::size_t from = at;
            while (at < text.size() && isPlain(text[at]))
                ++at;
            append(text.substr(from, at - from));
            if (at < text.size())
                appendCharacter(text, at);
        }
    }

    void appendCharacter(std::string_view text, std::size_t& at)
    {
        const std::size_t from = at;
        const auto character = nextCharacter(text, at);
        if (!character || !isAllowed(*character))
            append(kReplacement);
        else if (*character == '&')
            append("&amp;");
        else if (*character == '<')
            append("&lt;");
        else if (*character == '>')
            append("&gt;");
        else if (*character == '\r')
            append("&#13;"); // a reader would turn a raw carriage return into a line feed
        else
            append(text.substr(from, at - from));
    }

    void indent()
    {
        _budget.takeBytes(_open.size());
        _out.append(_open.size(), '\t');
    }

    void append(std::string_view text)
    {
        _budget.takeBytes(text.size());
        _out += text;
    }

    std::string _out;
    std::vector<Open> _open;
    Budget _budget{PropertyListCodec::kMaxNodes, PropertyListCodec::kMaxBytes};
};

} // namespace

std::string writeXml(const Value& value)
{
    return XmlWriter().write(value);
}

} // namespace kestrum::propertylist
