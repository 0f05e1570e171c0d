#include "insight/NumberIn.h"

#include "LogGenerator/Quantities.h"

#include <gtest/gtest.h>

#include <cstdint>
#include <optional>
#include <string>

namespace kestrum {
namespace {

TEST(NumberIn, AReadingHasItsNumberAndUnit)
{
    const auto measure = numberIn(Reading(inWholeDbm<signed32>, static_cast<std::uint32_t>(-98)));
    ASSERT_TRUE(measure);
    EXPECT_EQ(measure->number, -98);
    EXPECT_EQ(measure->unit, "dBm");
}

struct Case {
    const char* name;
    const char* text;
    std::optional<double> number;
    const char* unit = "";

    friend void PrintTo(const Case& shown, std::ostream* out) { *out << shown.name; }
};

class NumberInText : public testing::TestWithParam<Case> {};

TEST_P(NumberInText, IsItsNumberAndUnitOrNothing)
{
    const Value value(GetParam().text);
    const auto measure = numberIn(value);
    EXPECT_EQ(measure ? std::optional(measure->number) : std::nullopt, GetParam().number);
    EXPECT_EQ(measure ? measure->unit : "", GetParam().unit);
}

INSTANTIATE_TEST_SUITE_P(
    NumberIn, NumberInText,
    testing::Values(Case{"Level", "-98.25 dBm", -98.25, "dBm"}, Case{"Plain", "42", 42}, Case{"Plus", "+3 dB", 3, "dB"},
                    Case{"Percent", "1.5%", 1.5, "%"}, Case{"PercentAndBlank", "1.5 %", 1.5, "%"},
                    Case{"Rate", "3.0 kbit/s", 3, "kbit/s"}, Case{"Empty", "", {}}, Case{"Blank", " ", {}},
                    Case{"Sign", "-", {}}, Case{"NotANumber", "nan dBm", {}}, Case{"Infinite", "-inf dB", {}},
                    Case{"NotPresent", "Not Present", {}}, Case{"Hexadecimal", "0x2a01", {}},
                    Case{"Area", "001-01-1107", {}}, Case{"Address", "192.0.2.17", {}}, Case{"Cipher", "A5/3", {}},
                    Case{"Time", "2026-11-16 06:05:51 +0000", {}}, Case{"Exponent", "1e300", {}},
                    Case{"WordsBehind", "3 neighbours of many", {}}),
    [](const auto& each) { return std::string(each.param.name); });

} // namespace
} // namespace kestrum
