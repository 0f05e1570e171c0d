#include "Tool.h"
#include "capture/Messages.h"
#include "harness/Scratch.h"
#include "platform/propertylist/PropertyListCodec.h"
#include "voxd/PositionTrack.h"
#include "voxd/scenarios/Scenario.h"

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <algorithm>
#include <cstdlib>
#include <thread>

namespace kestrum::tools {
namespace {

using testing::AllOf;
using testing::EndsWith;
using testing::HasSubstr;
using testing::Not;
using testing::StartsWith;

constexpr std::uint64_t kSecond = 800ull << 16; // in a time stamp

std::string node(const std::string& fix, const std::string& latitude, const std::string& longitude,
                 const std::string& speed = {})
{
    const auto entry = [](const char* key, const std::string& text) {
        return std::string("<key>") + key + "</key><string>" + text + "</string>";
    };
    return "<dict>" + entry("Fix", fix) + entry("Latitude", latitude) + entry("Longitude", longitude) +
           entry("Speed", speed) + entry("Time", "") + "</dict>";
}

/// The record of a position, as voxd sends it.
std::string position(const std::string& list, std::uint64_t stamp = kStamp)
{
    return message(0x8000, "<plist>" + list + "</plist>", stamp, 0xFF);
}

/// A serving cell measurement of LTE, with the RSRP in quarters of a dB above -140 dBm.
std::string measured(int rsrp, std::uint64_t stamp = kStamp)
{
    std::string payload(20, '\0');
    payload[0] = 1;
    payload[8] = static_cast<char>(rsrp);
    return message(0xB17F, payload, stamp);
}

std::string tree(const std::string& serving, const std::string& place, const std::string& time = "2026-11-16T06:05:42Z")
{
    return "<plist><dict><key>Time</key><string>" + time + "</string><key>Position</key>" + place +
           "<key>0;Serving Cell</key><dict>" + serving + "</dict></dict></plist>";
}
std::string entry(const std::string& key, const std::string& text)
{
    return "<key>" + key + "</key><string>" + text + "</string>";
}

/// JSON with double quotes in place of single ones.
std::string json(std::string text)
{
    std::ranges::replace(text, '\'', '"');
    return text;
}

class GeojsonTest : public testing::Test {
protected:
    Ran decode(const std::string& contents, const std::vector<std::string>& more = {})
    {
        writeFile(scratch / "a.kcap", contents);
        std::vector<std::string> arguments{"--format", "geojson", scratch / "a.kcap"};
        arguments.insert(arguments.end(), more.begin(), more.end());
        auto ran = run(arguments);
        EXPECT_TRUE(isCollection(ran.output)) << ran.output;
        return ran;
    }
    /// Asks Python whether it is a collection of points with one value for each name.
    bool isCollection(const std::string& text)
    {
        writeFile(scratch / "a.geojson", text);
        writeFile(scratch / "check.py", R"(import json, sys
def unique(pairs):
    assert len({name for name, _ in pairs}) == len(pairs), pairs
    return dict(pairs)
with open(sys.argv[1], encoding="utf-8") as file:
    collection = json.load(file, object_pairs_hook=unique, parse_constant=lambda name: sys.exit(name))
assert collection["type"] == "FeatureCollection"
for feature in collection["features"]:
    assert feature["type"] == "Feature" and feature["geometry"]["type"] == "Point"
    east, north = feature["geometry"]["coordinates"]
    assert -180 <= east <= 180 and -90 <= north <= 90
    assert {"time", "technology"} <= feature["properties"].keys()
    assert all(isinstance(value, (str, int, float, type(None))) for value in feature["properties"].values())
)");
        const auto command = "python3 '" + (scratch / "check.py") + "' '" + (scratch / "a.geojson") + "'";
        return std::system(command.c_str()) == 0;
    }
    static std::size_t points(const std::string& output)
    {
        std::size_t count = 0;
        for (std::size_t at = 0; (at = output.find("\"Feature\"", at)) != output.npos; ++at)
            ++count;
        return count;
    }

    const std::string here = position(node("3D", "52.5200066", "13.4049540", "13.89 m/s"));
    ScratchDirectory scratch;
};

TEST_F(GeojsonTest, HasAPointForEachChangeOfALevelAtAKnownPosition)
{
    const auto ran = decode(kcap(measured(100)) + kcap(here) + kcap(measured(167)) + kcap(measured(167)) +
                            kcap(position(node("2D", "-33.9", "-18.4"))) + kcap(measured(168)));
    EXPECT_EQ(ran.status, 0);
    EXPECT_EQ(points(ran.output), 2u) << ran.output;
    EXPECT_THAT(
        ran.output,
        AllOf(StartsWith(json("{'type':'FeatureCollection','features':[\n"
                              "{'type':'Feature','geometry':{'type':'Point','coordinates':[13.404954,52.5200066]},"
                              "'properties':{'time':'2026-11-16T06:05:42.000000Z',"
                              "'technology':'kVoxLogChannelTechnology_Zephra_LTE','speed (m/s)':13.89,")),
              HasSubstr(json("'E-ARFCN':'0','Measured RSRP (dBm)':-98.25,")),
              HasSubstr(json("}},\n{'type':'Feature','geometry':{'type':'Point','coordinates':[-18.4,-33.9]},")),
              HasSubstr(json("'Measured RSRP (dBm)':-98,")), EndsWith("}}\n]}\n")));
}

struct Drive {
    const char* scenario;
    std::vector<std::string> names;
};

TEST_F(GeojsonTest, HasTheValuesOfEachTechnology)
{
    for (const auto& [scenario, names] :
         {Drive{"lte",
                {"Physical Cell ID", "Cell Identity", "Tracking Area Code", "Freq Band Indicator", "Download Frequency",
                 "E-ARFCN", "Measured RSRP (dBm)", "Average RSRP (dBm)", "Measured RSRQ (dB)", "Average RSRQ (dB)",
                 "Measured RSSI (dBm)", "Serving Physical Cell ID", "Serving Filtered RSRP (dBm)",
                 "Serving Filtered RSRQ (dB)"}},
          Drive{"gsm",
                {"Mobile Country Code", "Mobile Network Code", "Location Area Code", "Routing Area Code", "GSM Cell ID",
                 "GSM ARFCN", "GSM BSIC", "GSM RSSI (dBm)", "UMTS Cell ID", "UMTS UARFCN", "UMTS Scrambling Code",
                 "UMTS RSCP (dB)", "UMTS Energy Per Chip (dB)"}},
          Drive{"cdma",
                {"System ID", "Network ID", "Base Station ID", "1x Rx0 Band Class", "1x Rx0 Channel",
                 "1x Rx0 AGC (dBm)", "EV-DO Band Class", "EV-DO Channel", "EV-DO Rx0 AGC (dBm)"}},
          Drive{"utran",
                {"Cell ID", "Local Area Code", "URA ID", "Freq Band Indicator", "Downlink UARFCN",
                 "Cell Scrambling Code"}},
          Drive{"ifx", {"MCC", "MNC", "LAC", "Cell ID", "ARFCN", "BSIC", "RSSI (dBm)", "C1", "C2"}}}) {
        PropertyListCodec lists;
        const Date start = *dateFromIso("2026-11-16T06:05:42Z");
        PositionTrack track([] { return Position{3, 52.5, 13.4, {}, {}}; }, lists);
        const auto source = makeScenario(scenario, {7, start, lists});
        std::string capture;
        for (auto message = source->next(); message && message->at < std::chrono::seconds(60);
             message = source->next()) {
            if (const auto companion = track.accompany(*message))
                capture += kcap(textOf(*companion));
            capture += kcap(textOf(message->bytes));
        }
        const auto map = decode(capture).output;
        for (const auto& name : names)
            EXPECT_NE(map.find('"' + name + "\":"), map.npos) << scenario << ": " << name;
    }
}

TEST_F(GeojsonTest, ValuesThatAreNotOfTheServingCellMakeNoPoint)
{
    // "Num Tx Antennas".
    const auto antennas = [](char count) { return message(0xB0C1, std::string(7, '\0') + count + '\0'); };
    EXPECT_EQ(points(decode(kcap(antennas(1)) + kcap(here) + kcap(antennas(2)) + kcap(antennas(4))).output), 0u);
}

TEST_F(GeojsonTest, APositionCountsForFiveSecondsOfTheLog)
{
    const auto last = kStamp + 5 * kSecond;
    EXPECT_EQ(points(decode(kcap(here) + kcap(measured(100, last - (1 << 16))) + kcap(measured(110, last)) +
                            kcap(measured(120, kStamp - 5 * kSecond)))
                         .output),
              1u);
    EXPECT_EQ(points(decode(kcap(here) + kcap(measured(100, 0))).output), 0u) << "a message without a time";
    EXPECT_EQ(points(decode(kcap(position(node("3D", "1", "2"), 0)) + kcap(measured(100))).output), 0u);
}

TEST_F(GeojsonTest, ALostPositionMakesNoPoint)
{
    for (const auto& lost :
         {node("", "", ""), node("3D", "91", "0"), node("3D", "nan", "nan"), std::string("<array/>")})
        EXPECT_EQ(points(decode(kcap(here) + kcap(position(lost)) + kcap(measured(100))).output), 0u) << lost;
}

TEST_F(GeojsonTest, PositionsAreNoFaultAndShowNothing)
{
    const auto messages = kcap(here) + kcap(measured(100)) + kcap(position(node("", "", "")));
    EXPECT_THAT(decode(messages, {"--stats"}).remarks,
                AllOf(HasSubstr("0xFF8000           2           2           0                   0           0\n"),
                      HasSubstr("total              3           3           0                   0           0\n")));
    writeFile(scratch / "b.kcap", kcap(measured(100)));
    EXPECT_EQ(run({scratch / "a.kcap"}).output, run({scratch / "b.kcap"}).output);
    // Also between the trees of an IFX modem.
    writeFile(scratch / "c.kcap", kcap(tree(entry("RSSI", "-60 dBm"), node("", "", ""))) + kcap(here));
    EXPECT_THAT(run({"--format", "json", scratch / "c.kcap"}).output, HasSubstr("\"dropped\": 0"));
}

TEST_F(GeojsonTest, TreesHaveTheirOwnPosition)
{
    const auto ran = decode(
        kcap(tree(entry("0;Measured RSRP", "-98.00 dBm") + entry("1;Cell Identity", "1712898"),
                  node("3D", "60.1699", "24.9384"), "2026-11-16T06:05:42.250Z")) +
        kcap(tree(entry("0;Measured RSRP", "-97.25 dBm") + entry("1;Cell Identity", "1712898"), node("", "", ""))) +
        kcap(tree(entry("0;Measured RSRP", "-97.25 dBm") + entry("1;Cell Identity", "7"),
                  node("2D", "60.17", "24.94"))));
    EXPECT_EQ(points(ran.output), 2u);
    EXPECT_THAT(ran.output,
                AllOf(HasSubstr(json("[24.9384,60.1699]},'properties':{'time':'2026-11-16T06:05:42.250000Z',"
                                     "'technology':'kVoxLogChannelTechnology_IFX',"
                                     "'Cell Identity':'1712898','Measured RSRP (dBm)':-98}}")),
                      HasSubstr("[24.94,60.17]},"),
                      HasSubstr(json("'Cell Identity':'7','Measured RSRP (dBm)':-97.25}}"))));
}

TEST_F(GeojsonTest, ModemsAndSecondCellsOfATreeAreToldApart)
{
    const auto cell = "<key>00;Serving Cell</key><dict>" + entry("0;RSRP", "-90.00 dBm") + "<key>1;NR</key><dict>" +
                      entry("0;RSRP", "-80.00 dBm") + entry("1;Ec/Io", "-3 dB") + "</dict></dict>" +
                      "<key>01;Neighbor Cells</key><array><string>1</string><dict>" + entry("RSRP", "-99.00 dBm") +
                      entry("Cell", "1") + "</dict></array>";
    const auto ran =
        decode(kcap("<plist><dict><key>Position</key>" + node("2D", "1", "2") + "<key>00;Modem 1</key><dict>" + cell +
                    "</dict><key>01;Modem 2</key><dict>" + cell + "</dict></dict></plist>"));
    EXPECT_THAT(ran.output, HasSubstr(json("{'time':null,'technology':'kVoxLogChannelTechnology_IFX',"
                                           "'Modem 1/NR/Ec/Io (dB)':-3,'Modem 1/NR/RSRP (dBm)':-80,"
                                           "'Modem 1/RSRP (dBm)':-90,'Modem 2/NR/Ec/Io (dB)':-3,"
                                           "'Modem 2/NR/RSRP (dBm)':-80,'Modem 2/RSRP (dBm)':-90}}")));
}

TEST_F(GeojsonTest, ValuesThatAreGoneOrNotMeasuredAreLeftOut)
{
    const auto place = node("2D", "1", "2");
    const auto ran = decode(kcap(tree(entry("RSSI", "-60 dBm") + entry("Cell", "1") + entry("C1", ""), place)) +
                            kcap(tree(entry("Area", "7") + entry("Cell", "N/A"), place)));
    EXPECT_EQ(points(ran.output), 2u);
    EXPECT_THAT(ran.output,
                AllOf(HasSubstr(json("IFX','Cell':'1','RSSI (dBm)':-60}}")), HasSubstr(json("IFX','Area':'7'}}"))));
}

TEST_F(GeojsonTest, AChangeOfTheTechnologyLeavesNoOldValue)
{
    const auto ran = decode(kcap(here) + kcap(measured(100)) +
                            kcap(tree(entry("RSSI", "-60 dBm") + entry("Cell", "1"), node("2D", "1", "2"))));
    const auto last = ran.output.substr(ran.output.rfind("{\"type\":\"Feature\""));
    EXPECT_THAT(last, AllOf(HasSubstr(json("IFX','Cell':'1','RSSI (dBm)':-60}}")), Not(HasSubstr("RSRP"))));
}

TEST_F(GeojsonTest, HostileTextsStayTexts)
{
    const auto place = node("2D", "1", "2");
    const auto ran =
        decode(kcap(tree(entry("&quot;}],&#10;\\", "&quot;&lt;script&gt;\\&#9;") + entry("0;a", "1") +
                             entry("1;a", "2") + entry("time", "3") + entry("technology", "4") +
                             entry("speed (m/s)", "5") + entry("", "6") + entry("b", "1e308 dBm") +
                             entry("c", "inf dBm") + entry("d", "nan dB") + entry("e", std::string(400, '9') + " dB"),
                         place)));
    EXPECT_EQ(points(ran.output), 1u);
}

TEST_F(GeojsonTest, EndsItsCollectionAfterBadInputToo)
{
    const auto damaged = decode(kcap(here) + "\xFF\xFF\xFF\xFF" + kcap(measured(100)) + "\x40");
    EXPECT_EQ(damaged.status, 1);
    EXPECT_EQ(points(damaged.output), 1u);
    EXPECT_EQ(decode(kcap(here) + kcap(measured(100)), {"/no/such.kcap"}).status, 1);
    EXPECT_EQ(decode("").output, "{\"type\":\"FeatureCollection\",\"features\":[\n]}\n");
    EXPECT_EQ(decode(kcap(here)).status, 1) << "its technology is not known";

    writeFile(scratch / "snapshot", "<plist/>");
    const auto refused = decode(kcap(here) + kcap(measured(100)), {"--follow", scratch / "snapshot"});
    EXPECT_EQ(refused.status, 2);
    EXPECT_EQ(points(refused.output), 1u);
}

TEST_F(GeojsonTest, EndsItsCollectionWhenFollowingEnds)
{
    const auto file = scratch / "live.kcap";
    writeFile(file, kcap(here) + kcap(measured(100)));
    Tool tool({"--follow", "--format", "geojson", file});
    EXPECT_EQ(tool.line(), R"({"type":"FeatureCollection","features":[)");
    writeFile(file, kcap(measured(110)), std::ios::app);
    auto first = tool.line(); // complete when the next point begins
    EXPECT_THAT(first, EndsWith("}},"));
    tool.signal(SIGINT);
    EXPECT_TRUE(isCollection(R"({"type":"FeatureCollection","features":[)" + first + tool.output()));
    EXPECT_EQ(tool.status(), 0);
}

// The pipe carries far more than any buffer holds.
TEST_F(GeojsonTest, MemoryDoesNotGrowWithTheCapture)
{
    std::string piece, output;
    for (int i = 0; i < 4'000; ++i)
        piece += kcap(here) + kcap(measured(i % 250));
    Tool tool({"-", "--format", "geojson"});
    std::thread reader([&] { output = tool.output(); });
    const auto resident = [&] {
        const auto status = contentsOf("/proc/" + std::to_string(tool.process()) + "/status");
        return std::stol(status.substr(status.find("VmHWM:") + 6));
    };
    EXPECT_TRUE(tool.write(piece) && tool.write(piece));
    const auto before = resident();
    for (int i = 0; i < 10; ++i)
        EXPECT_TRUE(tool.write(piece));
    EXPECT_LE(resident(), before + 4'000) << "kilobytes, after six times as many messages";
    tool.closeInput();
    reader.join();
    EXPECT_EQ(points(output), 48'000u);
}

} // namespace
} // namespace kestrum::tools
