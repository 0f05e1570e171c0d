#include "capture/Technology.h"
#include "platform/ChannelMessage.h"
#include "platform/TelephonyService.h"

#include <gtest/gtest.h>

#include <string>

namespace kestrum {
namespace {

using namespace std::string_literals;

TEST(ChannelRecords, HaveTheirCodeAndTimeStampBehindTheType)
{
    const auto record = channelRecord(bytesOf("\x01\x0C\0\xC2\xB0\x08\x07\x06\x05\x04\x03\x02\x01"s));
    ASSERT_TRUE(record);
    EXPECT_EQ(record->code, 0xB0C2u);
    EXPECT_EQ(record->timeStamp, 0x0102030405060708u);
}

TEST(ChannelRecords, OfTheServiceHaveExtraCodes)
{
    EXPECT_EQ(channelRecord(bytesOf("\xFF\x0C\0\x02\0........"s))->code, 0xFF0002u);
}

TEST(ChannelRecords, AreReadBehindAPrefix)
{
    EXPECT_EQ(channelRecord(bytesOf("\x81\xAA\x01\x0C\0\xC2\xB0........"s))->code, 0xB0C2u);
}

TEST(ChannelRecords, ExcludeShortMessagesAndOtherTypes)
{
    EXPECT_FALSE(channelRecord({}));
    EXPECT_FALSE(channelRecord(bytesOf("\x81"s)));
    EXPECT_FALSE(channelRecord(bytesOf("\x01\x0C\0\xC2\xB0......."s))) << "12 bytes";
    EXPECT_FALSE(channelRecord(bytesOf("\x81\xAA\x01\x0C\0\xC2\xB0......."s)));
    EXPECT_FALSE(channelRecord(bytesOf("\x02\x0C\0\xC2\xB0........"s)));
    EXPECT_FALSE(channelRecord(bytesOf("<?xml version=\"1.0\"?>")));
}

struct Told {
    const char* name;
    std::string message;
    std::string_view technology;

    friend void PrintTo(const Told& shown, std::ostream* out) { *out << shown.name; }
};

class Technology : public testing::TestWithParam<Told> {};

TEST_P(Technology, IsFoundInTheMessage)
{
    EXPECT_EQ(technologyOf(bytesOf(GetParam().message)).value_or("none"), GetParam().technology);
}

std::string record(const char* code)
{
    return "\x01\x0C\0"s + code + "........";
}

INSTANTIATE_TEST_SUITE_P(
    Messages, Technology,
    testing::Values(Told{"Cdma", record("\x83\x11"), "kVoxLogChannelTechnology_Zephra_CDMA"},
                    Told{"Umts", record("\x7A\x41"), "kVoxLogChannelTechnology_Zephra_GSM"},
                    Told{"Gsm", record("\x34\x51"), "kVoxLogChannelTechnology_Zephra_GSM"},
                    Told{"NonAccessStratum", record("\x35\x71"), "kVoxLogChannelTechnology_Zephra_GSM"},
                    Told{"Lte", record("\x79\xB1"), "kVoxLogChannelTechnology_Zephra_LTE"},
                    Told{"Utran", record("\xE0\xD0"), "kVoxLogChannelTechnology_Zephra_UTRAN2"},
                    Told{"CellMonitorOfAny", "\xFF\x0C\0\x01\0........"s, "none"},
                    Told{"XmlList", "<?xml version=\"1.0\"?>", "kVoxLogChannelTechnology_IFX"},
                    Told{"XmlListBehindBlanks", "\xEF\xBB\xBF \n<plist/>", "kVoxLogChannelTechnology_IFX"},
                    Told{"BinaryList", "bplist00", "kVoxLogChannelTechnology_IFX"}, Told{"Nothing", "", "none"},
                    Told{"Noise", "\x42\x42", "none"}),
    [](const auto& each) { return std::string(each.param.name); });

} // namespace
} // namespace kestrum
