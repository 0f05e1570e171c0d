#include "scenarios/Drive.h"
#include "harness/Places.h"

#include "LogGenerator/Quantities.h"

#include <algorithm>
#include <string>

namespace kestrum::bench {
namespace {

const Date kStart{std::chrono::sys_days(std::chrono::year{2026} / 11 / 16)};

constexpr double quarters(std::uint32_t raw)
{
    return -0.25 * raw;
}

void fillNode(const Value& node, unsigned round)
{
    constexpr unsigned kRows = 32, kCells = 12;
    // A row has both whole numbers and levels with two digits after the point.
    const auto reading = [round](unsigned index) {
        const std::uint32_t raw = 280 + (7 * index + round) % 200;
        return Value(index % 2 == 0 ? Reading(inDbm<quarters>, raw) : Reading(decimalSigned32, raw));
    };
    if (const auto dictionary = node.dictionary()) {
        unsigned index = 0;
        for (auto& entry : *dictionary)
            if (entry.value.isText() && entry.key != kSortedKey)
                entry.value = reading(index++);
            else
                fillNode(entry.value, round);
    } else if (const auto array = node.array()) {
        array->clear();
        for (unsigned i = 0; i < kRows; ++i) {
            auto row = makeDictionary();
            for (unsigned k = 0; k < kCells; ++k)
                row->set("Quantity " + std::to_string(k), reading(i + k));
            array->append(row);
        }
    }
}

} // namespace

std::unique_ptr<Source> begin(const Scenario& scenario, PropertyLists& lists)
{
    return scenario.make({.seed = 1, .start = kStart, .lists = lists});
}

std::vector<Source::Message> driven(const Scenario& scenario, std::chrono::minutes time)
{
    PropertyListCodec lists;
    const auto source = begin(scenario, lists);
    std::vector<Source::Message> messages;
    for (auto message = source->next(); message && message->at < time; message = source->next()) {
        if (source->technology() != scenario.technology)
            break;
        messages.push_back(std::move(*message));
    }
    return messages;
}

std::vector<std::span<const Source::Message>> betweenRefreshes(const std::vector<Source::Message>& messages)
{
    std::vector<std::span<const Source::Message>> parts;
    for (auto from = messages.begin(); from != messages.end();) {
        const auto to = std::ranges::find_if(
            from, messages.end(), [until = from->at + kRefresh](const auto& message) { return message.at >= until; });
        parts.emplace_back(from, to);
        from = to;
    }
    return parts;
}

Decoding::Decoding(std::string_view technology)
{
    for (const char* name : {"ZPH_GSM", "C2KTemplate", "LTE", "UTRAN"})
        _surroundings.bundle.paths.push_back(inCheckout("resources/").append(name).append(".plist"));
    changeTo(technology);
}

void Decoding::changeTo(std::string_view technology)
{
    _generator = LogGenerator::generatorFromTechnology(Value(technology), _surroundings.roles);
}

KestrumModelNodeRef Decoding::refresh(PathDictionary& paths)
{
    return KestrumModelNode::makeTreeFromObject(_generator->generateLogUsingState(_state), paths);
}

void Decoding::refresh()
{
    PathDictionary paths;
    benchmark::DoNotOptimize(refresh(paths));
}

void Decoding::fill(unsigned round)
{
    fillNode(_state.at("Display"), round);
}

} // namespace kestrum::bench
