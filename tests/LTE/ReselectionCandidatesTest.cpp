#include "LogGenerator/LTE/ReselectionCandidatesList.h"
#include "LogGenerator/LTE/ReselectionCandidatesMisc.h"

#include "sections/DecodedSection.h"

#include <gmock/gmock.h>
#include <gtest/gtest.h>

namespace kestrum {
namespace {

using testing::ElementsAre;
using testing::Pair;

/// One candidate: its priority and RAT, then 8 bytes of payload.
RecordBuilder candidate(std::uint32_t priority, std::uint32_t rat, std::initializer_list<unsigned> payload)
{
    return record(0xB186, 33).u16(19, 1).u16(21, priority).u16(23, rat).bytes(25, payload);
}

TEST(ReselectionCandidatesMisc, ShowsTheServingCellInOrder)
{
    const auto display = decoded<ReselectionCandidatesMisc>(
        record(0xB186, 21).u8(13, 255).u8(14, 255).u16(15, 65535).u16(17, 301).u16(19, 0xFFFF));
    EXPECT_EQ(display.text(), R"({"Version": "255", "Serving EARFCN": "65535", "Serving Cell ID": "301"})");
    EXPECT_THAT(display.log().lines, ElementsAre(Pair(Priority::Warning, "Reselection Candidates")));
}

struct RatCase {
    const char* name;
    std::uint32_t rat;
    const char* row;

    friend void PrintTo(const RatCase& shown, std::ostream* out) { *out << shown.name; }
};

class CandidateOfRat : public testing::TestWithParam<RatCase> {};

TEST_P(CandidateOfRat, ShowsItsPayload)
{
    const auto display = decodedList<ReselectionCandidatesList>(
        candidate(6, GetParam().rat, {0x9C, 0x18, 0x80, 0xFF, 0x34, 0x12, 0xFF, 0xFF}));
    EXPECT_EQ(display.text(), GetParam().row);
    EXPECT_THAT(display.log().lines, ElementsAre(Pair(Priority::Warning, "Reselection Candidates List")));
}

// clang-format off
INSTANTIATE_TEST_SUITE_P(ReselectionCandidatesList, CandidateOfRat, testing::Values(
    RatCase{"Lte", 0, R"([{"Candidate Priority": "6", "Candidate RAT Type": "LTE", "E ARFCN": "6300", "Cell ID": "511"}])"},
    RatCase{"Utran", 1, R"([{"Candidate Priority": "6", "Candidate RAT Type": "UTRAN", "U ARFCN": "6300", "PSC": "65408"}])"},
    RatCase{"Geran", 2, R"([{"Candidate Priority": "6", "Candidate RAT Type": "GERAN", "ARFCN": "6300", "Band": "128", "BSIC ID": "255"}])"},
    RatCase{"Cdma1x", 3, R"([{"Candidate Priority": "6", "Candidate RAT Type": "CDMA1XRTT", "Band": "156", "Channel": "4660", "Pilot": "65535"}])"},
    RatCase{"CdmaHrpd", 4, R"([{"Candidate Priority": "6", "Candidate RAT Type": "CDMAHRPD", "Band": "156", "Channel": "4660", "Pilot": "65535"}])"},
    RatCase{"FirstUnknown", 5, R"([{"Candidate Priority": "6", "Candidate RAT Type": "??"}])"},
    RatCase{"Unknown", 7, R"([{"Candidate Priority": "6", "Candidate RAT Type": "??"}])"},
    RatCase{"LowByteOfLteOnly", 0x0100, R"([{"Candidate Priority": "6", "Candidate RAT Type": "??"}])"},
    RatCase{"LastUnknown", 0xFFFF, R"([{"Candidate Priority": "6", "Candidate RAT Type": "??"}])"}),
    [](const auto& each) { return std::string(each.param.name); });
// clang-format on

TEST(ReselectionCandidatesList, ShowsAnLteCellIdWithoutTheSevenBitsBelowIt)
{
    const auto display = decodedList<ReselectionCandidatesList>(candidate(0, 0, {0, 0, 0x7F, 0x81}));
    EXPECT_EQ(display.row(0)->at("Cell ID"), "258");
}

TEST(ReselectionCandidatesList, TakesTheSecondHeaderFrom25WhereTheFirstPayloadBegins)
{
    // The first candidate's payload 0x0003, 0x0001 is also the second one's priority 3 and RAT 1.
    const auto two =
        record(0xB186, 33).u16(19, 2).u16(21, 5).u16(23, 2).u16(25, 3).u16(27, 1).u16(29, 10700).u16(31, 44);
    EXPECT_EQ(
        decodedList<ReselectionCandidatesList>(two).text(),
        R"([{"Candidate Priority": "5", "Candidate RAT Type": "GERAN", "ARFCN": "3", "Band": "1", "BSIC ID": "0"}, )"
        R"({"Candidate Priority": "3", "Candidate RAT Type": "UTRAN", "U ARFCN": "10700", "PSC": "44"}])");
}

TEST(ReselectionCandidatesList, OfCount256IsEmpty)
{
    EXPECT_EQ(decodedList<ReselectionCandidatesList>(candidate(1, 0, {}), record(0xB186, 400).u16(19, 256)).text(),
              "[]");
}

TEST(ReselectionCandidatesList, OfCount257ShowsOne)
{
    EXPECT_EQ(decodedList<ReselectionCandidatesList>(record(0xB186, 400).u16(19, 257)).size(), 1u);
}

TEST(ReselectionCandidatesList, OfCount0IsEmpty)
{
    EXPECT_EQ(decodedList<ReselectionCandidatesList>(candidate(1, 0, {}), record(0xB186, 21)).text(), "[]");
}

struct CutCase {
    const char* name;
    std::uint32_t rat;
    std::size_t length; ///< of header and payload together, as far as they are read

    friend void PrintTo(const CutCase& shown, std::ostream* out) { *out << shown.name; }
};

class CutCandidate : public testing::TestWithParam<CutCase> {};

TEST_P(CutCandidate, IsShownOnceItsLastFieldIsThere)
{
    const auto [name, rat, length] = GetParam();
    const auto whole = candidate(1, rat, {}).length(21 + length);
    EXPECT_EQ(decodedList<ReselectionCandidatesList>(whole).size(), 1u);
    const auto cut = candidate(1, rat, {}).length(21 + length - 1);
    EXPECT_EQ(decodedList<ReselectionCandidatesList>(whole, cut).size(), 0u);
}

INSTANTIATE_TEST_SUITE_P(ReselectionCandidatesList, CutCandidate,
                         testing::Values(CutCase{"Lte", 0, 8}, CutCase{"Utran", 1, 8}, CutCase{"Geran", 2, 8},
                                         CutCase{"Cdma1x", 3, 12}, CutCase{"CdmaHrpd", 4, 12},
                                         CutCase{"Unknown", 9, 4}),
                         [](const auto& each) { return std::string(each.param.name); });

TEST(ReselectionCandidatesList, StopsAtTheFirstThatDoesNotFit)
{
    // The third candidate, of CDMA, lacks its last byte. The fourth, of an unknown RAT, would fit.
    auto four = record(0xB186, 21 + 8 + 11).u16(19, 4).u16(23, 9).u16(27, 9).u16(31, 3).u16(35, 9);
    EXPECT_EQ(decodedList<ReselectionCandidatesList>(four).size(), 2u);
}

TEST(ReselectionCandidatesList, OfMoreThanTheRecordHoldsEndsAtTheLastThatFits)
{
    EXPECT_EQ(decodedList<ReselectionCandidatesList>(record(0xB186, 21 + 4 * 4 + 4).u16(19, 255)).size(), 4u);
}

} // namespace
} // namespace kestrum
