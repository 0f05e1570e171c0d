#include "scenarios/Drive.h"
#include "harness/Places.h"

#include "core/KestrumModelNode.h"

namespace kestrum::bench {
namespace {

const Date kStart{std::chrono::sys_days(std::chrono::year{2026} / 11 / 16)};

} // namespace

Drive::Drive(const Scenario& scenario)
    : _source(scenario.make(ScenarioSetting{.seed = 1, .start = kStart, .lists = _lists})),
      _technology(scenario.technology)
{}

std::optional<Source::Message> Drive::next()
{
    auto message = _source->next();
    return _source->technology() == _technology ? std::move(message) : std::nullopt;
}

std::vector<Source::Message> driven(const Scenario& scenario, std::chrono::minutes time)
{
    Drive drive(scenario);
    std::vector<Source::Message> messages;
    for (auto message = drive.next(); message && message->at < time; message = drive.next())
        messages.push_back(std::move(*message));
    return messages;
}

Decoding::Decoding(std::string_view technology)
{
    for (const char* name : {"ZPH_GSM", "C2KTemplate", "LTE", "UTRAN"})
        _surroundings.bundle.paths.push_back(inCheckout("resources/").append(name).append(".plist"));
    _generator = LogGenerator::generatorFromTechnology(Value(technology), _surroundings.roles);
}

void Decoding::refresh()
{
    PathDictionary paths;
    benchmark::DoNotOptimize(KestrumModelNode::makeTreeFromObject(_generator->generateLogUsingState(state), paths));
}

} // namespace kestrum::bench
