#include "C2K/C2KRun.h"

#include <ostream>

namespace kestrum {
namespace {

RecordBuilder identity(std::size_t length = 186)
{
    return record(0x134F, length).u8(13, 2).u32(46, 2);
}

TEST(SystemIdentity, ShowsEveryField)
{
    C2KRun run;
    run.receive(identity().u32(42, 1).u16(50, 4139).u16(52, 65535).u8(131, 7).u8(133, 6).u16(184, 51234));
    EXPECT_EQ(run.at("k1xRoamingHome"), Value("ON [1]"));
    EXPECT_EQ(run.at("kSystemId"), Value("4139"));
    EXPECT_EQ(run.at("kNetworkId"), Value("65535"));
    EXPECT_EQ(run.at("kPacketZoneId"), Value("7"));
    EXPECT_EQ(run.at("kBaseId"), Value("51234"));
    EXPECT_EQ(run.at("kProtocolRevision"), Value("6"));
}

TEST(SystemIdentity, ShowsTheTypeOfAnUnknownSystemForBothIdentifiers)
{
    C2KRun run;
    run.receive(identity().u32(46, 1).u16(50, 4139));
    EXPECT_EQ(run.at("kSystemId"), Value("(unknown system type 1)"));
    EXPECT_EQ(run.at("kNetworkId"), Value("(unknown system type 1)"));
}

TEST(SystemIdentity, KeepsTheBaseStationThatAShortRecordLacks)
{
    C2KRun run;
    run.receive(identity().u16(184, 51234));
    for (const std::size_t length : {std::size_t{171}, std::size_t{185}}) {
        run.receive(identity(length).u8(131, static_cast<unsigned>(length - 100)));
        EXPECT_EQ(run.at("kBaseId"), Value("51234"));
        EXPECT_EQ(run.at("kPacketZoneId"), Value(std::to_string(length - 100)));
    }
}

TEST(SystemIdentity, IsUnchangedByAShortRecord)
{
    C2KRun run;
    run.receive(record(0x134F, 170).u8(13, 2).u8(131, 9));
    EXPECT_EQ(run.at("kPacketZoneId"), Value(""));
    EXPECT_EQ(run.doubles.log.errors(),
              std::vector<std::string>{"Log code 0x134f is 170 bytes long but must be at least 171 bytes."});
}

TEST(SystemIdentity, IsUnchangedByAnOldVersion)
{
    C2KRun run;
    run.receive(identity().u8(13, 1).u8(131, 9));
    EXPECT_EQ(run.at("kPacketZoneId"), Value(""));
    EXPECT_EQ(run.doubles.log.errors(),
              std::vector<std::string>{"Log code 0x134f has version=1; only version 2 or higher expected; dropping."});
}

struct Case {
    const char* name;
    std::uint32_t raw;
    const char* text;

    friend void PrintTo(const Case& shown, std::ostream* out) { *out << shown.name; }
};

class RoamingIndicator : public testing::TestWithParam<Case> {};

TEST_P(RoamingIndicator, IsNamed)
{
    EXPECT_EQ(C2KRun().receive(identity().u32(42, GetParam().raw)).at("k1xRoamingHome"), Value(GetParam().text));
}

INSTANTIATE_TEST_SUITE_P(
    Names, RoamingIndicator,
    testing::Values(Case{"Off", 0, "OFF [0]"}, Case{"On", 1, "ON [1]"}, Case{"Flashing", 2, "Flashing [2]"},
                    Case{"OutOfNeighborhood", 3, "Out of Neighborhood [3]"},
                    Case{"OutOfBuilding", 4, "Out of Building [4]"}, Case{"Preferred", 5, "Preferred system [5]"},
                    Case{"Available", 6, "Available system [6]"}, Case{"Alliance", 7, "Alliance partner [7]"},
                    Case{"Premium", 8, "Premium partner [8]"}, Case{"Full", 9, "Full service functionality [9]"},
                    Case{"Partial", 10, "Partial service functionality [10]"}, Case{"BannerOn", 11, "Banner ON [11]"},
                    Case{"BannerOff", 12, "Banner OFF [12]"}, Case{"FirstWithoutName", 13, "ERI - 13"},
                    Case{"MinusOne", 0xFFFFFFFF, "ERI - -1"}),
    [](const auto& each) { return std::string(each.param.name); });

} // namespace
} // namespace kestrum
