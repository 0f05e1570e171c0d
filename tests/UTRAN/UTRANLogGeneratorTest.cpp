#include "LogGenerator/UTRAN/UTRANLogGenerator.h"

#include "doubles/DecodingDoubles.h"
#include "sections/RecordBuilder.h"
#include "sections/TechnologyRun.h"

#include <gmock/gmock.h>
#include <gtest/gtest.h>

namespace kestrum {
namespace {

using testing::ElementsAre;
using testing::IsEmpty;
using testing::Pair;

struct UTRANRun : TechnologyRun<UTRANLogGenerator> {
    UTRANRun() : TechnologyRun("UTRAN") {}
};

TEST(UTRANLogGenerator, IsOfItsTechnology)
{
    EXPECT_EQ(UTRANRun().generator->technology(), "kVoxLogChannelTechnology_Zephra_UTRAN2");
}

TEST(UTRANLogGenerator, LogsItsCreationLast)
{
    EXPECT_THAT(UTRANRun().doubles.log.lines,
                ElementsAre(Pair(Priority::Warning, "Array Count: 1"), Pair(Priority::Warning, "Array Count: 2"),
                            Pair(Priority::Warning, "Array Count: 1"), Pair(Priority::Warning, "Array Count: 1"),
                            Pair(Priority::Warning, "Array Count: 1"), Pair(Priority::Warning, "Array Count: 1"),
                            Pair(Priority::Warning, "Array Count: 1"), Pair(Priority::Warning, "Array Count: 1"),
                            Pair(Priority::Error, "Creating ZPHLogGenerator2 object with 0x0"),
                            Pair(Priority::Warning, "Creating Log object: 0x0"),
                            Pair(Priority::Error, "Class Index: 1"),
                            Pair(Priority::Error, "Created UTRANLogGenerator object")));
}

TEST(UTRANLogGenerator, IsDestroyedWithTheInheritedLinesAlone)
{
    UTRANRun run;
    run.doubles.log.lines.clear();
    run.generator.reset();
    EXPECT_THAT(run.doubles.log.lines, ElementsAre(Pair(Priority::Warning, "ZPH_GSMLogGenerator is destructed 0x0")));
    EXPECT_THAT(run.doubles.console.printed, ElementsAre("Deallocing ClassIndex"));
}

TEST(UTRANLogGenerator, StartsTheModemWithTheCodesOfItsSections)
{
    EXPECT_EQ(describe(UTRANRun().generator->getStartCommand()),
              R"({"SetState": "Streaming", "SetZephraLogCodes": [53258, 53260, 53262, 53472, 53474], )"
              R"("SetVoxExtraCodes": [0, 1, 2]})");
}

TEST(UTRANLogGenerator, CallsBothSectionsOf0xD00CInTheirOrder)
{
    UTRANRun run;
    run.receive(record(0xD00C, 13).bytes());
    run.doubles.log.lines.clear();
    run.receive(record(0xD00C, 13).bytes());
    EXPECT_THAT(run.doubles.log.lines, ElementsAre(Pair(Priority::Notice, "TRCH BLER Measurement"),
                                                   Pair(Priority::Warning, "CCTRCH SIR Measurement")));
}

TEST(UTRANLogGenerator, FillsTheDisplayOfItsTemplate)
{
    UTRANRun run;
    run.receive(record(0xD0E0, 15).u8(13, 1).u8(14, 3).bytes());
    run.receive(record(0xD0E2, 26).u16(19, 10700).bytes());
    EXPECT_EQ(describe(run.section("RRC Info")), R"({"State": "Cell DCH"})");
    EXPECT_EQ(nodeNamed("Downlink UARFCN", run.section("Serving Cell Info")), "10700");
}

/// The template that a generator loads when the bundle has these resources. The display is made from it.
Value displayFrom(std::vector<std::string> paths, const std::string& expected)
{
    DecodingDoubles doubles;
    doubles.bundle.paths = std::move(paths);
    doubles.propertyLists.files[expected] = makeDictionary({{"From", expected}});
    const auto generator = UTRANLogGenerator::generator(doubles.roles);
    State state;
    generator->updateState(state, record(0xD0E0, 15).bytes());
    return nodeNamed("From", state.at("Display"));
}

TEST(UTRANLogGenerator, FindsItsTemplateWhateverTheCaseOfItsName)
{
    EXPECT_EQ(displayFrom({"LTE.plist", "display-utran-v2.plist"}, "display-utran-v2.plist"), "display-utran-v2.plist");
    EXPECT_EQ(displayFrom({"/b/UtRaN.plist"}, "/b/UtRaN.plist"), "/b/UtRaN.plist");
}

TEST(UTRANLogGenerator, TakesTheFirstOfSeveralTemplates)
{
    EXPECT_EQ(displayFrom({"/b/LTE.plist", "/b/my.UTRAN.plist", "/b/UTRAN.plist"}, "/b/my.UTRAN.plist"),
              "/b/my.UTRAN.plist");
}

TEST(UTRANLogGenerator, LooksAtTheFileNameNotAtItsFolder)
{
    EXPECT_EQ(displayFrom({"/utran/LTE.plist", "/utran/UTRAN.plist"}, "/utran/UTRAN.plist"), "/utran/UTRAN.plist");
}

class UTRANWithoutTemplate : public testing::TestWithParam<std::vector<std::string>> {
protected:
    UTRANWithoutTemplate()
    {
        doubles.bundle.paths = GetParam();
        generator = UTRANLogGenerator::generator(doubles.roles);
    }

    DecodingDoubles doubles;
    std::unique_ptr<UTRANLogGenerator> generator;
    State state;
};

TEST_P(UTRANWithoutTemplate, IsThereAndLogsNothing)
{
    ASSERT_NE(generator, nullptr);
    EXPECT_THAT(doubles.log.lines, IsEmpty());
    EXPECT_EQ(generator->technology(), "kVoxLogChannelTechnology_Zephra_UTRAN2");
}

TEST_P(UTRANWithoutTemplate, TakesMessagesWithoutHarm)
{
    for (const LogCode code : {0xD0E0u, 0xD0E2u, 0xD00Au, 0xFF0000u, 0xFF0001u, 0xFF0002u})
        generator->updateState(state, record(code, 40).bytes());
    generator->updateState(state, {});
    generator->updateWithData(record(0xD0E0, 15).bytes());
    EXPECT_TRUE(state.at("Display").isNull());
}

TEST_P(UTRANWithoutTemplate, ShowsNothingAndKeepsTheRawMessages)
{
    generator->updateState(state, record(0xD0E0, 15).bytes());
    EXPECT_TRUE(generator->generateLogUsingState(state).isNull());
    EXPECT_TRUE(generator->getDisplayFromState(state).isNull());
    ASSERT_NE(state.at("DisplayState").data(), nullptr);
    EXPECT_EQ(state.at("DisplayState").data()->size(), 15u);
}

TEST_P(UTRANWithoutTemplate, StartsTheModemWithoutAnyCode)
{
    EXPECT_EQ(describe(generator->getStartCommand()),
              R"({"SetState": "Streaming", "SetZephraLogCodes": [], "SetVoxExtraCodes": []})");
}

TEST_P(UTRANWithoutTemplate, SavesAndProcessesTemplatesWithoutHarm)
{
    generator->generateLogUsingState(state);
    EXPECT_NE(generator->getSaveContentsFromState(state), nullptr);
    EXPECT_TRUE(generator->generateDlfFromState(state).has_value());
    const Value node = makeDictionary({{"RRC Info", makeDictionary()}});
    EXPECT_EQ(generator->processTemplate(node), node);
    generator->printDict(node);
}

TEST_P(UTRANWithoutTemplate, IsDestroyedWithTheInheritedLine)
{
    generator.reset();
    EXPECT_THAT(doubles.log.lines, ElementsAre(Pair(Priority::Warning, "ZPH_GSMLogGenerator is destructed 0x0")));
    EXPECT_THAT(doubles.console.printed, IsEmpty());
}

INSTANTIATE_TEST_SUITE_P(UTRANLogGenerator, UTRANWithoutTemplate,
                         testing::Values(std::vector<std::string>{},
                                         std::vector<std::string>{"/b/LTE.plist", "/b/ZPH_GSM.plist"},
                                         std::vector<std::string>{"/b/UTRAN.png"}));

} // namespace
} // namespace kestrum
