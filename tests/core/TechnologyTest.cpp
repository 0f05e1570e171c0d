// The modem's technology changes, or stays the same, after a restart of the service.
#include "LogGenerator/C2K/C2KLogGenerator.h"
#include "LogGenerator/GSM/GSMLogGenerator.h"
#include "LogGenerator/LTE/LTELogGenerator.h"
#include "LogGenerator/UTRAN/UTRANLogGenerator.h"
#include "LogGenerator/ZPH_GSM/ZPH_GSMLogGenerator.h"
#include "core/Monitor.h"

#include <typeinfo>

namespace kestrum {
namespace {

using testing::Contains;
using testing::ElementsAre;
using testing::Not;

class Technology : public Monitor {
protected:
    Technology()
    {
        bundle.paths = {"LTE.plist"};
        propertyLists.files["LTE.plist"] = makeDictionary({{"About", "LTE cells"}});
    }

    void restartWith(std::string_view name)
    {
        modemRuns(name);
        model->restartMonitor();
        queue.run();
    }
};

TEST_F(Technology, SameAgainKeepsTheDisplayOnScreen)
{
    startRunning();
    stream(makeDictionary({{"RAT", "GSM"}, {"Cell", "17"}}));
    seconds(2);
    const auto tree = model->topLevelNodes();
    told.clear();

    restartWith("kVoxLogChannelTechnology_IFX");
    EXPECT_THAT(told, ElementsAre("status"));
    EXPECT_EQ(model->topLevelNodes(), tree);
}

TEST_F(Technology, AnotherThanTheDisplaysReplacesIt)
{
    startRunning();
    stream(makeDictionary({{"RAT", "GSM"}, {"Cell", "17"}}));
    seconds(2);
    ASSERT_EQ(textAt("/RAT"), "GSM");
    told.clear();

    restartWith("kVoxLogChannelTechnology_Zephra_LTE");
    EXPECT_THAT(told, ElementsAre("replaced", "status"));
    EXPECT_EQ(textAt("/RAT"), "(no node)");

    // The call that creates the new display shows nothing yet. The call after the first record does.
    EXPECT_EQ(textAt("/"), "(unknown)");
    model->updateWithData(bytesOf("a message"));
    seconds(2);
    EXPECT_EQ(textAt("/About"), "LTE cells");
}

TEST_F(Technology, ReplacedDisplayLeavesItsHistory)
{
    startRunning();
    stream(makeDictionary({{"RAT", "GSM"}, {"Cell", "17"}}));
    seconds(2);
    model->topLevelNodes();

    restartWith("kVoxLogChannelTechnology_Zephra_LTE");
    const auto history = model->getSaveContents();
    EXPECT_EQ((*history)[0].dictionary()->at("Display").dictionary()->at("RAT"), Value("GSM"));
}

TEST_F(Technology, BackToObjectsReplacesTheTemplatesDisplay)
{
    modemRuns("kVoxLogChannelTechnology_Zephra_LTE");
    startRunning();
    model->updateWithData(bytesOf("a message"));
    seconds(2);
    ASSERT_EQ(textAt("/About"), "LTE cells");
    told.clear();

    restartWith("kVoxLogChannelTechnology_IFX");
    EXPECT_THAT(told, ElementsAre("replaced", "status"));
    EXPECT_EQ(textAt("/About"), "(no node)");
    stream(makeDictionary({{"RAT", "GSM"}, {"Cell", "17"}}));
    seconds(2);
    EXPECT_EQ(textAt("/RAT"), "GSM");
}

TEST_F(Technology, ChangeBeforeAnythingWasShownReplacesNothing)
{
    startRunning();
    restartWith("kVoxLogChannelTechnology_Zephra_LTE");
    EXPECT_THAT(told, Not(Contains("replaced")));
}

// The generator of each technology.

struct Known {
    const char* identifier;
    bool (*isItsGenerator)(const LogGenerator&);

    friend void PrintTo(const Known& shown, std::ostream* out) { *out << shown.identifier; }
};

template <typename Generator>
bool is(const LogGenerator& generator)
{
    return typeid(generator) == typeid(Generator);
}

class TechnologyIdentifier : public testing::TestWithParam<Known>, protected DecodingDoubles {};

TEST_P(TechnologyIdentifier, ChoosesItsGenerator)
{
    const auto generator = LogGenerator::generatorFromTechnology(GetParam().identifier, roles);
    ASSERT_TRUE(generator);
    EXPECT_TRUE(GetParam().isItsGenerator(*generator));
    EXPECT_EQ(generator->technology(), GetParam().identifier);
}

TEST_P(TechnologyIdentifier, ItsGeneratorNamesItselfInItsLines)
{
    log.showsAddresses = true;
    bundle.paths = {"UTRAN.plist"}; // without UTRAN.plist that generator is not initialised
    auto generator = LogGenerator::generatorFromTechnology(GetParam().identifier, roles);
    const auto address = formatted("%p", static_cast<const void*>(generator.get()));
    EXPECT_EQ(log.count("Creating Log object: " + address), 1u);
    State state;
    try {
        generator->updateState(state, bytesOf("neither a record nor a list"));
    } catch (const std::exception& failure) {
        EXPECT_THAT(failure.what(), testing::HasSubstr("<GSMLogGenerator: " + address + ">"));
    }
    log.lines.clear();
    generator.reset();
    for (const auto& [priority, text] : log.lines) {
        if (text.find("is destructed") != text.npos) {
            EXPECT_THAT(text, testing::EndsWith("LogGenerator is destructed " + address));
        }
    }
}

INSTANTIATE_TEST_SUITE_P(OfEach, TechnologyIdentifier,
                         testing::Values(Known{"kVoxLogChannelTechnology_IFX", is<GSMLogGenerator>},
                                         Known{"kVoxLogChannelTechnology_Zephra_GSM", is<ZPH_GSMLogGenerator>},
                                         Known{"kVoxLogChannelTechnology_Zephra_CDMA", is<C2KLogGenerator>},
                                         Known{"kVoxLogChannelTechnology_Zephra_LTE", is<LTELogGenerator>},
                                         Known{"kVoxLogChannelTechnology_Zephra_UTRAN2", is<UTRANLogGenerator>}),
                         [](const auto& each) {
                             return std::string(each.param.identifier).substr(sizeof "kVoxLogChannelTechnology");
                         });

TEST_F(Technology, UnknownOnesHaveNoGenerator)
{
    for (const Value& each : {Value("kVoxLogChannelTechnology_Zephra_NR"), Value("kvoxlogchanneltechnology_ifx"),
                              Value(""), Value(3), Value(), Value(makeDictionary())})
        EXPECT_FALSE(LogGenerator::generatorFromTechnology(each, roles)) << describe(each);
}

// An exception in a decoder ends only its message.

TEST_F(Technology, SimFilesThatCannotBeReadEndTheirMessageAlone)
{
    using namespace std::string_view_literals;
    bundle.paths = {"ZPH_GSM.plist"};
    propertyLists.files["ZPH_GSM.plist"] = makeDictionary({{"SIM Info", makeDictionary()}});
    modemRuns("kVoxLogChannelTechnology_Zephra_GSM");
    startRunning();
    const auto message = [](std::string_view list) {
        std::string bytes("\xFF\0\0\0\0\0\0\0\0\0\0\0\0"sv);
        bytes[1] = static_cast<char>(12 + list.size());
        return bytes.append(list);
    };
    model->updateWithData(bytesOf(message("no list")));
    EXPECT_THAT(log.errors(), ElementsAre("SIM File dictionary data could not be constructed",
                                          "LogCode_0xFF0000::UnknownDataException"));

    propertyLists.parsed["a list"] = makeDictionary({{"kSimFile_ICCID", "8949"}});
    model->updateWithData(bytesOf(message("a list")));
    seconds(2);
    EXPECT_THAT(told, ElementsAre("update"));
    EXPECT_EQ(textAt("/SIM Info/EF-ICCID"), "8949");
}

} // namespace
} // namespace kestrum
