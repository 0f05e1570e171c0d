#include "voxd/modem/ModemTree.h"

#include "LogGenerator/GSM/GSMLogGenerator.h"
#include "capture/PositionRecord.h"
#include "core/KestrumModelNode.h"
#include "doubles/DecodingDoubles.h"
#include "platform/propertylist/PropertyListCodec.h"

#include <gmock/gmock.h>
#include <rapidcheck.h>
#include <rapidcheck/gtest.h>

#include <limits>
#include <random>

namespace kestrum {
namespace {

using testing::HasSubstr;
using testing::Not;

/// One line for each row that the panes show, the rows below a row indented.
void print(const KestrumModelNode& node, int depth, std::string& text)
{
    for (const auto& child : *node.childNodes()) {
        text.append(static_cast<std::size_t>(2 * depth), ' ').append(child->displayName());
        if (child->value() != nullptr)
            text.append(": ").append(*child->value());
        text += '\n';
        if (child->childNodes() != nullptr)
            print(*child, depth + 1, text);
    }
}

/// The rows of the panes after the tree has travelled as a property list and through the IFX generator.
std::string rowsOf(const DictionaryRef& tree)
{
    PropertyListCodec codec;
    DecodingDoubles doubles;
    DecodingRoles roles{doubles.log, doubles.console, doubles.clock, doubles.bundle, codec};
    State state;
    const auto generator = GSMLogGenerator::generator(roles);
    generator->updateState(state, codec.toXml(tree)->bytes());
    PathDictionary paths;
    std::string text;
    print(*KestrumModelNode::makeTreeFromObject(generator->generateLogUsingState(state), paths), 0, text);
    return text;
}

const Date kTime = *dateFromIso("2026-11-16T06:05:42Z") + std::chrono::milliseconds(250);

std::string rowsOf(const ModemStates& states, const ModemTreeSetting& setting = {})
{
    return rowsOf(makeModemTree(states, kTime, setting));
}

ModemStates statesOf(ModemState modem)
{
    ModemStates states;
    states.daemon = ModemDaemon::Present;
    states.modems.push_back(std::move(modem));
    return states;
}

std::string rowsOf(const ModemState& modem, const ModemTreeSetting& setting = {})
{
    return rowsOf(statesOf(modem), setting);
}

constexpr std::uint32_t bit(AccessTechnology technology)
{
    return static_cast<std::uint32_t>(technology);
}

ModemState lteModem()
{
    ModemState modem;
    modem.number = 1;
    modem.identifier = "5f1ac09d3c8be2d2b4a1a5a0f2f7d5b1c0a86e43";
    modem.manufacturer = "Example Radio";
    modem.model = "LM-940";
    modem.revision = "41.00.002";
    modem.equipmentIdentifier = "001012345678905";
    modem.phase = ModemPhase::Connected;
    modem.lock = ModemLock::None;
    modem.accessTechnologies = bit(AccessTechnology::Lte);
    modem.signalQuality = 71;
    modem.signalQualityRecent = true;
    modem.registration = ModemRegistration::Home;
    modem.operatorCode = "00101";
    modem.operatorName = "Test Net";
    modem.packetService = PacketService::Attached;
    modem.sim = ModemSim{"8988211000000123456", "001010123456789", "00101", "Test Net"};
    auto& bearer = modem.bearers.emplace_back();
    bearer.connected = true;
    bearer.interface = "wwan0";
    bearer.apn = "internet.example";
    bearer.address4 = "192.0.2.17";
    bearer.duration = 3723;
    bearer.receivedBytes = 48211007;
    bearer.sentBytes = 1048577;
    modem.signal.lte = SignalLevels{-67, {}, {}, -98, -11.5, 7.25, {}};
    modem.location = ModemLocation{"001", "01", 0, 0x1A2301, 0x1502};
    auto& serving = modem.cells.emplace_back();
    serving.type = CellType::Lte;
    serving.serving = true;
    serving.operatorCode = "00101";
    serving.tac = 0x1502;
    serving.ci = 0x1A2301;
    serving.physicalCell = 76;
    serving.channel = 1300;
    serving.rsrp = -99;
    serving.rsrq = -12;
    serving.timingAdvance = 4;
    for (const int level : {-112, -104}) {
        auto& neighbor = modem.cells.emplace_back();
        neighbor.type = CellType::Lte;
        neighbor.physicalCell = static_cast<std::uint32_t>(100 - level);
        neighbor.channel = 1300;
        neighbor.rsrp = level;
        neighbor.rsrq = -16;
    }
    return modem;
}

// Whole trees.

TEST(ModemTree, OfAnLteModem)
{
    EXPECT_EQ(rowsOf(lteModem()), R"(Status: Connected, LTE
Signal Quality: 71 %
Serving Cell
  Technology: LTE
  Measured RSRP: -98.00 dBm
  Measured RSRQ: -11.50 dB
  Measured RSSI: -67.00 dBm
  SNR: 7.25 dB
  Physical Cell ID: 76
  E-ARFCN: 1300
  Timing Advance: 4
  Cell Identity: 1712897
  eNodeB (derived): 6691
  Cell of eNodeB (derived): 1
  Tracking Area Code: 5378
  Mobile Country Code: 001
  Mobile Network Code: 01
Neighbor Cells
  0
    Technology: LTE
    Measured RSRP: -104.00 dBm
    Measured RSRQ: -16.00 dB
    Physical Cell ID: 204
    E-ARFCN: 1300
  1
    Technology: LTE
    Measured RSRP: -112.00 dBm
    Measured RSRQ: -16.00 dB
    Physical Cell ID: 212
    E-ARFCN: 1300
Registration
  Registration State: Registered, home
  Operator: Test Net
  Mobile Country Code: 001
  Mobile Network Code: 01
  Access Technology: LTE
  Packet Service: Attached
Signal
  LTE
    Measured RSRP: -98.00 dBm
    Measured RSRQ: -11.50 dB
    Measured RSSI: -67.00 dBm
    SNR: 7.25 dB
Data
  0
    Status: Connected
    APN: internet.example
    Interface: wwan0
    Address: 192.0.2.17
    Duration: 1:02:03
    Bytes Received: 48211007
    Bytes Sent: 1048577
SIM
  Operator: Test Net
  Mobile Country Code: 001
  Mobile Network Code: 01
  IMSI: 00101********
  ICCID: 8988********
Modem
  Manufacturer: Example Radio
  Model: LM-940
  Revision: 41.00.002
  Equipment Identifier: 00101234********
  Device Identifier: ********
  State: Connected
  Lock: None
Time: 2026-11-16T06:05:42.250Z
)");
}

// LTE and NR together: the modem is registered on the LTE cell, and the NR cell carries data.
TEST(ModemTree, OfANonStandalone5GModem)
{
    ModemState modem;
    modem.model = "NX-55";
    modem.phase = ModemPhase::Registered;
    modem.accessTechnologies = bit(AccessTechnology::Lte) | bit(AccessTechnology::Nr);
    modem.signalQuality = 58;
    modem.registration = ModemRegistration::Roaming;
    modem.operatorCode = "001001";
    modem.operatorName = "Other Net";
    modem.signal.lte = SignalLevels{{}, {}, {}, -101.5, -13, 3, {}};
    modem.signal.nr = SignalLevels{{}, {}, {}, -94, -10.5, 14.5, {}};
    for (const bool isServing : {true, false}) {
        auto& lte = modem.cells.emplace_back();
        lte.type = CellType::Lte;
        lte.serving = isServing;
        lte.operatorCode = isServing ? "001001" : "";
        lte.ci = isServing ? std::optional<std::uint64_t>(0x0ABCDE02) : std::nullopt;
        lte.tac = isServing ? std::optional<std::uint32_t>(21) : std::nullopt;
        lte.physicalCell = isServing ? 301 : 302;
        lte.channel = 6300;
        lte.rsrp = isServing ? -101 : -107;
        auto& nr = modem.cells.emplace_back();
        nr.type = CellType::Nr;
        nr.serving = isServing;
        nr.physicalCell = isServing ? 501 : 502;
        nr.channel = 634080;
        nr.rsrp = isServing ? -95 : -103;
        nr.sinr = isServing ? 14 : 2;
    }
    EXPECT_EQ(rowsOf(modem), R"(Status: Registered, 5G NSA (LTE and NR)
Signal Quality: 58 % (not recent)
Serving Cell
  Technology: LTE
  Measured RSRP: -101.50 dBm
  Measured RSRQ: -13.00 dB
  SNR: 3.00 dB
  Physical Cell ID: 301
  E-ARFCN: 6300
  Cell Identity: 180149762
  eNodeB (derived): 703710
  Cell of eNodeB (derived): 2
  Tracking Area Code: 21
  Mobile Country Code: 001
  Mobile Network Code: 001
  NR
    Technology: NR
    Measured RSRP: -94.00 dBm
    Measured RSRQ: -10.50 dB
    SNR: 14.50 dB
    Physical Cell ID: 501
    NR-ARFCN: 634080
Neighbor Cells
  0
    Technology: LTE
    Measured RSRP: -107.00 dBm
    Physical Cell ID: 302
    E-ARFCN: 6300
  1
    Technology: NR
    Measured RSRP: -103.00 dBm
    SINR: 2.00 dB
    Physical Cell ID: 502
    NR-ARFCN: 634080
Registration
  Registration State: Registered, roaming
  Operator: Other Net
  Mobile Country Code: 001
  Mobile Network Code: 001
  Access Technology: 5G NSA (LTE and NR)
Signal
  LTE
    Measured RSRP: -101.50 dBm
    Measured RSRQ: -13.00 dB
    SNR: 3.00 dB
  NR
    Measured RSRP: -94.00 dBm
    Measured RSRQ: -10.50 dB
    SNR: 14.50 dB
Modem
  Model: NX-55
  State: Registered
Time: 2026-11-16T06:05:42.250Z
)");
}

TEST(ModemTree, OfAGsmModem)
{
    ModemState modem;
    modem.manufacturer = "Example Radio";
    modem.phase = ModemPhase::Registered;
    modem.accessTechnologies = bit(AccessTechnology::Gsm) | bit(AccessTechnology::Edge);
    modem.signalQuality = 40;
    modem.signalQualityRecent = true;
    modem.registration = ModemRegistration::Home;
    modem.operatorCode = "00101";
    modem.signal.gsm = SignalLevels{-81, {}, {}, {}, {}, {}, 0.4};
    modem.location = ModemLocation{"001", "01", 0x1107, 0x2A01, 0};
    for (const bool isServing : {true, false}) {
        auto& cell = modem.cells.emplace_back();
        cell.type = CellType::Gsm;
        cell.serving = isServing;
        cell.lac = 0x1107;
        cell.ci = isServing ? 0x2A01 : 0x2A02;
        cell.channel = isServing ? 60 : 38;
        cell.baseStation = isServing ? 28 : 54;
        cell.rxLevel = isServing ? 29 : 21;
    }
    EXPECT_EQ(rowsOf(modem), R"(Status: Registered, EDGE, GSM
Signal Quality: 40 %
Serving Cell
  Technology: GSM
  RSSI: -81.00 dBm
  Error Rate: 0.40 %
  RXLEV: 29
  BSIC: 28
  ARFCN: 60
  Cell ID: 10753
  Location Area Code: 4359
  Mobile Country Code: 001
  Mobile Network Code: 01
Neighbor Cells
  0
    Technology: GSM
    RXLEV: 21
    RSSI (derived): -89.00 dBm
    BSIC: 54
    ARFCN: 38
    Cell ID: 10754
    Location Area Code: 4359
Registration
  Registration State: Registered, home
  Mobile Country Code: 001
  Mobile Network Code: 01
  Access Technology: EDGE, GSM
Signal
  GSM
    RSSI: -81.00 dBm
    Error Rate: 0.40 %
Modem
  Manufacturer: Example Radio
  State: Registered
Time: 2026-11-16T06:05:42.250Z
)");
}

TEST(ModemTree, HasNoRowForWhatIsUnknown)
{
    EXPECT_EQ(rowsOf(ModemState()), "Status: Unknown\n"
                                    "Modem\n"
                                    "  State: Unknown\n"
                                    "Time: 2026-11-16T06:05:42.250Z\n");
}

// Replay, decoders and recordings look for this key.
TEST(ModemTree, HasItsTimeUnderTheKeyTime)
{
    EXPECT_EQ(makeModemTree(statesOf(lteModem()), kTime, {})->at("Time"), "2026-11-16T06:05:42.250Z");
    EXPECT_EQ(makeModemTree({}, kTime, {})->at("Time"), "2026-11-16T06:05:42.250Z");
}

// Cells.

ModemCell umtsCell(bool isServing, std::uint32_t scramblingCode, double rscp)
{
    ModemCell cell;
    cell.type = CellType::Umts;
    cell.serving = isServing;
    cell.channel = 10562;
    cell.scramblingCode = scramblingCode;
    cell.rscp = rscp;
    cell.ecio = -6.5;
    return cell;
}

ModemState umtsModem()
{
    ModemState modem;
    modem.phase = ModemPhase::Registered;
    modem.accessTechnologies = bit(AccessTechnology::Hsdpa) | bit(AccessTechnology::Hsupa);
    modem.cells.push_back(umtsCell(true, 17, -83));
    modem.cells.front().ci = 0x00B9'1107;
    modem.cells.front().lac = 0x2001;
    modem.cells.front().pathLoss = 116;
    return modem;
}

TEST(ModemTreeCells, OfUmtsHaveRscpAndScramblingCode)
{
    EXPECT_THAT(rowsOf(umtsModem()), HasSubstr("Serving Cell\n"
                                               "  Technology: UMTS\n"
                                               "  RSCP: -83.00 dBm\n"
                                               "  Energy Per Chip: -6.50 dB\n"
                                               "  Path Loss: 116 dB\n"
                                               "  Scrambling Code: 17\n"
                                               "  UARFCN: 10562\n"
                                               "  Cell ID: 12128519\n"
                                               "  RNC (derived): 185\n"
                                               "  Location Area Code: 8193\n"));
}

TEST(ModemTreeCells, OfStandaloneNrHaveNoDerivedIdentity)
{
    ModemState modem;
    modem.accessTechnologies = bit(AccessTechnology::Nr);
    modem.signal.nr = SignalLevels{{}, {}, {}, -88, {}, {}, {}};
    modem.location = ModemLocation{"001", "01", {}, 0x8'0000'0001, 0x010203};
    EXPECT_THAT(rowsOf(modem), HasSubstr("Serving Cell\n"
                                         "  Technology: NR\n"
                                         "  Measured RSRP: -88.00 dBm\n"
                                         "  Cell Identity: 34359738369\n"
                                         "  Tracking Area Code: 66051\n"
                                         "  Mobile Country Code: 001\n"
                                         "  Mobile Network Code: 01\n"
                                         "Registration\n"
                                         "  Access Technology: 5G NR\n"));
}

TEST(ModemTreeCells, OfOtherTechnologiesHaveTheirNumbers)
{
    ModemState modem;
    auto& cdma = modem.cells.emplace_back();
    cdma.type = CellType::Cdma;
    cdma.serving = true;
    cdma.systemId = 4139;
    cdma.networkId = 2;
    cdma.cdmaBaseStationId = 771;
    cdma.referencePn = 168;
    cdma.pilotStrength = 12;
    auto& tdScdma = modem.cells.emplace_back();
    tdScdma.type = CellType::TdScdma;
    tdScdma.channel = 10054;
    tdScdma.cellParameter = 11;
    tdScdma.rscp = -70;
    EXPECT_THAT(rowsOf(modem), HasSubstr("Serving Cell\n"
                                         "  Technology: CDMA\n"
                                         "  System ID: 4139\n"
                                         "  Network ID: 2\n"
                                         "  Base Station ID: 771\n"
                                         "  Reference PN: 168\n"
                                         "  Pilot Strength: 12\n"
                                         "Neighbor Cells\n"
                                         "  0\n"
                                         "    Technology: TD-SCDMA\n"
                                         "    RSCP: -70.00 dBm\n"
                                         "    Cell Parameter ID: 11\n"
                                         "    UARFCN: 10054\n"));
}

TEST(ModemTreeCells, AreOrderedByLevelAndUnknownLevelsComeLast)
{
    auto modem = umtsModem();
    modem.cells.push_back(umtsCell(false, 1, std::numeric_limits<double>::quiet_NaN()));
    modem.cells.push_back(umtsCell(false, 2, -99));
    modem.cells.push_back(umtsCell(false, 3, -90));
    const auto rows = rowsOf(modem);
    const auto at = [&](const char* text) { return rows.find(text); };
    ASSERT_NE(at("Scrambling Code: 1\n"), std::string::npos);
    EXPECT_LT(at("Scrambling Code: 3\n"), at("Scrambling Code: 2\n"));
    EXPECT_LT(at("Scrambling Code: 2\n"), at("Scrambling Code: 1\n"));
}

TEST(ModemTreeCells, ServingCellIsNoNeighborWhenTheModemRepeatsIt)
{
    auto modem = umtsModem();
    modem.cells.push_back(umtsCell(false, 17, -83));
    modem.cells.push_back(umtsCell(false, 18, -90));
    const auto rows = rowsOf(modem);
    EXPECT_THAT(rows, HasSubstr("Neighbor Cells\n"
                                "  0\n"
                                "    Technology: UMTS\n"
                                "    RSCP: -90.00 dBm\n"));
    EXPECT_THAT(rows, Not(HasSubstr("  1\n")));
}

// GetCellInfo is asked now and then, the location changes at once: for a moment they are those of two cells.
TEST(ModemTreeCells, ValuesOfTheCellThatWasLeftAreNotMixedIn)
{
    auto modem = lteModem();
    modem.location->ci = 0x1A2302;
    const auto rows = rowsOf(modem);
    EXPECT_THAT(rows, HasSubstr("Serving Cell\n"
                                "  Technology: LTE\n"
                                "  Measured RSRP: -98.00 dBm\n"
                                "  Measured RSRQ: -11.50 dB\n"
                                "  Measured RSSI: -67.00 dBm\n"
                                "  SNR: 7.25 dB\n"
                                "  Cell Identity: 1712898\n"
                                "  eNodeB (derived): 6691\n"
                                "  Cell of eNodeB (derived): 2\n"
                                "  Tracking Area Code: 5378\n"));
    EXPECT_THAT(rows, Not(HasSubstr("Physical Cell ID: 76")));
}

TEST(ModemTreeCells, TheCellThatTheModemMovedToIsNoNeighborAnyMore)
{
    auto modem = lteModem();
    modem.location->ci = modem.cells.back().ci = 0x1A2302;
    EXPECT_THAT(rowsOf(modem), Not(HasSubstr("Physical Cell ID: 204")));
}

TEST(ModemTreeCells, OfAnAreaThatWasLeftAreNotMixedInEither)
{
    auto modem = lteModem();
    modem.location = ModemLocation{"001", "01", {}, {}, 0x1503};
    EXPECT_THAT(rowsOf(modem), Not(HasSubstr("Physical Cell ID: 76")));
}

TEST(ModemTreeCells, OnAnotherFrequencyOrWithAnotherIdentityAreNeighbors)
{
    auto modem = lteModem();
    auto other = modem.cells.front();
    other.serving = false;
    other.ci = 0x1A2303;
    other.rsrp = -90;
    modem.cells.push_back(other);
    other.ci.reset();
    other.channel = 6300;
    other.rsrp = -91;
    modem.cells.push_back(other);
    const auto rows = rowsOf(modem);
    EXPECT_THAT(rows, HasSubstr("    Measured RSRP: -90.00 dBm\n"));
    EXPECT_THAT(rows, HasSubstr("    Measured RSRP: -91.00 dBm\n"));
}

TEST(ModemTreeCells, OfTheRegisteredTechnologyComeFirst)
{
    auto modem = lteModem();
    auto& gsm = modem.cells.emplace_back();
    gsm.type = CellType::Gsm;
    gsm.rxLevel = 60;
    EXPECT_THAT(rowsOf(modem), HasSubstr("  2\n"
                                         "    Technology: GSM\n"
                                         "    RXLEV: 60\n"
                                         "    RSSI (derived): -50.00 dBm\n"));
}

TEST(ModemTreeCells, HaveNothingDerivedFromNumbersThatHaveNoParts)
{
    auto lte = lteModem();
    lte.location.reset();
    lte.cells.front().ci = 0x1000'0000; // 29 bits
    auto umts = umtsModem();
    umts.cells.front().ci = 0xFFFF; // without an RNC
    ModemState gsm;
    gsm.cells.emplace_back().type = CellType::Gsm;
    gsm.cells.front().rxLevel = 99; // "not known" in 3GPP TS 27.007
    for (const auto& modem : {lte, umts, gsm})
        EXPECT_THAT(rowsOf(modem), Not(HasSubstr("derived")));
}

TEST(ModemTreeCells, IdentityOfZeroIsOneWhereItsAreaIsKnown)
{
    ModemState modem;
    modem.accessTechnologies = bit(AccessTechnology::Lte);
    modem.location = ModemLocation{"001", "01", {}, 0, 0x1502};
    EXPECT_THAT(rowsOf(modem), HasSubstr("  Cell Identity: 0\n"));
}

TEST(ModemTreeCells, OfAnotherTechnologyThanTheRegisteredOneAreNoServingCell)
{
    auto modem = lteModem();
    modem.accessTechnologies = bit(AccessTechnology::Umts); // GetCellInfo still has the LTE cell
    modem.signal = {};
    modem.location = ModemLocation{"001", "01", 0x2001, 0xB91107, 0};
    EXPECT_THAT(rowsOf(modem), HasSubstr("Serving Cell\n"
                                         "  Technology: UMTS\n"
                                         "  Cell ID: 12128519\n"
                                         "  RNC (derived): 185\n"
                                         "  Location Area Code: 8193\n"));
    modem.location.reset();
    EXPECT_THAT(rowsOf(modem), HasSubstr("Serving Cell\n"
                                         "  Technology: UMTS\n"
                                         "  LTE\n"
                                         "    Technology: LTE\n"));
}

TEST(ModemTreeCells, LocationWithoutAreaAndIdentityIsNone)
{
    ModemState modem;
    modem.accessTechnologies = bit(AccessTechnology::Lte);
    modem.location = ModemLocation{"", "", 0, 0, 0xFFFE};
    EXPECT_THAT(rowsOf(modem), HasSubstr("Serving Cell\n"
                                         "  Technology: LTE\n"
                                         "Registration\n"));
}

TEST(ModemTreeCells, LocationThatIsNoneDoesNotContradictTheServingCell)
{
    auto modem = lteModem();
    modem.location = ModemLocation{"", "", 0, 0, 0};
    EXPECT_THAT(rowsOf(modem), HasSubstr("  Physical Cell ID: 76\n"));
}

TEST(ModemTreeCells, SecondCarriersAreNumbered)
{
    auto modem = lteModem();
    for (const unsigned code : {11u, 12u}) {
        auto& carrier = modem.cells.emplace_back();
        carrier.type = CellType::Lte;
        carrier.serving = true;
        carrier.physicalCell = code;
        carrier.channel = 6300 + code;
        carrier.rsrp = -100.0 - code;
    }
    EXPECT_THAT(rowsOf(modem), HasSubstr("  LTE 2\n"
                                         "    Technology: LTE\n"
                                         "    Measured RSRP: -111.00 dBm\n"
                                         "    Physical Cell ID: 11\n"
                                         "    E-ARFCN: 6311\n"
                                         "  LTE 3\n"
                                         "    Technology: LTE\n"
                                         "    Measured RSRP: -112.00 dBm\n"));
}

TEST(ModemTreeCells, OfManyNeighborsTheStrongestAreShownAndTheRestCounted)
{
    auto modem = umtsModem();
    for (unsigned i = 0; i < 10'000; ++i)
        modem.cells.push_back(umtsCell(false, 100 + i, -120 + i * 0.005));
    const auto tree = makeModemTree(statesOf(modem), kTime, {});
    const auto rows = rowsOf(tree);
    EXPECT_THAT(rows, HasSubstr("  63\n    Technology: UMTS\n"));
    EXPECT_THAT(rows, HasSubstr("  64: 9936 more cells\nRegistration\n"));
    EXPECT_THAT(rows, HasSubstr("Scrambling Code: 10099\n")); // the strongest
    EXPECT_LT(PropertyListCodec().toXml(tree)->bytes().size(), 64'000u);
}

// A display replaces a group of one row by that row's value.
TEST(ModemTree, GroupOfOneRowStaysAGroup)
{
    ModemState modem;
    modem.signal.lte = SignalLevels{{}, {}, {}, -98, {}, {}, {}};
    EXPECT_THAT(rowsOf(modem), HasSubstr("Signal\n"
                                         "  LTE\n"
                                         "    Measured RSRP: -98.00 dBm\n"));
}

// Data.

TEST(ModemTreeData, EachConnectionSaysWhetherItIsUp)
{
    ModemState modem;
    modem.bearers.resize(4);
    modem.bearers[0].connected = false;
    modem.bearers[0].apn = "ims";
    modem.bearers[1].connected = true;
    modem.bearers[1].suspended = true;
    modem.bearers[2].connected = true;
    modem.bearers[2].address6 = "2001:db8::17";
    EXPECT_THAT(rowsOf(modem), HasSubstr("Data\n"
                                         "  0\n"
                                         "    Status: Not connected\n"
                                         "    APN: ims\n"
                                         "  1\n"
                                         "    Status: Suspended\n"
                                         "  2\n"
                                         "    Status: Connected\n"
                                         "    IPv6 Address: 2001:db8::17\n"
                                         "  3: Nothing is known\n"));
}

TEST(ModemTreeData, ConnectionsHaveALimit)
{
    ModemState modem;
    modem.bearers.resize(300);
    EXPECT_THAT(rowsOf(modem), HasSubstr("  16: 284 more connections\n"));
}

// Identities.

TEST(ModemTreeIdentities, AreShownWhenTheyAreAskedFor)
{
    const auto rows = rowsOf(lteModem(), {.identities = true});
    EXPECT_THAT(rows, HasSubstr("  IMSI: 001010123456789\n  ICCID: 8988211000000123456\n"));
    EXPECT_THAT(rows, HasSubstr("  Equipment Identifier: 001012345678905\n"
                                "  Device Identifier: 5f1ac09d3c8be2d2b4a1a5a0f2f7d5b1c0a86e43\n"));
}

TEST(ModemTreeIdentities, AreNowhereInTheMessageOtherwise)
{
    const auto data = *PropertyListCodec().toXml(makeModemTree(statesOf(lteModem()), kTime, {.everyModem = true}));
    const std::string message(reinterpret_cast<const char*>(data.bytes().data()), data.bytes().size());
    for (const char* part : {"0123456789", "123456", "678905", "5f1ac09d", "c0a86e43"})
        EXPECT_THAT(message, Not(HasSubstr(part)));
}

TEST(ModemTreeIdentities, OfAnotherFormAreMaskedCompletely)
{
    auto modem = lteModem();
    modem.sim->imsi = "00101123"; // too short to hide anything
    modem.sim->identifier = "F89secret";
    modem.equipmentIdentifier = "A10000009296F2";
    const auto rows = rowsOf(modem);
    EXPECT_THAT(rows, HasSubstr("  IMSI: ********\n  ICCID: ********\n"));
    EXPECT_THAT(rows, HasSubstr("  Equipment Identifier: ********\n"));
}

// Refusals.

struct RefusalCase {
    const char* name;
    ModemRefusal refusal;
    const char* row;

    friend void PrintTo(const RefusalCase& shown, std::ostream* out) { *out << shown.name; }
};

class Refusal : public testing::TestWithParam<RefusalCase> {};

TEST_P(Refusal, IsOneRowThatSaysWhatToDo)
{
    ModemState modem;
    modem.refusals.push_back(GetParam().refusal);
    EXPECT_EQ(rowsOf(modem), std::string("Status: Unknown\n") + GetParam().row +
                                 "\nModem\n  State: Unknown\nTime: 2026-11-16T06:05:42.250Z\n");
}

// Location and cell information stand where their cells would stand, which is before the other groups; so do all here.
INSTANTIATE_TEST_SUITE_P(
    ModemTree, Refusal,
    testing::Values(RefusalCase{"Signal",
                                {ModemService::Signal, RefusalReason::NotPermitted, {}},
                                "Signal: not permitted; see voxd(1)"},
                    RefusalCase{"Location",
                                {ModemService::Location, RefusalReason::NotPermitted, {}},
                                "Location: not permitted; see voxd(1)"},
                    RefusalCase{"CellInformation",
                                {ModemService::CellInformation, RefusalReason::NotSupported, {}},
                                "Cell Info: not supported by this modem; see voxd(1)"},
                    RefusalCase{"Sim", {ModemService::Sim, RefusalReason::NoAnswer, {}}, "SIM: no answer; see voxd(1)"},
                    RefusalCase{"Data",
                                {ModemService::Data, RefusalReason::Failed, "Wrong state"},
                                "Data: failed: Wrong state; see voxd(1)"},
                    RefusalCase{"FailedWithoutAText",
                                {ModemService::Data, RefusalReason::Failed, ""},
                                "Data: failed; see voxd(1)"}),
    [](const auto& each) { return std::string(each.param.name); });

TEST(ModemTree, RefusedServiceThatTellsSomethingAllTheSameIsShownBesideItsRefusal)
{
    auto modem = lteModem();
    modem.refusals.push_back({ModemService::Signal, RefusalReason::NotPermitted, {}});
    EXPECT_THAT(rowsOf(modem), HasSubstr("    SNR: 7.25 dB\n"
                                         "Signal (refused): not permitted; see voxd(1)\n"
                                         "Data\n"));
}

// What there is when there is no modem, or when it does not work.

struct StatusCase {
    const char* name;
    ModemStates states;
    const char* status;

    friend void PrintTo(const StatusCase& shown, std::ostream* out) { *out << shown.name; }
};

class Status : public testing::TestWithParam<StatusCase> {};

TEST_P(Status, IsSaidInPlainWords)
{
    EXPECT_THAT(rowsOf(GetParam().states), testing::StartsWith(std::string("Status: ") + GetParam().status + "\n"));
}

ModemStates of(ModemDaemon daemon)
{
    ModemStates states;
    states.daemon = daemon;
    return states;
}

ModemStates in(ModemPhase phase, ModemLock lock = ModemLock::None, ModemFailure failure = ModemFailure::None)
{
    ModemState modem;
    modem.phase = phase;
    modem.lock = lock;
    modem.failure = failure;
    return statesOf(modem);
}

ModemStates denied()
{
    auto states = in(ModemPhase::Enabled);
    states.modems[0].registration = ModemRegistration::Denied;
    return states;
}

INSTANTIATE_TEST_SUITE_P(
    ModemTree, Status,
    testing::Values(
        StatusCase{"NoBus", of(ModemDaemon::NoBus), "No system bus; see voxd(1)"},
        StatusCase{"NoDaemon", of(ModemDaemon::Absent), "ModemManager is not running; see voxd(1)"},
        StatusCase{"SilentDaemon", of(ModemDaemon::Silent), "Waiting for ModemManager"},
        StatusCase{"RefusingDaemon", of(ModemDaemon::NotPermitted), "ModemManager: not permitted; see voxd(1)"},
        StatusCase{"NoModem", of(ModemDaemon::Present), "No modem"},
        StatusCase{"NoSim", in(ModemPhase::Failed, ModemLock::None, ModemFailure::SimMissing),
                   "Failed: no SIM; see voxd(1)"},
        StatusCase{"FailureOfALaterVersion", in(ModemPhase::Failed, ModemLock::None, ModemFailure{99}),
                   "Failed: unknown (99); see voxd(1)"},
        StatusCase{"Starting", in(ModemPhase::Initializing), "Starting"},
        StatusCase{"Locked", in(ModemPhase::Locked, ModemLock::SimPin), "Locked: needs the SIM PIN; see voxd(1)"},
        StatusCase{"Blocked", in(ModemPhase::Locked, ModemLock::SimPuk), "Locked: needs the SIM PUK; see voxd(1)"},
        StatusCase{"LockedByTheUnknown", in(ModemPhase::Locked, ModemLock::Unknown), "Locked; see voxd(1)"},
        StatusCase{"Disabled", in(ModemPhase::Disabled), "Disabled; see voxd(1)"},
        StatusCase{"Enabled", in(ModemPhase::Enabled), "Enabled, not registered"},
        StatusCase{"Denied", denied(), "Enabled; the network denies registration"},
        StatusCase{"Searching", in(ModemPhase::Searching), "Searching for a network"},
        StatusCase{"Registered", in(ModemPhase::Registered), "Registered"},
        StatusCase{"Connecting", in(ModemPhase::Connecting), "Connecting"},
        StatusCase{"StateOfALaterVersion", in(ModemPhase{17}), "unknown (17)"}),
    [](const auto& each) { return std::string(each.param.name); });

TEST(ModemTree, WithoutAModemHasItsStatusAndItsTimeOnly)
{
    EXPECT_EQ(rowsOf(of(ModemDaemon::Present)), "Status: No modem\nTime: 2026-11-16T06:05:42.250Z\n");
}

TEST(ModemTree, NamesTheModemThatIsNotThere)
{
    auto states = of(ModemDaemon::Present);
    EXPECT_THAT(rowsOf(states, {.wanted = "5f1ac09d"}), HasSubstr("Status: Modem 5f1ac09d is not there\n"));
    states.otherModems = 2;
    EXPECT_THAT(rowsOf(states, {.wanted = "5f1ac09d"}),
                HasSubstr("Status: Modem 5f1ac09d is not there; other modems: 2\n"));
}

// Modems that a daemon no longer has are not shown, whatever is remembered of them.
TEST(ModemTree, WithoutADaemonShowsNoModem)
{
    auto states = statesOf(lteModem());
    states.daemon = ModemDaemon::Absent;
    EXPECT_THAT(rowsOf(states), Not(HasSubstr("RSRP")));
}

TEST(ModemTree, OfAModemNamesTheDaemonsVersion)
{
    auto states = statesOf(lteModem());
    states.daemonVersion = "1.20.4";
    EXPECT_THAT(rowsOf(states), HasSubstr("  Lock: None\n  Daemon: ModemManager 1.20.4\n"));
}

TEST(ModemTree, QualityOfAModemThatIsOffIsUnknown)
{
    auto modem = lteModem();
    modem.signalQuality = 0;
    EXPECT_THAT(rowsOf(modem), HasSubstr("Signal Quality: 0 %\n"));
    modem.phase = ModemPhase::Disabled;
    EXPECT_THAT(rowsOf(modem), Not(HasSubstr("Signal Quality")));
}

// The service adds this node, whatever its source is.
TEST(ModemTree, PositionStandsBeforeTheTime)
{
    const auto tree = makeModemTree(statesOf(lteModem()), kTime, {});
    tree->set(kPositionNode, positionNode(Position{3, 60.1699, 24.9384, 13.5, kTime}));
    EXPECT_THAT(rowsOf(tree), testing::EndsWith("  Lock: None\n"
                                                "Position\n"
                                                "  Fix: 3D\n"
                                                "  Latitude: 60.1699000\n"
                                                "  Longitude: 24.9384000\n"
                                                "  Speed: 13.50 m/s\n"
                                                "  Time: 2026-11-16T06:05:42.250Z\n"
                                                "Time: 2026-11-16T06:05:42.250Z\n"));
}

// Several modems.

TEST(EveryModem, HasItsNodeAlsoWhenThereIsOneOnly)
{
    const auto rows = rowsOf(statesOf(lteModem()), {.everyModem = true});
    EXPECT_THAT(rows, testing::StartsWith("Modem 1 (LM-940)\n"
                                          "  Status: Connected, LTE\n"
                                          "  Signal Quality: 71 %\n"
                                          "  Serving Cell\n"
                                          "    Technology: LTE\n"));
    EXPECT_THAT(rows, testing::EndsWith("\nTime: 2026-11-16T06:05:42.250Z\n"));
}

TEST(EveryModem, KeepsItsNodeWhenAnotherOfItsModelGoes)
{
    auto states = statesOf(lteModem());
    states.modems.push_back(lteModem());
    states.modems[1].number = 2;
    EXPECT_THAT(rowsOf(states, {.everyModem = true}), HasSubstr("\nModem 2 (LM-940)\n"));
    states.modems.erase(states.modems.begin());
    EXPECT_THAT(rowsOf(states, {.everyModem = true}), testing::StartsWith("Modem 2 (LM-940)\n"));
}

TEST(EveryModem, HasANumberWhenItHasNoModel)
{
    EXPECT_THAT(rowsOf(ModemState(), {.everyModem = true}), testing::StartsWith("Modem 1\n  Status: Unknown\n"));
}

TEST(EveryModem, IsCountedBeyondTheLimit)
{
    auto states = statesOf(lteModem());
    states.modems.resize(40);
    const auto rows = rowsOf(states, {.everyModem = true});
    EXPECT_THAT(rows, HasSubstr("\nModem 16\n"));
    EXPECT_THAT(rows, Not(HasSubstr("Modem 17")));
    EXPECT_THAT(rows, HasSubstr("More Modems: 24\nTime: "));
}

// A display shows a key with two semicolons with its number.
TEST(EveryModem, NameCannotBreakTheOrder)
{
    auto modem = lteModem();
    modem.model = "a;b;c\x1B[2J/d";
    EXPECT_THAT(rowsOf(modem, {.everyModem = true}), testing::StartsWith("Modem 1 (a,b,c\uFFFD[2J/d)\n"));
}

// Nonsense.

TEST(ModemTreeNonsense, LevelsThatAreNoneAreUnknown)
{
    constexpr double kInfinity = std::numeric_limits<double>::infinity();
    ModemState modem;
    modem.phase = ModemPhase::Enabled;
    const auto without = rowsOf(modem);
    modem.signalQuality = UINT32_MAX;
    modem.signal.lte = SignalLevels{std::numeric_limits<double>::quiet_NaN(),
                                    -std::numeric_limits<double>::max(), // what the daemon's libraries call unknown
                                    kInfinity,
                                    -kInfinity,
                                    1e300,
                                    -1001,
                                    101};
    modem.signal.gsm = SignalLevels{{}, {}, {}, {}, {}, {}, -1};
    EXPECT_EQ(rowsOf(modem), without);
}

TEST(ModemTreeNonsense, HugeNumbersAreShownAsTheyCame)
{
    ModemState modem;
    auto& cell = modem.cells.emplace_back();
    cell.type = CellType{4'000'000'000};
    cell.serving = true;
    cell.ci = UINT64_MAX;
    cell.channel = UINT32_MAX;
    cell.rxLevel = UINT32_MAX;
    modem.bearers.emplace_back().receivedBytes = UINT64_MAX;
    modem.bearers.front().duration = UINT32_MAX;
    modem.accessTechnologies = 0x8000'0000;
    modem.registration = ModemRegistration{77};
    const auto rows = rowsOf(modem);
    EXPECT_THAT(rows, HasSubstr("Serving Cell\n"
                                "  RXLEV: 4294967295\n"
                                "  Channel: 4294967295\n"
                                "  Cell ID: 18446744073709551615\n"
                                "Neighbor Cells\n"
                                "Registration\n"
                                "  Registration State: unknown (77)\n"
                                "  Access Technology: unknown (0x80000000)\n"));
    EXPECT_THAT(rows, HasSubstr("    Duration: 1193046:28:15\n    Bytes Received: 18446744073709551615\n"));
}

TEST(ModemTreeNonsense, AnyTechnologyIsNone)
{
    ModemState modem;
    modem.accessTechnologies = UINT32_MAX;
    modem.phase = ModemPhase::Registered;
    EXPECT_THAT(rowsOf(modem), testing::StartsWith("Status: Registered\nModem\n"));
}

TEST(ModemTreeNonsense, TextsAreOneCleanLine)
{
    ModemState modem;
    modem.revision = "  1.2\r\n\t3\x01\xFF\xE2\x80\xAE\xE2\x80\x8E"
                     "abc\x7F\xC2\x9B \n";
    modem.manufacturer = " \n";
    modem.model = std::string(1000, 'x');
    modem.operatorCode = "001;01";
    const auto rows = rowsOf(modem);
    EXPECT_THAT(rows, HasSubstr("  Revision: 1.2   3\uFFFD\uFFFD\uFFFD\uFFFDabc\uFFFD\uFFFD\n"));
    EXPECT_THAT(rows, Not(HasSubstr("Manufacturer")));
    EXPECT_THAT(rows, HasSubstr("  Model: " + std::string(128, 'x') + "\u2026\n"));
    EXPECT_THAT(rows, HasSubstr("  Operator Code: 001;01\n"));
}

/// Values that a daemon should never send, in any combination.
class Hostile {
public:
    explicit Hostile(unsigned seed) : _engine(seed) {}

    ModemStates states()
    {
        ModemStates states;
        states.daemon = chance() ? ModemDaemon::Present : ModemDaemon{static_cast<int>(below(7))};
        fill(states.daemonVersion);
        states.modems.resize(below(20));
        for (auto& each : states.modems)
            fill(each);
        return states;
    }

private:
    unsigned below(unsigned limit) { return static_cast<unsigned>(_engine() % limit); }
    bool chance() { return below(2) == 0; }

    void fill(bool& value) { value = chance(); }
    void fill(double& value)
    {
        constexpr double kInfinity = std::numeric_limits<double>::infinity();
        constexpr double kValues[] = {
            std::numeric_limits<double>::quiet_NaN(),  kInfinity, -kInfinity, -std::numeric_limits<double>::max(),
            std::numeric_limits<double>::denorm_min(), -0.0,      -98.5,      1e9};
        value = kValues[below(std::size(kValues))];
    }
    void fill(std::string& value)
    {
        const std::string texts[] = {"",          "00101",           "001010123456789",       std::string(1000, 'a'),
                                     "\xFF\xC0;", std::string(3, 0), "\xF4\x90\x80\x80;;/..", "]]></string>&"};
        value = texts[below(std::size(texts))];
    }
    template <std::unsigned_integral Number>
    void fill(Number& value)
    {
        const Number values[] = {0, 1, 63, 64, 0xFFFE, static_cast<Number>(1) << 31, static_cast<Number>(-1)};
        value = values[below(std::size(values))];
    }
    template <typename Enumeration>
        requires std::is_enum_v<Enumeration>
    void fill(Enumeration& value)
    {
        value = static_cast<Enumeration>(chance() ? below(20) : static_cast<unsigned>(_engine()));
    }
    template <typename Held>
    void fill(std::optional<Held>& value)
    {
        if (chance())
            fill(value.emplace());
    }
    void fill(SignalLevels& levels) { fillAll(levels.rssi, levels.rscp, levels.ecio, levels.rsrp, levels.snr); }
    void fill(ModemLocation& place) { fillAll(place.mcc, place.mnc, place.lac, place.ci, place.tac); }
    void fill(ModemSim& sim) { fillAll(sim.identifier, sim.imsi, sim.operatorCode, sim.operatorName); }
    void fill(ModemBearer& each)
    {
        fillAll(each.connected, each.suspended, each.interface, each.apn, each.address4, each.address6, each.duration,
                each.receivedBytes, each.sentBytes);
    }
    void fill(ModemCell& cell)
    {
        fillAll(cell.type, cell.serving, cell.operatorCode, cell.lac, cell.tac, cell.ci, cell.channel,
                cell.physicalCell, cell.scramblingCode, cell.baseStation, cell.cellParameter, cell.timingAdvance,
                cell.rxLevel, cell.pathLoss, cell.rscp, cell.ecio, cell.rsrp, cell.rsrq, cell.sinr, cell.systemId,
                cell.pilotStrength);
    }
    void fill(ModemState& modem)
    {
        fillAll(modem.number, modem.identifier, modem.manufacturer, modem.model, modem.revision,
                modem.equipmentIdentifier, modem.phase, modem.failure, modem.lock, modem.accessTechnologies,
                modem.signalQuality, modem.registration, modem.operatorCode, modem.operatorName, modem.packetService,
                modem.sim, modem.signal.gsm, modem.signal.umts, modem.signal.lte, modem.signal.nr, modem.location);
        modem.bearers.resize(below(30));
        for (auto& each : modem.bearers)
            fill(each);
        modem.cells.resize(below(100));
        for (auto& each : modem.cells)
            fill(each);
        for (const auto service : {ModemService::Signal, ModemService::Location, ModemService{77}})
            if (chance())
                fill(modem.refusals.emplace_back(service, RefusalReason{static_cast<int>(below(6))}, "").text);
    }
    template <typename... Fields>
    void fillAll(Fields&... fields)
    {
        (fill(fields), ...);
    }

    std::mt19937 _engine;
};

RC_GTEST_PROP(ModemTreeNonsense, MakesATreeOfLimitedSizeThatDisplaysShow, (unsigned seed, bool everyModem))
{
    const auto tree = makeModemTree(Hostile(seed).states(), kTime,
                                    {.everyModem = everyModem, .identities = seed % 2 == 0, .wanted = "\xFF;"});
    const auto rows = rowsOf(tree);
    RC_ASSERT(PropertyListCodec().toXml(tree)->bytes().size() < (1u << 20));
    for (const char* never : {"nan", "inf", "_sorted", "(unknown)", "00;", "e+"})
        RC_ASSERT(rows.find(never) == std::string::npos);
    RC_ASSERT(std::ranges::none_of(rows, [](char c) { return (c >= 0 && c < ' ' && c != '\n') || c == 0x7F; }));
}

} // namespace
} // namespace kestrum
