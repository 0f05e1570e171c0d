#include "insight/MeaningSheet.h"

#include "insight/Thresholds.h"
#include "insight/keys/KeyEntry.h"
#include "platform/TelephonyService.h"

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <string>
#include <vector>

namespace kestrum {
namespace {

using testing::Contains;
using testing::ElementsAre;
using testing::HasSubstr;
using testing::IsEmpty;

constexpr std::string_view kMeasurements = "/Serving Cell/Serving Cell Measurements";

Shown shownOf(const Value& display)
{
    PathDictionary paths;
    return {kVoxLogChannelTechnology_Zephra_LTE, KestrumModelNode::makeTreeFromObject(display, paths)};
}

Shown measurements(std::initializer_list<Dictionary::Entry> values)
{
    return shownOf(
        makeDictionary({{"Serving Cell", makeDictionary({{"Serving Cell Measurements", makeDictionary(values)}})}}));
}

class MeaningSheetTest : public testing::Test {
protected:
    MeaningSheet open(const Shown& shown, std::size_t row, std::string_view path = kMeasurements) const
    {
        return {shown, {std::string(path), row}, thresholds};
    }
    static std::vector<std::string> facts(const MeaningSheet& sheet)
    {
        std::vector<std::string> all;
        for (const auto& each : sheet.contents().parts.at(0).facts)
            all.push_back(each.heading + ": " + each.value.text);
        return all;
    }

    const Thresholds thresholds;
};

TEST_F(MeaningSheetTest, SaysWhatAKeyMeansAndHowGoodItsValueIs)
{
    const auto sheet = open(measurements({{"E-ARFCN", "6300"}, {"Measured RSRP", "-98.25 dBm"}}), 1);
    EXPECT_EQ(sheet.contents().title, "Measured RSRP");
    const auto& part = sheet.contents().parts.at(0);
    EXPECT_EQ(part.lines.at(0),
              keyEntryAt(kVoxLogChannelTechnology_Zephra_LTE, std::string(kMeasurements) + "/Measured RSRP")->meaning);
    EXPECT_THAT(part.lines, Contains(HasSubstr("This value: fair")));
    EXPECT_THAT(part.lines, Contains(HasSubstr("Standard: 3GPP")));
    EXPECT_THAT(facts(sheet), ElementsAre("Value: -98.25 dBm", "Section: Serving Cell Measurements"));
    EXPECT_EQ(part.facts[0].value.word, "fair");
    EXPECT_TRUE(part.facts[0].value.bar);
}

TEST_F(MeaningSheetTest, DerivedValuesAreFacts)
{
    const auto sheet = open(measurements({{"E-ARFCN", "6300"}}), 0);
    EXPECT_THAT(facts(sheet), Contains("Downlink: 806 MHz"));
    EXPECT_THAT(sheet.contents().parts[0].lines, testing::Not(Contains(HasSubstr("806"))));
}

TEST_F(MeaningSheetTest, FollowsItsKeyWhenRowsComeAndGo)
{
    auto sheet = open(measurements({{"Measured RSRP", "-98.25 dBm"}}), 0);
    sheet.update(measurements({{"E-ARFCN", "6300"}, {"Measured RSRP", "-70.00 dBm"}}));
    EXPECT_EQ(facts(sheet).at(0), "Value: -70.00 dBm");
    sheet.update(measurements({{"E-ARFCN", "6300"}}));
    EXPECT_EQ(facts(sheet).at(0), "Value: -70.00 dBm") << "what was seen last stays";
    sheet.update({});
    EXPECT_EQ(sheet.contents().title, "Measured RSRP");
}

TEST_F(MeaningSheetTest, AnUnknownKeyHasOneSentence)
{
    const auto sheet = open(shownOf(makeDictionary({{"Vendor Word", "17"}, {"b", "c"}})), 0, "/");
    EXPECT_THAT(sheet.contents().parts.at(0).lines, ElementsAre("The program has no explanation of this key."));
    EXPECT_EQ(facts(sheet).at(0), "Value: 17");
}

TEST_F(MeaningSheetTest, ARowThatOpensAPaneHasTheMeaningOfItsSection)
{
    const auto shown = measurements({{"E-ARFCN", "6300"}});
    const auto sheet = open(shown, 0, "/Serving Cell");
    EXPECT_EQ(sheet.contents().title, "Serving Cell Measurements");
    EXPECT_THAT(sheet.contents().parts.at(0).lines,
                ElementsAre(std::string(
                    sectionEntry(kVoxLogChannelTechnology_Zephra_LTE, "Serving Cell Measurements")->meaning)));
    EXPECT_THAT(sheet.contents().parts[0].facts, IsEmpty());
}

TEST_F(MeaningSheetTest, ARowThatIsNotThereIsAHint)
{
    const auto sheet = open(measurements({}), 5);
    EXPECT_THAT(sheet.contents().parts, IsEmpty());
    EXPECT_NE(sheet.contents().hint, "");
}

} // namespace
} // namespace kestrum
