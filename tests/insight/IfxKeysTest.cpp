#include "LogGenerator/GSM/GSMLogGenerator.h"
#include "capture/PositionRecord.h"
#include "insight/keys/KeyEntry.h"
#include "platform/TelephonyService.h"
#include "sections/Measured.h"
#include "voxd/modem/ModemTree.h"
#include "voxd/scenarios/Scenario.h"

#include <gtest/gtest.h>

namespace kestrum {
namespace {

/// Ten minutes of the scenario: calls with all their values are among them.
void driveThrough(TechnologyRun<GSMLogGenerator>& run, Measured& measured)
{
    const auto source = makeScenario("ifx", {1, {}, run.codec});
    for (int messages = 0; messages < 1200; ++messages) {
        run.receive(source->next()->bytes);
        measured.look(run.display());
    }
}

/// A cell of which everything is known, whatever its technology has of it.
ModemCell wholeCell(CellType type, std::uint32_t channel)
{
    ModemCell cell;
    cell.type = type;
    cell.operatorCode = type == CellType::Cdma ? "1" : "00101";
    cell.lac = cell.tac = 7;
    cell.ci = 0x1234567;
    cell.channel = channel;
    for (auto* number : {&cell.physicalCell, &cell.scramblingCode, &cell.baseStation, &cell.cellParameter,
                         &cell.timingAdvance, &cell.rxLevel, &cell.pathLoss, &cell.systemId, &cell.networkId,
                         &cell.cdmaBaseStationId, &cell.referencePn, &cell.pilotStrength})
        *number = 5;
    for (auto* number : {&cell.rscp, &cell.ecio, &cell.rsrp, &cell.rsrq, &cell.sinr})
        *number = -10;
    return cell;
}

ModemState wholeModem()
{
    ModemState modem;
    modem.manufacturer = modem.model = modem.revision = modem.identifier = modem.equipmentIdentifier = "1234567890";
    modem.phase = ModemPhase::Connected;
    modem.lock = ModemLock::None;
    modem.accessTechnologies = static_cast<std::uint32_t>(AccessTechnology::Lte);
    modem.signalQuality = 60;
    modem.registration = ModemRegistration::Home;
    modem.operatorCode = "00101";
    modem.operatorName = "Example";
    modem.packetService = PacketService::Attached;
    modem.sim = ModemSim{"8900101000000012345", "001010123456789", "00101", "Example"};
    modem.bearers = {{true, false, "wwan0", "internet.example", "192.0.2.17", "2001:db8::1", 60, 1000, 100}};
    SignalLevels levels;
    for (auto* level : {&levels.rssi, &levels.rscp, &levels.ecio, &levels.rsrp, &levels.rsrq, &levels.snr})
        *level = -10;
    levels.errorRate = 1;
    modem.signal = {levels, levels, levels, levels};
    std::uint32_t channel = 100;
    for (const auto type : {CellType::Lte, CellType::Nr, CellType::Cdma, CellType::Gsm, CellType::Umts,
                            CellType::TdScdma, CellType::Unknown})
        for (const bool serving : {true, false}) {
            modem.cells.push_back(wholeCell(type, ++channel));
            modem.cells.back().serving = serving;
            *modem.cells.back().ci += channel;
        }
    return modem;
}

/// The trees of modems of which everything is known, and of one of which the service may tell little.
void askModems(TechnologyRun<GSMLogGenerator>& run, Measured& measured)
{
    ModemStates whole{.daemon = ModemDaemon::Present, .daemonVersion = "1.20.4", .modems = {wholeModem()}};
    whole.modems[0].operatorCode = "1";
    whole.modems[0].sim->operatorCode = "1";
    ModemStates refused = whole;
    refused.modems[0] = {};
    for (const auto service : {ModemService::Signal, ModemService::Location, ModemService::CellInformation,
                               ModemService::Sim, ModemService::Data})
        refused.modems[0].refusals.push_back({service, RefusalReason::NotPermitted, ""});
    ModemStates known = whole;
    known.modems[0] = wholeModem();
    ModemStates many = known;
    many.modems.resize(20, many.modems[0]);
    for (const auto* states : {&whole, &refused, &known, &many}) {
        const auto tree = makeModemTree(*states, {}, {.everyModem = states == &many});
        tree->set(kPositionNode, positionNode(std::nullopt));
        run.receive(run.codec.toXml(tree)->bytes());
        measured.look(run.display());
    }
}

TEST(Keys, OfIfxAreComplete)
{
    TechnologyRun<GSMLogGenerator> run("LTE"); // IFX has no template
    Measured measured;
    driveThrough(run, measured);
    askModems(run, measured);
    std::set<const KeyEntry*> used;
    for (const auto& [path, units] : measured.byPath()) {
        const KeyEntry* entry = keyEntryAt(kVoxLogChannelTechnology_IFX, path);
        EXPECT_NE(entry, nullptr) << path << " has no entry";
        used.insert(entry);
    }
    for (const auto& section : sectionEntries(kVoxLogChannelTechnology_IFX))
        for (const auto& entry : section.keys)
            EXPECT_TRUE(used.contains(&entry)) << section.name << '/' << entry.key << ": no such key";
}

} // namespace
} // namespace kestrum
