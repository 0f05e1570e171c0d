#include "C2K/C2KRun.h"

#include <ostream>

namespace kestrum {
namespace {

struct Case {
    const char* name;
    unsigned bandClass;
    const char* text;

    friend void PrintTo(const Case& shown, std::ostream* out) { *out << shown.name; }
};

class BandClass : public testing::TestWithParam<Case> {};

// The band class is in the upper five bits of the EV-DO status record's byte 14.
TEST_P(BandClass, IsNamed)
{
    C2KRun run;
    run.receive(record(0x1183, 50).u8(14, GetParam().bandClass << 3));
    EXPECT_EQ(run.at("kBandClass"), Value(GetParam().text));
}

INSTANTIATE_TEST_SUITE_P(
    Names, BandClass,
    testing::Values(Case{"Cellular", 0, "800 MHz cellular band [0]"}, Case{"Pcs", 1, "1.8 to 2.0GHz PCS band [1]"},
                    Case{"Tacs", 2, "872 to 960MHz TACS band [2]"}, Case{"Jtacs", 3, "832 to 925MHz JTACS band [3]"},
                    Case{"KoreanPcs", 4, "1.75 to 1.87GHz Korean PCS band [4]"}, Case{"At450", 5, "450MHz band [5]"},
                    Case{"At2G", 6, "2GHz band [6]"}, Case{"At700", 7, "700MHz band [7]"},
                    Case{"At1800", 8, "1800 MHz band [8]"}, Case{"At900WithoutItsBlank", 9, "900 MHzband [9]"},
                    Case{"Secondary800", 10, "Secondary 800 MHz band [10]"},
                    Case{"EuropeanPamr400", 11, "400 MHz European PAMR band [11]"},
                    Case{"EuropeanPamr800", 12, "800 MHz European PAMR band [12]"},
                    Case{"FirstWithoutName", 13, "[Bad Value 13]"}, Case{"Highest", 31, "[Bad Value 31]"}),
    [](const auto& each) { return std::string(each.param.name); });

} // namespace
} // namespace kestrum
