#include "tools/Output.h"

#include "core/KestrumModelNode.h"
#include "support/Base64.h"
#include "support/CsvCells.h"
#include "support/Format.h"
#include "tools/Changes.h"
#include "tools/Harmless.h"
#include "tools/ServingCell.h"
#include "tools/TemporaryFile.h"

#include <nlohmann/json.hpp>

#include <algorithm>
#include <charconv>
#include <chrono>
#include <cmath>
#include <functional>
#include <map>
#include <optional>
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
    if (!Changes::isPlain(raw)) {
        to += text(Json(raw));
        return;
    }
    to += '"';
    to += raw;
    to += '"';
}

/// Up to here a short number is not written with an exponent.
constexpr double kMostShort = 1e5;

/// Appends the shortest decimal text that reads back as the number.
void appendNumber(std::string& to, double number)
{
    char digits[32];
    char* end = digits;
    const auto hundredths = std::abs(number) < kMostShort ? static_cast<int>(std::lround(std::abs(number) * 100)) : -1;
    if (static_cast<double>(hundredths) / 100 == std::abs(number)) {
        if (std::signbit(number))
            *end++ = '-';
        end = std::to_chars(end, std::end(digits), hundredths / 100).ptr;
        if (const auto fraction = hundredths % 100; fraction != 0) {
            *end++ = '.';
            *end++ = static_cast<char>('0' + fraction / 10);
            if (fraction % 10 != 0)
                *end++ = static_cast<char>('0' + fraction % 10);
        }
    } else {
        end = std::to_chars(digits, std::end(digits), number).ptr;
    }
    to.append(digits, end);
}

/// The text of a time stamp. Most messages come in the second of the one before them.
class StampText {
public:
    void append(std::string& to, Date stamp)
    {
        const auto second = std::chrono::floor<std::chrono::seconds>(stamp);
        if (_text.empty() || second != _second) {
            _second = second;
            _text = isoText(second, kFraction);
        }
        auto fraction = (stamp - second).count();
        for (auto at = _text.size() - 2; _text[at] != '.'; --at, fraction /= 10)
            _text[at] = static_cast<char>('0' + fraction % 10);
        to += _text;
    }
    void appendJson(std::string& to, std::optional<Date> stamp)
    {
        if (!stamp) {
            to += "null";
            return;
        }
        to += '"';
        append(to, *stamp);
        to += '"';
    }

private:
    Date _second{};
    std::string _text;
};

std::string jsonText(const Value& value)
{
    return text(jsonOf(value));
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
    JsonOutput(Contents contents, OutputFile& data) : _data(data)
    {
        if (contents.log)
            _log.emplace();
    }

    void logLine(Priority priority, std::string_view line) override
    {
        if (!_log)
            return;
        _log->append((_lines++ == 0 ? "\n    " : ",\n    ") + text(Json::array({static_cast<int>(priority), line})));
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
        _log->read([this](std::string_view piece) { _data.write(piece); });
        _data.write(_lines == 0 ? "]\n}\n" : "\n  ]\n}\n");
        _data.flush();
    }

private:
    OutputFile& _data;
    std::optional<TemporaryFile> _log;
    std::uint64_t _lines = 0;
    Json _snapshots = Json::array();
};

/// A number and a unit, for a value that measures something.
struct Measure {
    double number;
    std::string_view unit;
};

std::optional<Measure> measureIn(const Value& value)
{
    const auto* reading = value.borrowedReading();
    const auto number = reading != nullptr ? reading->number() : std::nullopt;
    return number ? std::optional(Measure{*number, reading->unit()}) : std::nullopt;
}

/// Writes the changes of each message that changed the display.
class ChangesOutput : public RemarkingOutput {
public:
    using RemarkingOutput::RemarkingOutput;

    void message(const Decoding& decoding, const Decoding::Decoded& decoded) final
    {
        _decoded = &decoded;
        _technology = decoding.technology();
        _isChanged = false;
        if (decoded.code)
            _changes.look(decoding.display(), *decoded.code,
                          [&decoding](LogCode code) { return decoding.nodesOf(code); });
        else
            _changes.look(decoding.display());
        if (!_isChanged)
            return;
        end(_text);
        write();
    }

    void resume(const Decoding& decoding) final
    {
        _isResuming = true;
        _changes.look(decoding.display());
        _isResuming = false;
    }

protected:
    /// What is written before the first change of a message, for each change, and behind the last one.
    virtual void begin(std::string& text, const Decoding::Decoded& decoded) = 0;
    virtual void append(std::string& text, const Changes::Change& change, bool isFirst) = 0;
    virtual void end(std::string&) {}

    std::string_view technology() const { return _technology; }

private:
    void changed(const Changes::Change& change)
    {
        if (_isResuming)
            return;
        const bool isFirst = !std::exchange(_isChanged, true);
        if (isFirst)
            begin(_text, *_decoded);
        append(_text, change, isFirst);
        if (_text.size() >= kPiece)
            write();
    }
    void write()
    {
        _data.write(_text);
        _text.clear();
    }

    static constexpr std::size_t kPiece = 64 << 10; ///< bytes; a message may change any number of values

    const Decoding::Decoded* _decoded = nullptr; ///< the message that is looked at
    std::string_view _technology;                ///< of that message
    bool _isChanged = false, _isResuming = false;
    std::string _text;
    Changes _changes{[this](const Changes::Change& change) { changed(change); }};
};

class JsonlOutput final : public ChangesOutput {
public:
    JsonlOutput(Contents contents, OutputFile& data, OutputFile& remarks)
        : ChangesOutput(contents, data, remarks), _withNumbers(contents.numbers)
    {}

private:
    void append(std::string& text, const Changes::Change& change, bool isFirst) override
    {
        if (change.isPathPlain) {
            text += isFirst ? "\"" : ",\"";
            text += change.path;
            text += "\":";
        } else {
            text += isFirst ? "" : ",";
            appendJson(text, change.path);
            text += ':';
        }
        const auto measure = _withNumbers ? measureIn(change.value) : std::nullopt;
        if (measure)
            text += "{\"text\":";
        if (change.value.isText())
            appendJson(text, change.text);
        else
            text += jsonText(change.value);
        if (measure) {
            text += ",\"number\":";
            appendNumber(text, measure->number);
            text += ",\"unit\":";
            appendJson(text, measure->unit);
            text += '}';
        }
    }
    void begin(std::string& text, const Decoding::Decoded& decoded) override
    {
        text += "{\"time\":";
        _stamp.appendJson(text, decoded.time);
        text += ",\"code\":";
        text += decoded.code ? '"' + codeText(*decoded.code) + '"' : "null";
        text += ",\"changes\":{";
    }
    void end(std::string& text) override { text += "}}\n"; }

    const bool _withNumbers;
    StampText _stamp;
};

class CsvOutput final : public ChangesOutput {
public:
    CsvOutput(Contents contents, OutputFile& data, OutputFile& remarks) : ChangesOutput(contents, data, remarks)
    {
        _data.write("time,code,path,value,number,unit\r\n");
    }

private:
    void append(std::string& text, const Changes::Change& change, bool) override
    {
        text += _begin;
        if (change.isPathPlain)
            text += change.path;
        else
            appendCell(text, change.path);
        text += ',';
        if (change.value.isText())
            appendGuardedCell(text, change.text);
        else if (!change.value.isNull())
            appendGuardedCell(text, jsonText(change.value));
        if (const auto measure = measureIn(change.value)) {
            text += ',';
            appendNumber(text, measure->number);
            text += ',';
            appendCell(text, measure->unit);
            text += "\r\n";
        } else {
            text += ",,\r\n";
        }
    }
    void begin(std::string&, const Decoding::Decoded& decoded) override
    {
        _begin.clear();
        if (decoded.time)
            _stamp.append(_begin, *decoded.time);
        _begin += ',';
        if (decoded.code)
            _begin += codeText(*decoded.code);
        _begin += ',';
    }

    StampText _stamp;
    std::string _begin; ///< the first cells of the message's rows
};

/// The number and the unit at the begin of a text: "-98.00 dBm". Trees of modems have their levels so.
std::optional<Measure> measureIn(std::string_view text)
{
    double number = 0;
    const auto [end, error] = std::from_chars(text.data(), text.data() + text.size(), number, std::chars_format::fixed);
    if (error != std::errc{} || !std::isfinite(number))
        return std::nullopt;
    const auto rest = text.substr(static_cast<std::size_t>(end - text.data()));
    for (const std::string_view unit : {"dBm", "dB", "%"})
        if (rest.starts_with(' ') && rest.substr(1) == unit)
            return Measure{number, unit};
    return std::nullopt;
}

/// A map (RFC 7946): a point for each change of the serving cell or of its levels at a known position, with all of its
/// values. A level is a number, and its name ends in the unit, so that a map can be coloured by it.
class GeojsonOutput final : public ChangesOutput {
public:
    GeojsonOutput(Contents contents, OutputFile& data, OutputFile& remarks) : ChangesOutput(contents, data, remarks)
    {
        _data.write("{\"type\":\"FeatureCollection\",\"features\":[");
    }

    void finish() override { _data.write("\n]}\n"); }

private:
    void begin(std::string&, const Decoding::Decoded& decoded) override
    {
        _time = decoded.time;
        _position = decoded.position;
        _isCellChanged = false;
    }
    void append(std::string&, const Changes::Change& change, bool) override
    {
        auto property = propertyOf(change);
        if (property) {
            _properties.insert_or_assign(std::string(change.path), std::move(*property));
            _isCellChanged = true;
        } else if (const auto known = _properties.find(change.path); known != _properties.end()) {
            _properties.erase(known);
            _isCellChanged = true;
        }
    }
    void end(std::string& text) override
    {
        if (!_isCellChanged || !_position)
            return;
        text += std::exchange(_isFirst, false) ? "\n" : ",\n";
        text += R"({"type":"Feature","geometry":{"type":"Point","coordinates":[)";
        appendNumber(text, _position->longitude);
        text += ',';
        appendNumber(text, _position->latitude);
        text += R"(]},"properties":{"time":)";
        _stamp.appendJson(text, _time);
        text += R"(,"technology":)";
        appendJson(text, technology());
        if (_position->speed) {
            text.append(",\"").append(kSpeed).append("\":");
            appendNumber(text, *_position->speed);
        }
        // Trees from outside may have any names, and an object has a name once.
        std::map<std::string_view, std::string_view> values;
        for (const auto& [path, property] : _properties)
            values.try_emplace(property.name, property.value);
        for (const std::string_view own : {std::string_view("time"), std::string_view("technology"), kSpeed})
            values.erase(own);
        for (const auto& [name, value] : values) {
            text += ',';
            appendJson(text, name);
            text.append(":").append(value);
        }
        text += "}}";
    }

    struct Property {
        std::string name;  ///< "Measured RSRP (dBm)"
        std::string value; ///< as JSON: -98.25
    };
    /// Nothing for a value that does not describe the serving cell, and for one that is not known.
    std::optional<Property> propertyOf(const Changes::Change& change) const
    {
        const bool isKnown = !change.text.empty() && change.text != "N/A";
        auto name = isKnown ? servingCellName(technology(), change.path) : std::nullopt;
        if (!name)
            return std::nullopt;
        std::string value;
        const auto* reading = change.value.borrowedReading();
        const auto measure = reading != nullptr ? measureIn(change.value) : measureIn(change.text);
        if (measure && !measure->unit.empty()) {
            appendNumber(value, measure->number);
            name->append(" (").append(measure->unit).append(")");
        } else if (reading == nullptr || reading->unit().empty()) {
            appendJson(value, change.text);
        } else {
            return std::nullopt; // "Not Present" is no level
        }
        return Property{std::move(*name), std::move(value)};
    }

    static constexpr std::string_view kSpeed = "speed (m/s)";

    std::optional<Date> _time; ///< of the message that is looked at
    std::optional<Position> _position;
    bool _isCellChanged = false, _isFirst = true;
    std::map<std::string, Property, std::less<>> _properties; ///< by path, of the values that the display has
    StampText _stamp;
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
    case OutputFormat::Geojson:
        return std::make_unique<GeojsonOutput>(contents, data, remarks);
    case OutputFormat::Tree:
        break;
    }
    return std::make_unique<TreeOutput>(contents, data, remarks);
}

} // namespace kestrum::tools
