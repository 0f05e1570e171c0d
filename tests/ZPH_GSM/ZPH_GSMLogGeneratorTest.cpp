#include "LogGenerator/ZPH_GSM/ZPH_GSMLogGenerator.h"

#include "LogGenerator/ZPH_GSM/SimInfo.h"
#include "sections/SectionContracts.h"
#include "sections/TechnologyRun.h"

#include <gmock/gmock.h>
#include <gtest/gtest.h>

namespace kestrum {
namespace {

using testing::ElementsAre;
using testing::Pair;

struct GsmRun : TechnologyRun<ZPH_GSMLogGenerator> {
    GsmRun() : TechnologyRun("ZPH_GSM") {}

    void receiveList(LogCode code, const Value& list)
    {
        const auto header = record(code, 13);
        std::vector<std::byte> message(header.bytes().begin(), header.bytes().end());
        const auto xml = codec.toXml(list);
        message.insert(message.end(), xml->bytes().begin(), xml->bytes().end());
        receive(message);
    }
};

TEST(ZPH_GSMLogGenerator, IsOfItsTechnology)
{
    EXPECT_EQ(GsmRun().generator->technology(), "kVoxLogChannelTechnology_Zephra_GSM");
}

TEST(ZPH_GSMLogGenerator, LogsItsCreationInOrder)
{
    std::vector<RecordingLog::Line> expected = {{Priority::Error, "Creating ZPH_GSMLogGenerator object"}};
    for (const auto& contract : technology().sections)
        expected.emplace_back(Priority::Warning, "Array Count: " + std::to_string(contract.codes.size()));
    expected.emplace_back(Priority::Error, "Creating ZPHLogGenerator2 object with 0x0");
    expected.emplace_back(Priority::Warning, "Creating Log object: 0x0");
    expected.emplace_back(Priority::Error, "Class Index: 1");
    EXPECT_EQ(GsmRun().doubles.log.lines, expected);
}

TEST(ZPH_GSMLogGenerator, LogsItsDestructionTwiceAndItsIndexesPrintTheirs)
{
    GsmRun run;
    run.doubles.log.lines.clear();
    run.generator.reset();
    EXPECT_THAT(run.doubles.log.lines, ElementsAre(Pair(Priority::Warning, "ZPH_GSMLogGenerator is destructed 0x0"),
                                                   Pair(Priority::Warning, "ZPH_GSMLogGenerator is destructed 0x0")));
    EXPECT_THAT(run.doubles.console.printed, ElementsAre("Deallocing ZPH_GSMClassIndex", "Deallocing ClassIndex"));
}

TEST(ZPH_GSMLogGenerator, StartsTheModemWithTheCodesOfItsSectionsAndNoOthers)
{
    const auto command = GsmRun().generator->getStartCommand();
    EXPECT_EQ(command->at("SetState"), "Streaming");
    EXPECT_EQ(command->size(), 3u);
    const auto sorted = [&](std::string_view key) {
        std::vector<std::int32_t> codes;
        for (const auto list = command->at(key).array(); const auto& each : *list)
            codes.push_back(each.int32().value_or(-1));
        std::ranges::sort(codes);
        return codes;
    };
    EXPECT_THAT(sorted("SetZephraLogCodes"),
                ElementsAre(0x4005, 0x4031, 0x4116, 0x4125, 0x4127, 0x4157, 0x417A, 0x4221, 0x5072, 0x5076, 0x512C,
                            0x5134, 0x5137, 0x51F4, 0x51F5, 0x51F6, 0x51F8, 0x51FB, 0x51FD, 0x51FF, 0x7130, 0x7131,
                            0x7132, 0x7135, 0x7150));
    EXPECT_THAT(sorted("SetVoxExtraCodes"), ElementsAre(0, 1, 2));
}

/// The log lines of the sections that get a record of the code.
std::vector<std::string> calledBy(LogCode code)
{
    GsmRun run;
    run.receive(record(0x1234, 13).bytes());
    run.doubles.log.lines.clear();
    run.receive(record(code, 13).bytes());
    return run.doubles.log.texts(Priority::Warning);
}

TEST(ZPH_GSMLogGenerator, CallsTheSectionsOfOneCodeInTheOrderOfTheirCreation)
{
    EXPECT_THAT(calledBy(0x417A), ElementsAre("ActiveSet", "DetectedSet", "MonitoredSet", "VirtualActiveSet"));
    EXPECT_THAT(calledBy(0x4005), ElementsAre("GSMSet", "UMTSSet"));
    EXPECT_THAT(calledBy(0x5137), ElementsAre("GPRSInformation", "GSMServingCell", "NeighboringCells", "GSMRRInfo"));
    EXPECT_THAT(calledBy(0x7132), ElementsAre("ProcessPS", "ProcessCS", "Serving PLMN", "ProcessCS"));
    EXPECT_THAT(calledBy(0x7131), ElementsAre("ProcessCS", "ProcessCS"));
    EXPECT_THAT(calledBy(0x7135), ElementsAre("GPRSInformation", "Serving PLMN"));
    EXPECT_THAT(calledBy(0x51F6), ElementsAre("GPRSInformation", "GSMRRInfo"));
    EXPECT_THAT(calledBy(0xFF0001),
                ElementsAre("GSMServingCell", "NeighboringCells", "Serving PLMN", "UMTSSet", "UMTSRRInfo"));
}

TEST(ZPH_GSMLogGenerator, CallsTheOneSectionOfACode)
{
    const std::pair<LogCode, const char*> alone[] = {
        {0x51F5, "GPRSInformation"},  {0x51FB, "GPRSInformation"},      {0x51FD, "GPRSInformation"},
        {0x51F4, "GPRSInformation"},  {0x5134, "GSMServingCell"},       {0x5076, "GSMServingCell"},
        {0x51F8, "MobileAllocation"}, {0x51FF, "NeighboringCells"},     {0xFF0002, "PDPContextList"},
        {0x7130, "ProcessPS"},        {0x7150, "Equivalent PLMN List"}, {0x512C, "GSMRRInfo"},
        {0x5072, "GSMRRInfo"},        {0x4125, "UMTSRRInfo"},           {0x4031, "UMTSRRInfo"},
        {0x4127, "UMTSRRInfo"},       {0x4157, "UMTSRRInfo"},           {0x4116, "BLER"},
        {0x4221, "HSDPA Info"},
    };
    for (const auto& [code, word] : alone)
        EXPECT_THAT(calledBy(code), ElementsAre(word)) << code;
}

TEST(ZPH_GSMLogGenerator, PassesOnTheExceptionsOfTheSimSection)
{
    GsmRun run;
    EXPECT_THROW(run.receive(record(0xFF0000, 40).bytes()), LogCode_0xFF0000::UnknownDataException);
    EXPECT_EQ(run.doubles.log.count("SimInfo"), 1u);
    EXPECT_EQ(run.doubles.log.count("SIM File dictionary data could not be constructed"), 1u);
}

TEST(ZPH_GSMLogGenerator, IsNotChangedByACodeThatNoSectionWants)
{
    GsmRun run;
    run.receive(record(0x51F7, 64).bytes());
    const Value before = deepCopy(run.display());
    run.doubles.log.lines.clear();
    run.receive(record(0x51F7, 64).fill(13, 1).bytes());
    run.receive(record(0xFF0003, 64).bytes());
    EXPECT_EQ(run.display(), before);
    EXPECT_TRUE(run.doubles.log.lines.empty());
}

TEST(ZPH_GSMLogGenerator, UpdatesTheFourSetsOfTheSearcherByOneRecord)
{
    GsmRun run;
    run.receive(record(0x417A, 16 + 15 + 44).u8(15, 1).u16(23, 77).u32(16 + 15 + 32, 60000).bytes());
    EXPECT_EQ(describe(run.section("Active Set")),
              R"([{"Scrambling Code": "77", "RSCP": "-65 dB", "Energy Per Chip": "-10 dB"}])");
    EXPECT_EQ(describe(run.section("Detected Set")), "[]");
    EXPECT_EQ(describe(run.section("Monitored Set")), "[]");
    EXPECT_EQ(describe(run.section("Virtual Active Set")), "[]");
}

TEST(ZPH_GSMLogGenerator, ShowsOneCellMonitorRecordInAllItsSections)
{
    GsmRun run;
    run.receiveList(
        0xFF0001,
        makeArray({cell("GSM", "Serving",
                        {{"kVoxCell_MCC", 262},
                         {"kVoxCell_MNC", 2},
                         {"kVoxCell_LAC", 5000},
                         {"kVoxCell_CellId", 11},
                         {"kVoxCell_ARFCN", 62}}),
                   cell("GSM", "Neighbor", {{"kVoxCell_ARFCN", 63}, {"kVoxCell_RSSI", -40}}),
                   cell("UMTS", "Serving",
                        {{"kVoxCell_CellId", 12}, {"kVoxCell_UARFCN", 10700}, {"kVoxCell_ScramblingCode", 5}}),
                   cell("UMTS", "Neighbor",
                        {{"kVoxCell_UARFCN", 10713},
                         {"kVoxCell_ScramblingCode", 6},
                         {"kVoxCell_RSCP", -95},
                         {"kVoxCell_EcNo", -7}})}));
    EXPECT_TRUE(run.doubles.log.texts(Priority::Error).size() == 3) << "nothing but the lines of the creation";
    EXPECT_EQ(nodeNamed("Mobile Network Code", run.section("Serving PLMN")), "2");
    EXPECT_EQ(nodeNamed("Cell ID", run.section("GSM Serving Cell")), "11");
    EXPECT_EQ(nodeNamed("Cell ID", run.section("UMTS RR Info")), "12");
    EXPECT_EQ(describe(run.section("Neighboring Cells")), R"([{"ARFCN": "63", "RSSI": "-80 dBm"}])");
    EXPECT_EQ(describe(run.section("UMTS Set")),
              R"([{"UARFCN": "10713", "Scrambling Code": "6", "RSCP": "-95 dBm", "Energy Per Chip": "-7 dB"}])");
}

} // namespace
} // namespace kestrum
