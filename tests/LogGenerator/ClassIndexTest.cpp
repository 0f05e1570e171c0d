#include "LogGenerator/Sections.h"

#include <gmock/gmock.h>

namespace kestrum {
namespace {

using testing::ElementsAre;

class ClassIndexOf : public testing::Test {
protected:
    SampleDoubles doubles;
    std::unique_ptr<ClassIndex> index = std::make_unique<sample::Index>(doubles.roles);
};

TEST_F(ClassIndexOf, SectionsAreFoundByName)
{
    EXPECT_EQ(index->getClass("Neighbors")->getSectionName(), "Neighbors");
    EXPECT_EQ(index->getClass("Cell")->getSectionName(), "Cell");
    EXPECT_EQ(index->getClass("cell"), nullptr);
    EXPECT_EQ(index->getClass(""), nullptr);
}

TEST_F(ClassIndexOf, CodeOfTwoSectionsHasThemInTheirOrder)
{
    const auto* subscribers = index->getSubscribers(0x4001);
    ASSERT_NE(subscribers, nullptr);
    EXPECT_THAT(*subscribers, ElementsAre(index->getClass("Cell"), index->getClass("Neighbors")));
}

TEST_F(ClassIndexOf, UnregisteredCodeHasNoSubscribers)
{
    EXPECT_EQ(index->getSubscribers(0x4004), nullptr);
    EXPECT_EQ(index->getSubscribers(2), nullptr); // an extra code is registered only under its number plus 0xFF0000
    EXPECT_NE(index->getSubscribers(0xFF0002), nullptr);
}

TEST_F(ClassIndexOf, AllCodesAreDecimalTexts)
{
    EXPECT_THAT(index->getAllLogCodes(), ElementsAre("16385", "16386", "16387", "16711682"));
}

TEST_F(ClassIndexOf, StatusSaysWhatTheRegistryIs)
{
    doubles.log.lines.clear();
    index->status();
    EXPECT_THAT(doubles.log.lines, ElementsAre(RecordingLog::Line(Priority::Warning, "Dictionary = 1"),
                                               RecordingLog::Line(Priority::Warning, "String = 0")));
}

TEST_F(ClassIndexOf, EndIsPrinted)
{
    EXPECT_TRUE(doubles.console.printed.empty());
    index.reset();
    EXPECT_THAT(doubles.console.printed, ElementsAre("Deallocing ClassIndex"));
}

} // namespace
} // namespace kestrum
