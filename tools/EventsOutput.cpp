#include "tools/EventsOutput.h"

#include "insight/EventsCsv.h"
#include "support/CsvCells.h"
#include "support/Format.h"
#include "tools/Harmless.h"

#include <nlohmann/json.hpp>

#include <algorithm>
#include <utility>

namespace kestrum::tools {
namespace {

using Json = nlohmann::ordered_json;

constexpr int kEventFraction = 6, kShortFraction = 3; ///< digits of a second

std::string timeText(std::optional<Date> time, int digits)
{
    return time ? isoText(*time, digits) : std::string();
}

Json orNull(std::string text)
{
    return text.empty() ? Json() : Json(std::move(text));
}

double seconds(std::chrono::microseconds time)
{
    return std::chrono::duration<double>(time).count();
}

std::string written(const Json& json)
{
    return json.dump(2, ' ', false, Json::error_handler_t::replace) + '\n';
}

/// Follows the messages; what is found is written at the end, or when a followed file pauses.
class FoundOutput : public Output {
public:
    FoundOutput(OutputFormat format, OutputFile& data, OutputFile& remarks)
        : _format(format), _data(data), _remarks(remarks)
    {}

    void message(const Decoding& decoding, const Decoding::Decoded& decoded) final
    {
        _finder.look(decoding.generator(), decoding.state(), decoded.code, decoded.time);
    }
    void logLine(Priority, std::string_view) final {}
    void snapshot(const SnapshotListing&) final {}

    void display(const Decoding&) final
    {
        std::string text;
        if (_format == OutputFormat::Json)
            text = written(json());
        else if (_format == OutputFormat::Csv)
            appendCsv(text);
        else
            appendTree(text);
        _data.write(text);
        _data.flush();
    }

protected:
    virtual Json json() = 0;
    virtual void appendCsv(std::string& to) = 0;
    virtual void appendTree(std::string& to) = 0;

    /// Says once how many are no longer listed.
    void tellDropped(std::uint64_t dropped, const char* what)
    {
        if (dropped != std::exchange(_dropped, dropped))
            _remarks.write(formatted("kestrum-decode: %lu older %s are left out\n", dropped, what));
    }

    EventFinder _finder;

private:
    const OutputFormat _format;
    OutputFile& _data;
    OutputFile& _remarks;
    std::uint64_t _dropped = 0;
};

class EventsOutput final : public FoundOutput {
public:
    using FoundOutput::FoundOutput;

private:
    Json json() override
    {
        Json list = Json::array();
        for (const auto& each : _finder.events())
            list.push_back({{"time", orNull(timeText(each.time, kEventFraction))},
                            {"event", word(each.kind)},
                            {"name", each.name},
                            {"was", orNull(each.was)},
                            {"is", orNull(each.is)},
                            {"levels", orNull(each.levels)}});
        return {{"events", std::move(list)}, {"dropped", _finder.events().dropped()}};
    }

    void appendCsv(std::string& to) override
    {
        if (_written == 0)
            to += kEventsCsvHead;
        forEachNew([&](const Event& each) { kestrum::appendCsv(to, each); });
    }

    void appendTree(std::string& to) override
    {
        forEachNew([&](const Event& each) {
            std::string line = each.time ? timeText(each.time, kShortFraction) + "  " : std::string();
            line += titleOf(each) + ": ";
            line += each.was.empty() ? each.is : formatted("%@ -> %@", each.was, each.is.empty() ? "?" : each.is);
            if (!each.levels.empty())
                line += formatted("; %@", each.levels);
            to += onOneLine(line) + '\n';
        });
    }

    template <typename Use>
    void forEachNew(Use use)
    {
        const auto& events = _finder.events();
        tellDropped(events.dropped(), "events");
        const auto known = std::max(_written, events.dropped()) - events.dropped();
        std::for_each(events.begin() + static_cast<std::ptrdiff_t>(known), events.end(), use);
        _written = events.dropped() + events.size();
    }

    std::uint64_t _written = 0; ///< events so far
};

class CellsOutput final : public FoundOutput {
public:
    using FoundOutput::FoundOutput;

private:
    Json json() override
    {
        Json list = Json::array();
        for (const auto& each : _finder.cells()) {
            Json level;
            if (each.level.count() != 0)
                level = {{"least", each.level.least()},
                         {"mean", each.level.mean()},
                         {"greatest", each.level.greatest()},
                         {"unit", each.unit}};
            list.push_back({{"radio", each.radio},
                            {"cell", each.identity},
                            {"visits", each.visits},
                            {"seconds", seconds(each.time)},
                            {"last seen", orNull(timeText(each.lastSeen, kEventFraction))},
                            {"level", std::move(level)}});
        }
        return {{"cells", std::move(list)}, {"dropped", _finder.cells().dropped()}};
    }

    void appendCsv(std::string& to) override
    {
        to += "radio,cell,visits,seconds,last seen,least,mean,greatest,unit\r\n";
        for (const auto& each : _finder.cells()) {
            const bool isMeasured = each.level.count() != 0;
            const auto number = [&](double value) { return isMeasured ? formatted("%.2f", value) : std::string(); };
            appendGuardedRow(to, {each.radio, each.identity, std::to_string(each.visits),
                                  formatted("%.3f", seconds(each.time)), timeText(each.lastSeen, kEventFraction),
                                  number(each.level.least()), number(each.level.mean()), number(each.level.greatest()),
                                  each.unit});
        }
        tellDropped(_finder.cells().dropped(), "cells");
    }

    void appendTree(std::string& to) override
    {
        for (const auto& each : _finder.cells()) {
            to += onOneLine(formatted("%@ %@", each.radio, each.identity)) + '\n';
            to += formatted("  Visits: %lu\n  Time: %.1f s\n", each.visits, seconds(each.time));
            if (each.level.count() != 0)
                to += onOneLine(formatted("  Level: %.2f to %.2f, mean %.2f %@", each.level.least(),
                                          each.level.greatest(), each.level.mean(), each.unit)) +
                      '\n';
            if (each.lastSeen)
                to += "  Last seen: " + timeText(each.lastSeen, kShortFraction) + '\n';
        }
        tellDropped(_finder.cells().dropped(), "cells");
    }
};

} // namespace

std::unique_ptr<Output> makeEventsOutput(OutputFormat format, OutputFile& data, OutputFile& remarks)
{
    return std::make_unique<EventsOutput>(format, data, remarks);
}

std::unique_ptr<Output> makeCellsOutput(OutputFormat format, OutputFile& data, OutputFile& remarks)
{
    return std::make_unique<CellsOutput>(format, data, remarks);
}

} // namespace kestrum::tools
