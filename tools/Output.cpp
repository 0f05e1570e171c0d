#include "tools/Output.h"

#include "core/KestrumModelNode.h"
#include "support/Base64.h"
#include "support/Format.h"
#include "tools/Changes.h"
#include "tools/Harmless.h"

#include <nlohmann/json.hpp>

#include <algorithm>
#include <charconv>
#include <cstdio>
#include <utility>

namespace kestrum::tools {
namespace {

using Json = nlohmann::ordered_json;

/// Digits of the fraction of a second: time stamps count 1.25 ms.
constexpr int kFraction = 6;

std::string text(const Json& json, int indent = -1)
{
    return json.dump(indent, ' ', false, Json::error_handler_t::replace);
}

Json jsonOf(const Value& value)
{
    switch (value.kind()) {
    case Value::Kind::String:
        return *value.text();
    case Value::Kind::Integer:
        if (const auto number = value.integer())
            return *number;
        return *value.unsignedInteger();
    case Value::Kind::Real:
        return *value.real();
    case Value::Kind::Boolean:
        return *value.boolean();
    case Value::Kind::Date:
        return isoText(*value.date());
    case Value::Kind::Data:
        return base64(value.data()->bytes());
    case Value::Kind::Array: {
        Json list = Json::array();
        for (const auto& element : *value.array())
            list.push_back(jsonOf(element));
        return list;
    }
    case Value::Kind::Dictionary: {
        Json object = Json::object();
        // Keys are unique, so the entries need no search.
        auto& entries = object.get_ref<Json::object_t&>();
        for (const auto& [key, held] : *value.dictionary())
            entries.push_back({key, jsonOf(held)});
        return object;
    }
    case Value::Kind::Null:
        break;
    }
    return nullptr;
}

/// Appends a text as JSON. Nearly all texts are plain and need only quotes.
void appendJson(std::string& to, std::string_view raw)
{
    const auto isPlain = [](char c) { return c >= 0x20 && c < 0x7F && c != '"' && c != '\\'; };
    if (!std::ranges::all_of(raw, isPlain)) {
        to += text(Json(raw));
        return;
    }
    to += '"';
    to += raw;
    to += '"';
}

/// The shortest decimal text that reads back as the number.
std::string numberText(double number)
{
    char digits[32];
    return {digits, std::to_chars(std::begin(digits), std::end(digits), number).ptr};
}

/// A value as plain text, for a table's cell or a line of a tree.
std::string plainText(const Value& value)
{
    if (auto words = value.text())
        return *std::move(words);
    return value.isNull() ? std::string() : text(jsonOf(value));
}

Json jsonOf(const SnapshotListing& listing)
{
    Json entries = Json::array();
    for (const auto& entry : listing.entries)
        entries.push_back({{"description", entry.description},
                           {"date", entry.date},
                           {"content", entry.content},
                           {"size", entry.size}});
    const auto orNull = [](const std::optional<std::string>& held) { return held ? Json(*held) : Json(); };
    return {{"file", listing.file},
            {"timestamp", orNull(listing.timestamp)},
            {"description", orNull(listing.description)},
            {"entries", std::move(entries)}};
}

void list(const SnapshotListing& listing, OutputFile& to)
{
    to.write(formatted("Snapshot %s\n", onOneLine(listing.file)));
    to.write(formatted("  Timestamp: %s\n", onOneLine(listing.timestamp.value_or("(none)"))));
    to.write(formatted("  Description: %s\n", onOneLine(listing.description.value_or("(none)"))));
    for (std::size_t i = 0; i < listing.entries.size(); ++i) {
        const auto& entry = listing.entries[i];
        to.write(formatted("  Entry %lu: %s; date %s; %s, %lu %s\n", i,
                           entry.description.empty() ? "(no description)" : onOneLine(entry.description),
                           entry.date.empty() ? "(none)" : onOneLine(entry.date), entry.content, entry.size,
                           entry.content == "tree" ? "values" : "bytes"));
    }
}

/// Remarks that are not part of the data.
class RemarkingOutput : public Output {
public:
    RemarkingOutput(Contents contents, OutputFile& data, OutputFile& remarks)
        : _data(data), _remarks(remarks), _withLog(contents.log)
    {}

    void logLine(Priority priority, std::string_view line) override
    {
        if (_withLog)
            _remarks.write(text(Json::array({static_cast<int>(priority), line})) + '\n');
    }
    void snapshot(const SnapshotListing& listing) override { list(listing, _remarks); }

protected:
    OutputFile& _data;
    OutputFile& _remarks;
    const bool _withLog;
};

class TreeOutput final : public RemarkingOutput {
public:
    using RemarkingOutput::RemarkingOutput;

    void snapshot(const SnapshotListing& listing) override
    {
        list(listing, _data);
        _data.write("\n");
    }

    void display(const Decoding& decoding) override
    {
        if (std::exchange(_again, true))
            _data.write("\n");
        const Value display = decoding.display();
        if (!display)
            return;
        PathDictionary paths;
        const auto root = KestrumModelNode::makeTreeFromObject(display, paths);
        if (root->value() != nullptr)
            _data.write(onOneLine(*root->value()) + '\n');
        else
            show(*root, 0);
        _data.flush();
    }

private:
    void show(const KestrumModelNode& parent, std::size_t depth)
    {
        for (const auto& node : *parent.childNodes()) {
            std::string line(2 * depth, ' ');
            line += onOneLine(node->displayName());
            if (const auto* value = node->value())
                line += value->empty() ? ":" : ": " + onOneLine(*value);
            else if (node->childNodes()->empty())
                line += " (empty)";
            _data.write(line + '\n');
            if (node->childNodes() != nullptr)
                show(*node, depth + 1);
        }
    }

    bool _again = false;
};

/// The log of a long capture does not fit into memory. It waits in an unnamed file until the display, which comes
/// before it, is complete.
class JsonOutput final : public Output {
public:
    JsonOutput(Contents contents, OutputFile& data)
        : _data(data), _log(contents.log ? std::tmpfile() : nullptr, std::fclose)
    {
        if (contents.log && !_log)
            throw OutputFailure(std::system_error(errno, std::generic_category(), "a temporary file").what());
    }

    void logLine(Priority priority, std::string_view line) override
    {
        if (!_log)
            return;
        const auto entry =
            (_lines++ == 0 ? "\n    " : ",\n    ") + text(Json::array({static_cast<int>(priority), line}));
        if (std::fwrite(entry.data(), 1, entry.size(), _log.get()) != entry.size())
            throw OutputFailure(std::system_error(errno, std::generic_category(), "a temporary file").what());
    }
    void snapshot(const SnapshotListing& listing) override { _snapshots.push_back(jsonOf(listing)); }

    void display(const Decoding& decoding) override
    {
        const Tally total = decoding.total();
        Json object{{"technology", decoding.technology().empty() ? Json() : Json(decoding.technology())},
                    {"messages", total.messages},
                    {"dropped", total.dropped()},
                    {"display", jsonOf(decoding.display())}};
        if (!_snapshots.empty())
            object["snapshots"] = _snapshots;
        auto written = text(object, 2);
        if (!_log) {
            _data.write(written + '\n');
            return _data.flush();
        }
        written.resize(written.size() - 2); // the closing brace and its line
        _data.write(written + ",\n  \"log\": [");
        copyLog();
        _data.write(_lines == 0 ? "]\n}\n" : "\n  ]\n}\n");
        _data.flush();
    }

private:
    void copyLog()
    {
        std::rewind(_log.get());
        char piece[1 << 14];
        for (std::size_t got; (got = std::fread(piece, 1, sizeof piece, _log.get())) > 0;)
            _data.write({piece, got});
        std::fseek(_log.get(), 0, SEEK_END);
    }

    OutputFile& _data;
    std::unique_ptr<std::FILE, int (*)(std::FILE*)> _log;
    std::uint64_t _lines = 0;
    Json _snapshots = Json::array();
};

class JsonlOutput final : public RemarkingOutput {
public:
    JsonlOutput(Contents contents, OutputFile& data, OutputFile& remarks)
        : RemarkingOutput(contents, data, remarks), _withNumbers(contents.numbers)
    {}

    void message(const Decoding& decoding, const Decoding::Decoded& decoded) override
    {
        _changed.clear();
        _changes.look(decoding.display());
        if (_changed.empty())
            return;
        _data.write("{\"time\":");
        _data.write(decoded.time ? '"' + isoText(*decoded.time, kFraction) + '"' : "null");
        _data.write(",\"code\":");
        _data.write(decoded.code ? '"' + codeText(*decoded.code) + '"' : "null");
        _data.write(",\"changes\":{");
        _data.write(_changed);
        _data.write("}}\n");
    }

private:
    const bool _withNumbers;
    std::string _changed;
    Changes _changes{[this](std::string_view path, const Value& value) {
        if (!_changed.empty())
            _changed += ',';
        appendJson(_changed, path);
        _changed += ':';
        const auto reading = value.reading();
        const auto number = _withNumbers && reading ? reading->number() : std::nullopt;
        if (number)
            _changed += "{\"text\":";
        if (const auto words = value.text())
            appendJson(_changed, *words);
        else
            _changed += text(jsonOf(value));
        if (number) {
            _changed += ",\"number\":" + numberText(*number) + ",\"unit\":";
            appendJson(_changed, reading->unit());
            _changed += '}';
        }
    }};
};

/// A CSV cell (RFC 4180). A cell with a quote, a comma or a line end is put in quotes, and quotes inside it are
/// doubled. Lines end with CR LF.
std::string cell(std::string_view raw)
{
    if (raw.find_first_of("\",\r\n") == raw.npos)
        return std::string(raw);
    std::string quoted = "\"";
    for (const char each : raw)
        quoted.append(each == '"' ? 2 : 1, each);
    return quoted + '"';
}

/// "-98.25 dBm": a sign, a number, and optionally a blank and a unit.
bool isNumber(std::string_view raw)
{
    const auto isDigit = [](char c) { return c >= '0' && c <= '9'; };
    raw.remove_prefix(raw.starts_with('+') || raw.starts_with('-') ? 1 : 0);
    const auto digits = std::min(raw.find_first_not_of("0123456789."), raw.size());
    if (std::ranges::none_of(raw.substr(0, digits), isDigit) || std::ranges::count(raw.substr(0, digits), '.') > 1)
        return false;
    const auto unit = raw.substr(digits);
    return unit.empty() || (unit.front() == ' ' && std::ranges::all_of(unit, [](char c) {
                                return (c >= 'a' && c <= 'z') || (c >= 'A' && c <= 'Z') || c == '%' || c == '/' ||
                                       c == ' ';
                            }));
}

/// An apostrophe makes a spreadsheet treat a formula as text.
std::string guarded(std::string text)
{
    const bool isFormula =
        !text.empty() && std::string_view("=+-@\t\r").find(text.front()) != std::string_view::npos && !isNumber(text);
    return isFormula ? "'" + text : text;
}

class CsvOutput final : public RemarkingOutput {
public:
    CsvOutput(Contents contents, OutputFile& data, OutputFile& remarks) : RemarkingOutput(contents, data, remarks)
    {
        _data.write("time,code,path,value,number,unit\r\n");
    }

    void message(const Decoding& decoding, const Decoding::Decoded& decoded) override
    {
        _decoded = &decoded;
        _begin.clear();
        _changes.look(decoding.display());
    }

private:
    const std::string& begin()
    {
        if (_begin.empty()) {
            _begin = _decoded->time ? isoText(*_decoded->time, kFraction) : std::string();
            _begin += ',';
            if (_decoded->code)
                _begin += codeText(*_decoded->code);
            _begin += ',';
        }
        return _begin;
    }

    const Decoding::Decoded* _decoded = nullptr;
    std::string _begin; ///< the first cells of the message's rows; empty until the first row
    Changes _changes{[this](std::string_view path, const Value& value) {
        _data.write(begin());
        _data.write(cell(path));
        _data.write(",");
        _data.write(cell(guarded(plainText(value))));
        const auto reading = value.reading();
        const auto number = reading ? reading->number() : std::nullopt;
        _data.write("," + (number ? numberText(*number) : "") + ',');
        _data.write(number ? cell(reading->unit()) : "");
        _data.write("\r\n");
    }};
};

} // namespace

std::unique_ptr<Output> Output::make(OutputFormat format, Contents contents, OutputFile& data, OutputFile& remarks)
{
    switch (format) {
    case OutputFormat::Json:
        return std::make_unique<JsonOutput>(contents, data);
    case OutputFormat::Jsonl:
        return std::make_unique<JsonlOutput>(contents, data, remarks);
    case OutputFormat::Csv:
        return std::make_unique<CsvOutput>(contents, data, remarks);
    case OutputFormat::Tree:
        break;
    }
    return std::make_unique<TreeOutput>(contents, data, remarks);
}

} // namespace kestrum::tools
