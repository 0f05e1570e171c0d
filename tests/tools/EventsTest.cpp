#include "harness/Places.h"
#include "tools/Tool.h"

#include <gmock/gmock.h>
#include <gtest/gtest.h>

namespace kestrum::tools {
namespace {

using testing::HasSubstr;
using testing::IsEmpty;
using testing::Not;
using testing::StartsWith;

std::string capture(const char* name)
{
    return inCheckout("captures/") + name + ".kcap";
}

TEST(Events, AsATreeHaveTimesAndWhatWasAndIs)
{
    const auto ran = run({"--events", capture("gsm")});
    EXPECT_EQ(ran.status, 0);
    EXPECT_THAT(ran.remarks, IsEmpty());
    EXPECT_THAT(ran.output,
                StartsWith("2026-11-16T06:05:42.000Z  technology: GSM/UMTS\n"
                           "2026-11-16T06:05:42.000Z  serving cell (UMTS): UMTS cell 18877210, UARFCN 10687\n"));
    EXPECT_THAT(ran.output,
                HasSubstr("2026-11-16T06:05:43.700Z  reselection (GSM): UMTS cell 18877210, UARFCN 10687 -> "
                          "GSM cell 11313, ARFCN 106, BSIC 19\n"));
    EXPECT_THAT(ran.output, Not(HasSubstr("network and area"))) << "the network stays the same";
}

TEST(Events, AsCsvAreRows)
{
    const auto ran = run({"--events", "--format", "csv", capture("gsm")});
    EXPECT_EQ(ran.status, 0);
    EXPECT_THAT(ran.output, StartsWith("time,event,name,was,is,levels\r\n"
                                       "2026-11-16T06:05:42.000000Z,technology,technology,,GSM/UMTS,\r\n"));
    EXPECT_THAT(ran.output, HasSubstr(",RRC state,GSM RR state,RR_CELL_RESELECTION,RR_IDLE,GSM RSSI 30 dBm\r\n"));
}

TEST(Events, AsJsonAreAList)
{
    const auto ran = run({"--events", "--format", "json", capture("lte")});
    EXPECT_EQ(ran.status, 0);
    EXPECT_THAT(ran.output, StartsWith("{\n  \"events\": ["));
    EXPECT_THAT(ran.output, HasSubstr("\"dropped\": 0\n}\n"));
}

TEST(Events, OfAnIfxModemHaveTheTreesTimes)
{
    const auto ran = run({"--events", capture("ifx")});
    EXPECT_THAT(ran.output, HasSubstr("2026-11-16T06:05:42.000Z  serving cell (GSM): GSM cell 0x2a01, LAC 0x1107"));
}

TEST(VisitedCells, AreListedInEachFormat)
{
    const auto tree = run({"--cells", capture("lte")});
    EXPECT_EQ(tree.status, 0);
    EXPECT_THAT(tree.output, HasSubstr("LTE cell 1712898, PCI 232, EARFCN 6300\n  Visits: 1\n"));
    EXPECT_THAT(run({"--cells", "--format", "csv", capture("lte")}).output,
                HasSubstr("LTE,\"cell 1712898, PCI 232, EARFCN 6300\",1,"));
    EXPECT_THAT(run({"--cells", "--format", "json", capture("lte")}).output, HasSubstr("\"visits\": 1,"));
}

struct Wrong {
    const char* name;
    std::vector<std::string> arguments;
    friend void PrintTo(const Wrong& shown, std::ostream* out) { *out << shown.name; }
};
class WrongUseOfEvents : public testing::TestWithParam<Wrong> {};

TEST_P(WrongUseOfEvents, IsRefused)
{
    auto arguments = GetParam().arguments;
    arguments.push_back(capture("lte"));
    const auto ran = run(arguments);
    EXPECT_EQ(ran.status, 2);
    EXPECT_THAT(ran.output, IsEmpty());
    EXPECT_THAT(ran.remarks, Not(IsEmpty()));
}

INSTANTIATE_TEST_SUITE_P(Events, WrongUseOfEvents,
                         testing::Values(Wrong{"Both", {"--events", "--cells"}},
                                         Wrong{"Jsonl", {"--events", "--format", "jsonl"}},
                                         Wrong{"CellsAsJsonl", {"--cells", "--format", "jsonl"}},
                                         Wrong{"Log", {"--events", "--log"}}),
                         [](const auto& each) { return std::string(each.param.name); });

} // namespace
} // namespace kestrum::tools
