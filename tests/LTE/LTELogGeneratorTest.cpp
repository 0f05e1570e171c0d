#include "LogGenerator/LTE/LTELogGenerator.h"

#include "sections/RecordBuilder.h"
#include "sections/TechnologyRun.h"

#include <gmock/gmock.h>
#include <gtest/gtest.h>

namespace kestrum {
namespace {

using testing::ElementsAre;
using testing::Pair;

struct LTERun : TechnologyRun<LTELogGenerator> {
    LTERun() : TechnologyRun("LTE") {}
};

TEST(LTELogGenerator, IsOfItsTechnology)
{
    EXPECT_EQ(LTERun().generator->technology(), "kVoxLogChannelTechnology_Zephra_LTE");
}

TEST(LTELogGenerator, LogsItsCreationInOrder)
{
    EXPECT_THAT(
        LTERun().doubles.log.lines,
        ElementsAre(Pair(Priority::Error, "Creating LTELogGenerator object"), Pair(Priority::Warning, "Array Count: 3"),
                    Pair(Priority::Warning, "Array Count: 1"), Pair(Priority::Warning, "Array Count: 1"),
                    Pair(Priority::Warning, "Array Count: 1"), Pair(Priority::Warning, "Array Count: 1"),
                    Pair(Priority::Warning, "Array Count: 1"), Pair(Priority::Warning, "Array Count: 1"),
                    Pair(Priority::Warning, "Array Count: 1"), Pair(Priority::Warning, "Array Count: 1"),
                    Pair(Priority::Warning, "Array Count: 1"), Pair(Priority::Warning, "Array Count: 1"),
                    Pair(Priority::Error, "Creating ZPHLogGenerator2 object with 0x0"),
                    Pair(Priority::Warning, "Creating Log object: 0x0"), Pair(Priority::Error, "Class Index: 1")));
}

TEST(LTELogGenerator, LogsItsDestructionAndItsIndexesPrintTheirs)
{
    LTERun run;
    run.doubles.log.lines.clear();
    run.generator.reset();
    EXPECT_THAT(run.doubles.log.lines, ElementsAre(Pair(Priority::Warning, "LTELogGenerator is destructed 0x0"),
                                                   Pair(Priority::Warning, "ZPH_GSMLogGenerator is destructed 0x0")));
    EXPECT_THAT(run.doubles.console.printed, ElementsAre("Deallocing LTEClassIndex", "Deallocing ClassIndex"));
}

TEST(LTELogGenerator, StartsTheModemWithTheCodesOfItsSections)
{
    EXPECT_EQ(describe(LTERun().generator->getStartCommand()),
              R"({"SetState": "Streaming", "SetZephraLogCodes": [45249, 45250, 45433, 45439, 45440, 45446], )"
              R"("SetVoxExtraCodes": [0, 1, 2]})");
}

/// The lines that the sections log for a record of the code.
std::vector<std::string> calledBy(LogCode code)
{
    LTERun run;
    run.receive(record(code, 13).bytes());
    run.doubles.log.lines.clear();
    run.receive(record(code, 13).bytes());
    return run.doubles.log.texts(Priority::Warning);
}

TEST(LTELogGenerator, CallsTheSectionsOfOneCodeInTheirOrder)
{
    EXPECT_THAT(calledBy(0xB179), ElementsAre("Connected mode LTE Intra-frequency Measurement",
                                              "Measured Neighbor Cells", "Detected Cells"));
    EXPECT_THAT(calledBy(0xB180), ElementsAre("Neighbor Measurements", "Neighbor Cells List"));
    EXPECT_THAT(calledBy(0xB186), ElementsAre("Reselection Candidates", "Reselection Candidates List"));
}

TEST(LTELogGenerator, CallsTheOneSectionOfACode)
{
    EXPECT_THAT(calledBy(0xB0C1), ElementsAre("LTE Serving Cell Info"));
    EXPECT_THAT(calledBy(0xB0C2), ElementsAre("LTE Serving Cell Info"));
    EXPECT_THAT(calledBy(0xFF0001), ElementsAre("LTE Serving Cell Info"));
    EXPECT_THAT(calledBy(0xB17F), ElementsAre("Serving Cell Measurements"));
    EXPECT_THAT(calledBy(0xFF0002), ElementsAre("PDPContextList"));
}

TEST(LTELogGenerator, CallsNoSectionForACodeThatNoneWants)
{
    EXPECT_THAT(calledBy(0xB17E), ElementsAre());
    EXPECT_THAT(calledBy(0xFF0003), ElementsAre());
}

TEST(LTELogGenerator, FillsTheDisplayOfItsTemplate)
{
    LTERun run;
    run.receive(record(0xB179, 37).u16(17, 1575).u8(27, 1).u8(28, 1).u16(29, 8).u16(35, 9).bytes());
    EXPECT_EQ(nodeNamed("E-ARFCN", run.section("Connected mode LTE Intra-frequency Measurement")), "1575");
    EXPECT_EQ(describe(run.section("Measured Neighbor Cells")),
              R"([{"Physical Cell ID": "8", "Filtered RSRP": "-140.00 dBm", "Filtered RSRQ": "-20.00 dB"}])");
    EXPECT_EQ(describe(run.section("Detected Cells")), R"([{"Physical Cell ID": "9"}])");
}

TEST(LTELogGenerator, ShowsSimFilesAndPdpContextsAsTheyAreSent)
{
    LTERun run;
    const auto receive = [&run](LogCode code, const Value& list) {
        const auto header = record(code, 13);
        std::vector<std::byte> message(header.bytes().begin(), header.bytes().end());
        const auto xml = run.codec.toXml(list);
        message.insert(message.end(), xml->bytes().begin(), xml->bytes().end());
        run.receive(message);
    };
    receive(0xFF0000, makeDictionary({{"kSimFile_ICCID", "8944"}}));
    receive(0xFF0002, makeArray({makeDictionary({{"APN", "internet"}})}));
    EXPECT_EQ(nodeNamed("EF-ICCID", run.section("SIM Info")), "8944");
    EXPECT_EQ(nodeNamed("EF-LOCI", run.section("SIM Info")), "");
    EXPECT_EQ(describe(run.section("PDP Context Info")), R"([{"APN": "internet"}])");
}

} // namespace
} // namespace kestrum
