#include "tools/Decoding.h"
#include "Tool.h"
#include "capture/Messages.h"
#include "platform/TelephonyService.h"
#include "platform/posix/LinuxBundle.h"
#include "platform/propertylist/PropertyListCodec.h"

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <stdexcept>

namespace kestrum::tools {
namespace {

class DecodingTest : public testing::Test {
protected:
    Decoding decoding(std::string_view technology)
    {
        return Decoding(
            std::string(technology), bundle, codec, [this](Priority, std::string_view line) { log.emplace_back(line); },
            [this](const Decoding::Decoded& decoded) { seen.push_back(decoded); });
    }

    LinuxBundle bundle{{inCheckout("resources")}};
    PropertyListCodec codec;
    std::vector<std::string> log;
    std::vector<Decoding::Decoded> seen;
};

struct Codes {
    const char* name;
    std::string_view technology;
    std::vector<unsigned> codes;

    friend void PrintTo(const Codes& shown, std::ostream* out) { *out << shown.name; }
};

class HeadersAlone : public DecodingTest, public testing::WithParamInterface<Codes> {};

TEST_P(HeadersAlone, AreTooShortForEveryCode)
{
    auto decoded = decoding(GetParam().technology);
    for (const auto code : GetParam().codes)
        decoded.take(bytesOf(message(code, "")));
    for (const auto code : GetParam().codes) {
        const auto& tally = decoded.statistics().at(code);
        EXPECT_EQ(tally.tooShort, 1u) << std::hex << code;
        EXPECT_EQ(tally.decoded, 0u) << std::hex << code;
    }
}

// Without 0xD0E0, whose short records are decoded too.
INSTANTIATE_TEST_SUITE_P(
    Technologies, HeadersAlone,
    testing::Values(Codes{"Cdma",
                          kVoxLogChannelTechnology_Zephra_CDMA,
                          {0x108A, 0x1183, 0x1192, 0x119C, 0x119D, 0x127E, 0x12B6, 0x134F}},
                    Codes{"Gsm",
                          kVoxLogChannelTechnology_Zephra_GSM,
                          {0x4005, 0x4125, 0x4127, 0x417A, 0x512C, 0x7130, 0x7131, 0x7132, 0x7135, 0x7150}},
                    Codes{"Lte", kVoxLogChannelTechnology_Zephra_LTE, {0xB0C1, 0xB0C2, 0xB179, 0xB17F, 0xB180, 0xB186}},
                    Codes{"Utran", kVoxLogChannelTechnology_Zephra_UTRAN2, {0xD00A, 0xD00C, 0xD00E, 0xD0E2}}),
    [](const auto& each) { return std::string(each.param.name); });

TEST_F(DecodingTest, AddressesAreLoggedAsNull)
{
    auto decoded = decoding(kVoxLogChannelTechnology_Zephra_LTE);
    decoded.take(bytesOf(message(0xB0C1, "")));
    EXPECT_THAT(log, testing::Contains("Creating ZPHLogGenerator2 object with 0x0"));
}

TEST_F(DecodingTest, TellsTimeAndCodeOfEachMessage)
{
    auto decoded = decoding({});
    decoded.take(bytesOf(message(0xB0C1, "", kStamp)));
    decoded.take(bytesOf(message(2, "", 0, 0xFF)));
    ASSERT_EQ(seen.size(), 2u);
    EXPECT_EQ(isoText(*seen[0].time), "2026-11-16T06:05:42Z");
    EXPECT_EQ(seen[0].code, 0xB0C1u);
    EXPECT_FALSE(seen[1].time);
    EXPECT_EQ(seen[1].code, 0xFF0002u);
}

TEST_F(DecodingTest, LimitsTheWaitForAMessageThatShowsTheTechnology)
{
    auto decoded = decoding({});
    const auto service = message(1, std::string(60'000, ' '), kStamp, 0xFF);
    EXPECT_THROW(
        {
            for (int i = 0; i < 1000; ++i)
                decoded.take(bytesOf(service));
        },
        std::runtime_error);
}

TEST_F(DecodingTest, CountsEachMessageOnce)
{
    auto decoded = decoding(kVoxLogChannelTechnology_Zephra_GSM);
    decoded.take(bytesOf("short"));
    decoded.take(bytesOf(message(0x7135, "")));
    decoded.take(bytesOf(message(0x7FFF, "")));
    decoded.take(bytesOf(message(0x7135, "", kStamp, 9)));
    const auto total = decoded.total();
    EXPECT_EQ(total.messages, 4u);
    EXPECT_EQ(total.decoded + total.tooShort + total.withoutSubscriber + total.refused, 4u);
    EXPECT_EQ(total.dropped(), 3u);
}

} // namespace
} // namespace kestrum::tools
