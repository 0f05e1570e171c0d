#include "insight/Trend.h"

#include "LogGenerator/Quantities.h"
#include "platform/TelephonyService.h"

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <cmath>
#include <cstdint>
#include <limits>
#include <malloc.h>
#include <string>
#include <vector>

namespace kestrum {
namespace {

using namespace std::chrono_literals;
using testing::ElementsAre;
using testing::IsEmpty;

constexpr Date kStart{std::chrono::sys_days(std::chrono::year(2026) / 11 / 16)};
constexpr const char* kPower = "/Serving Cell/Serving Cell Measurements/Measured RSRP";
constexpr auto kLte = kVoxLogChannelTechnology_Zephra_LTE;

Value dbm(int level)
{
    return Reading(inWholeDbm<signed32>, static_cast<std::uint32_t>(level));
}

class Trend : public testing::Test {
protected:
    /// A refresh, 2 s after the one before.
    void refresh(const Value& display)
    {
        trends.sample(display, kLte, now);
        now += 2s;
    }
    void show(Value power)
    {
        refresh(makeDictionary(
            {{kSortedKey, kSortedKey},
             {"0;Serving Cell", makeDictionary({{"Serving Cell Measurements",
                                                 makeDictionary({{"Measured RSRP", std::move(power)}})}})}}));
    }
    void showNothing() { refresh(makeDictionary()); }

    /// Gaps are written as 999.
    std::vector<double> numbers(std::string_view path) const
    {
        std::vector<double> list;
        for (const auto& each : trends.exact(path))
            list.push_back(std::isnan(each.number) ? 999 : each.number);
        return list;
    }
    std::vector<std::string> words(std::string_view path) const
    {
        std::vector<std::string> list;
        for (const auto& each : trends.words(path))
            list.push_back(each.text);
        return list;
    }

    Trends trends;
    Date now = kStart;
};

TEST_F(Trend, ANumberIsSampledAtEachRefresh)
{
    show(dbm(-98));
    show("-97.50 dBm");
    EXPECT_THAT(trends.paths(), ElementsAre(kPower));
    EXPECT_THAT(numbers(kPower), ElementsAre(-98, -97.5));
    EXPECT_EQ(trends.exact(kPower)[1].time, kStart + 2s);
    EXPECT_EQ(trends.unit(kPower), "dBm");
}

TEST_F(Trend, GapsAreGapsAndNeverZero)
{
    show(dbm(-98));
    show("Not Present");
    show("");
    show(" nan dBm");
    showNothing();
    show(dbm(-90));
    showNothing();
    EXPECT_THAT(numbers(kPower), ElementsAre(-98, 999, 999, 999, 999, -90, 999));
}

TEST_F(Trend, IsExactFor15Minutes)
{
    for (int i = 0; i < 500; ++i)
        show(dbm(-i));
    const auto points = trends.exact(kPower);
    ASSERT_EQ(points.size(), 450u);
    EXPECT_EQ(points.front().number, -50);
    EXPECT_EQ(points.back().number, -499);
}

TEST_F(Trend, OlderThan15MinutesIsNotExactEvenAtASlowPace)
{
    show(dbm(-98));
    now += 16min;
    show(dbm(-90));
    EXPECT_THAT(numbers(kPower), ElementsAre(-90));
}

TEST_F(Trend, KeepsLeastMeanAndGreatestOfEachMinuteForADay)
{
    for (int i = 0; i < 26 * 60 * 30; ++i)
        show(dbm(-(i % 30)));
    const auto minutes = trends.minutes(kPower);
    ASSERT_EQ(minutes.size(), 24u * 60);
    EXPECT_EQ(minutes.front().time, kStart + 2h);
    EXPECT_EQ(minutes.front().least, -29);
    EXPECT_EQ(minutes.front().greatest, 0);
    EXPECT_FLOAT_EQ(static_cast<float>(minutes.front().mean), -14.5F);
    EXPECT_EQ(minutes.back().time, kStart + 25h + 59min);
}

TEST_F(Trend, AMinuteWithoutAValueIsMissing)
{
    show(dbm(-98));
    now = kStart + 1min;
    show("Not Present");
    now = kStart + 2min;
    show(dbm(-90));
    const auto minutes = trends.minutes(kPower);
    ASSERT_EQ(minutes.size(), 2u);
    EXPECT_EQ(minutes[1].time, kStart + 2min);
}

// Neighbours change places, and the list's carrier alternates.
TEST_F(Trend, ARowIsFollowedByItsIdentity)
{
    const auto list = [this](const char* channel, std::vector<std::pair<const char*, int>> rows) {
        auto cells = makeArray();
        for (const auto& [cell, level] : rows)
            cells->append(makeDictionary({{"Physical Cell ID", cell}, {"Measured RSRP", dbm(level)}}));
        const Value display = makeDictionary(
            {{"Idle Mode", makeDictionary({{"Neighbor Measurements", makeDictionary({{"E-ARFCN", channel}})},
                                           {"Neighbor Cells List", cells}})}});
        refresh(display);
        return display;
    };
    list("6300", {{"7", -90}, {"8", -100}});
    const auto last = list("6300", {{"8", -99}, {"7", -91}});
    list("1300", {{"7", -70}});
    const std::string row = "/Idle Mode/Neighbor Cells List/Physical Cell ID=";
    EXPECT_THAT(numbers(row + "7,E-ARFCN=6300/Measured RSRP"), ElementsAre(-90, -91, 999));
    EXPECT_THAT(numbers(row + "8,E-ARFCN=6300/Measured RSRP"), ElementsAre(-100, -99, 999));
    EXPECT_THAT(numbers(row + "7,E-ARFCN=1300/Measured RSRP"), ElementsAre(999, 999, -70));
    EXPECT_EQ(Trends::pathOf(last, kLte, {"Idle Mode", "Neighbor Cells List", "1", "Measured RSRP"}),
              row + "7,E-ARFCN=6300/Measured RSRP");
    EXPECT_EQ(Trends::pathOf(last, kLte, {"Idle Mode", "Neighbor Cells List", "2", "Measured RSRP"}), "");
}

TEST_F(Trend, RowsOfOneIdentityAreNotMixed)
{
    auto cells = makeArray();
    for (const int level : {-90, -100})
        cells->append(makeDictionary({{"Physical Cell ID", "7"}, {"Filtered RSRP", dbm(level)}}));
    refresh(makeDictionary({{"Connected Mode", makeDictionary({{"Measured Neighbor Cells", cells}})}}));
    EXPECT_THAT(numbers("/Connected Mode/Measured Neighbor Cells/Physical Cell ID=7/Filtered RSRP"), ElementsAre(-90));
    EXPECT_THAT(numbers("/Connected Mode/Measured Neighbor Cells/Physical Cell ID=7#2/Filtered RSRP"),
                ElementsAre(-100));
}

// A tree of a modem has its lists as dictionaries.
TEST_F(Trend, ARowUnderANumberIsFollowedByItsIdentity)
{
    const auto list = [this](const char* first, const char* second) {
        const Value display = makeDictionary(
            {{"Neighbor Cells",
              makeDictionary({{"0", makeDictionary({{"ARFCN", first}, {"BSIC", "7"}, {"RSSI", "-60 dBm"}})},
                              {"1", makeDictionary({{"ARFCN", second}, {"BSIC", "7"}, {"RSSI", "-70 dBm"}})}})}});
        trends.sample(display, kVoxLogChannelTechnology_IFX, now += 2s);
        return display;
    };
    list("31", "44");
    const auto last = list("44", "31");
    const auto path = Trends::pathOf(last, kVoxLogChannelTechnology_IFX, {"Neighbor Cells", "1", "RSSI"});
    EXPECT_THAT(path, testing::HasSubstr("ARFCN=31"));
    EXPECT_THAT(numbers(path), ElementsAre(-60, -70));
}

TEST_F(Trend, AnIdentityInARowIsNoCurve)
{
    auto cells = makeArray({makeDictionary({{"Physical Cell ID", Reading(decimalSigned32, 7)}})});
    refresh(makeDictionary({{"Connected Mode", makeDictionary({{"Measured Neighbor Cells", cells}})}}));
    EXPECT_THAT(words("/Connected Mode/Measured Neighbor Cells/Physical Cell ID=7/Physical Cell ID"), ElementsAre("7"));
}

TEST_F(Trend, NamesMakeAStripOfStates)
{
    const auto state = [this](const char* text) {
        refresh(makeDictionary({{"RRC Info", makeDictionary({{"State", text}})}}));
    };
    state("Idle");
    state("Idle");
    state("Connected");
    showNothing();
    state("Idle");
    showNothing();
    EXPECT_THAT(words("/RRC Info/State"), ElementsAre("Idle", "Connected", "", "Idle", ""));
    EXPECT_EQ(trends.words("/RRC Info/State")[1].since, kStart + 4s);
    EXPECT_EQ(trends.words("/RRC Info/State")[2].since, kStart + 6s);
    EXPECT_THAT(numbers("/RRC Info/State"), IsEmpty());
}

TEST_F(Trend, AnIdentityIsNoCurveAlthoughItIsANumber)
{
    const auto cell = [this](std::uint32_t identity) {
        refresh(makeDictionary(
            {{"0;Serving Cell",
              makeDictionary(
                  {{"Serving Cell Info", makeDictionary({{"Physical Cell ID", Reading(decimalSigned32, identity)}})}})},
             {kSortedKey, kSortedKey}}));
    };
    cell(7);
    cell(8);
    EXPECT_THAT(words("/Serving Cell/Serving Cell Info/Physical Cell ID"), ElementsAre("7", "8"));
}

TEST_F(Trend, AClockThatIsSetBackKeepsTheOrderOfTime)
{
    show(dbm(-98));
    show(dbm(-97));
    now = kStart - 1h;
    show(dbm(-96));
    EXPECT_THAT(numbers(kPower), ElementsAre(-96)) << "what lies ahead of the clock is not shown";
    EXPECT_EQ(trends.minutes(kPower).size(), 1u);
    now = kStart + 4s;
    show(dbm(-95));
    EXPECT_THAT(numbers(kPower), ElementsAre(-98, -97, -95));
}

TEST_F(Trend, ReadsAsASentence)
{
    EXPECT_EQ(trends.sentence(kPower), "Measured RSRP, no value in 15 minutes");
    for (int level = -91; level >= -121; --level)
        show(dbm(level));
    EXPECT_EQ(trends.sentence(kPower), "Measured RSRP, -121 dBm now, -121 to -91 in 15 minutes, falling");
    for (int level = -121; level <= -80; ++level)
        show(dbm(level));
    show("Not Present");
    EXPECT_EQ(trends.sentence(kPower), "Measured RSRP, no value now, -121 to -80 in 15 minutes, rising");
}

TEST_F(Trend, OfStatesReadsAsASentence)
{
    for (const char* text : {"Idle", "Connected", "Idle"})
        refresh(makeDictionary({{"State", text}}));
    EXPECT_EQ(trends.sentence("/State"), "State, Idle now, 2 changes in 15 minutes");
}

TEST_F(Trend, NamesWithSlashesAreNotMixedUp)
{
    refresh(makeDictionary({{"a/b", makeDictionary({{"c", "1"}})}, {"a", makeDictionary({{"b/c", "2"}})}}));
    EXPECT_THAT(trends.paths(), ElementsAre("/a/b~1c", "/a~1b/c"));
    EXPECT_EQ(trends.sentence("/a/b~1c"), "b/c, 2 now, 2 to 2 in 15 minutes, steady");
}

TEST_F(Trend, A100000KeysAreBoundedAndCounted)
{
    auto display = makeDictionary();
    for (int i = 0; i < 100'000; ++i)
        display->set("key " + std::to_string(i), dbm(-i % 100));
    refresh(display);
    refresh(display);
    EXPECT_EQ(trends.paths().size(), Trends::kMost);
    EXPECT_EQ(trends.left(), 100'000u - Trends::kMost);
    EXPECT_EQ(trends.dropped(), 0u) << "what is shown still is not dropped for another value";
}

TEST_F(Trend, ADisplayOfOtherKeysAtEachRefreshIsBounded)
{
    for (int round = 0; round < 100; ++round) {
        auto display = makeDictionary();
        for (int i = 0; i < 500; ++i)
            display->set(std::to_string(round) + " " + std::to_string(i), dbm(-i));
        refresh(display);
    }
    EXPECT_EQ(trends.paths().size(), Trends::kMost);
    EXPECT_EQ(trends.dropped(), 100u * 500 - Trends::kMost);
}

TEST_F(Trend, ADayOf500ValuesTakesAtMost64MiB)
{
    const auto before = ::mallinfo2().uordblks;
    auto section = makeDictionary();
    for (int i = 0; i < 500; ++i)
        section->set("key " + std::to_string(i), dbm(-i));
    for (int i = 0; i < 24 * 60 * 2; ++i) { // every half minute fills all minutes
        refresh(section);
        now += 28s;
    }
    EXPECT_EQ(trends.minutes("/key 7").size(), Trends::kMinutes);
    EXPECT_LT(::mallinfo2().uordblks - before, 64u << 20);
}

TEST_F(Trend, LongPathsAreLeftOut)
{
    Value node = dbm(-98);
    for (int i = 0; i < 100; ++i)
        node = makeDictionary({{std::string(20, 'x'), node}});
    refresh(node);
    refresh(makeDictionary({{std::string(1'000'000, 'x'), dbm(-98)}}));
    EXPECT_THAT(trends.paths(), IsEmpty());
    EXPECT_EQ(trends.left(), 1u);
}

} // namespace
} // namespace kestrum
