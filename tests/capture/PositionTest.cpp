#include "capture/PositionRecord.h"

#include "capture/Technology.h"
#include "doubles/MemoryPropertyLists.h"

#include <gtest/gtest.h>

namespace kestrum {
namespace {

using namespace std::chrono;

constexpr Date kMoment = sys_days(2026y / 11 / 16) + 6h + 5min + 42s + 250ms;
constexpr Position kBerlin{3, 52.5200066, -13.404954, 13.89, kMoment};

TEST(PositionNode, HasATextForEachValue)
{
    EXPECT_EQ(describe(positionNode(kBerlin)),
              R"({"Fix": "3D", "Latitude": "52.5200066", "Longitude": "-13.4049540", "Speed": "13.89 m/s", )"
              R"("Time": "2026-11-16T06:05:42.250Z"})");
    EXPECT_EQ(describe(positionNode(Position{2, 0, 0, {}, {}})),
              R"({"Fix": "2D", "Latitude": "0.0000000", "Longitude": "0.0000000", "Speed": "", "Time": ""})");
}

TEST(PositionNode, IsEmptyWithoutAPosition)
{
    EXPECT_EQ(describe(positionNode({})), R"({"Fix": "", "Latitude": "", "Longitude": "", "Speed": "", "Time": ""})");
    EXPECT_FALSE(positionIn(positionNode({})));
}

TEST(PositionNode, IsReadAsItWasWritten)
{
    for (const auto& each : {kBerlin, Position{2, -90, 180, {}, {}}, Position{3, 90, -180, 0, kMoment}})
        EXPECT_EQ(positionIn(positionNode(each)), each);
}

TEST(PositionNode, OfAnotherShapeHasNoPosition)
{
    for (const auto& value : {Value(), Value("52.5 13.4"), Value(52.5), Value(makeArray({"52.5", "13.4"})),
                              Value(makeDictionary()), Value(makeDictionary({{"Fix", "3D"}, {"Latitude", "52.5"}}))})
        EXPECT_FALSE(positionIn(value)) << value;
}

struct Case {
    const char* key;
    Value value;
};

TEST(PositionNode, WithNonsenseHasNoPosition)
{
    for (const auto& [key, value] :
         {Case{"Fix", "4D"}, Case{"Fix", ""}, Case{"Fix", 3}, Case{"Latitude", ""}, Case{"Latitude", "90.0000001"},
          Case{"Latitude", "-91"}, Case{"Latitude", "nan"}, Case{"Latitude", "inf"}, Case{"Latitude", "1e1"},
          Case{"Latitude", "52.5N"}, Case{"Latitude", " 52.5"}, Case{"Latitude", "52,5"}, Case{"Latitude", 52.5},
          Case{"Latitude", makeArray({"52.5"})}, Case{"Longitude", "180.5"}, Case{"Longitude", "-"}}) {
        const auto node = positionNode(kBerlin);
        node->set(key, value);
        EXPECT_FALSE(positionIn(node)) << key << ": " << value;
    }
}

TEST(PositionNode, WithANonsensicalSpeedOrTimeHasAPosition)
{
    for (const auto* speed : {"fast", "-1.00 m/s", "20000 m/s", "nan m/s", " m/s"}) {
        const auto node = positionNode(kBerlin);
        node->set("Speed", speed);
        node->set("Time", "yesterday");
        EXPECT_EQ(positionIn(node), (Position{3, kBerlin.latitude, kBerlin.longitude, {}, {}})) << speed;
    }
}

TEST(PositionRecord, IsARecordOfTheTelephonyService)
{
    MemoryPropertyLists lists;
    const auto record = positionRecord(kBerlin, 0x0123'4567'89AB'CDEF, lists);
    const auto read = ChannelMessage::read(record);
    ASSERT_TRUE(read);
    EXPECT_EQ(read->type, 0xFF);
    EXPECT_EQ(read->logCode, 0xFF8000u);
    EXPECT_EQ(read->timeStamp(), 0x0123'4567'89AB'CDEFu);
    EXPECT_EQ(read->record.read(u16(1)), record.size() - 1);
    EXPECT_EQ(positionIn(lists.parse(read->record.from(13)->bytes())), kBerlin);
    EXPECT_FALSE(technologyOf(record)) << "any modem's log may contain it";
}

} // namespace
} // namespace kestrum
