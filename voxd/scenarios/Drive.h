#pragma once

#include "voxd/scenarios/Modem.h"
#include "voxd/scenarios/Scenario.h"
#include "voxd/scenarios/World.h"

#include <deque>
#include <initializer_list>
#include <memory>
#include <vector>

namespace kestrum {

/// The source of a live scenario: a car drives through the world, and the source gives its modem's log. Several
/// modems alternate in legs of half a minute.
class Drive final : public ScenarioSource {
public:
    using MakeModem = std::unique_ptr<Modem> (*)(const World& world, Random random);

    Drive(const ScenarioSetting& setting, std::initializer_list<MakeModem> modems);

    std::optional<Message> next() override;
    std::string_view technology() const override { return modem().technology(); }
    std::vector<ScenarioCell> servingCells() const override { return modem().servingCells(); }

private:
    Modem& modem() const { return *_modems[_leg % _modems.size()]; }
    void tick();

    Date _start;
    Random _random;
    World _world;
    ModemLog _log;
    std::vector<std::unique_ptr<Modem>> _modems;
    std::size_t _leg = 0;
    unsigned _ticks = 0;
    std::deque<Message> _ready; // the messages of the last tick
};

} // namespace kestrum
