#include "insight/Events.h"

#include "LogGenerator/Quantities.h"
#include "doubles/DecodingDoubles.h"
#include "insight/NoGenerator.h"
#include "platform/TelephonyService.h"

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <string>
#include <vector>

namespace kestrum {
namespace {

using namespace std::chrono_literals;
using testing::ElementsAre;
using testing::HasSubstr;
using testing::IsEmpty;

constexpr Date kStart{std::chrono::sys_days(std::chrono::year(2026) / 11 / 16)};

/// A display under the test's control, watched after each "message".
class Watching {
public:
    Watching(std::string_view technology, Value display) : _generator(_doubles.roles, technology)
    {
        show(std::move(display));
    }

    /// Sets a text; the path's parts are the display's keys.
    Watching& set(const std::vector<std::string>& path, Value value)
    {
        DictionaryRef node = _state.at("Display").dictionary();
        for (std::size_t i = 0; i + 1 < path.size(); ++i) {
            if (!node->at(path[i]))
                node->set(path[i], makeDictionary());
            node = node->at(path[i]).dictionary();
        }
        node->set(path.back(), std::move(value));
        return *this;
    }
    void show(Value display) { _state.set("Display", std::move(display)); }
    void become(std::string_view technology) { _generator.name = technology; }

    void message(std::optional<LogCode> code = {}) { message(code, now += 10ms); }
    /// A whole record, 10 ms later.
    void record(LogCode code, std::uint8_t type = 1)
    {
        now += 10ms;
        finder.look(_generator, _state, recordOf(code, now, type));
    }
    Value display() const { return _state.at("Display"); }
    void message(std::optional<LogCode> code, std::optional<Date> time) { finder.look(_generator, _state, code, time); }

    /// "reselection LTE: LTE cell 1 -> LTE cell 2", without the technology's.
    std::vector<std::string> events() const
    {
        std::vector<std::string> list;
        for (const auto& each : finder.events())
            if (each.kind != EventKind::Technology || !each.was.empty())
                list.push_back(std::string(word(each.kind)) + " " + std::string(each.name) + ": " + each.was + " -> " +
                               each.is);
        return list;
    }
    const Event& last() const { return *std::prev(finder.events().end()); }

    EventFinder finder;
    Date now = kStart;

private:
    DecodingDoubles _doubles;
    NoGenerator _generator;
    State _state;
};

/// An LTE display as the template makes it.
class LteEvents : public testing::Test {
protected:
    void cell(const char* identity, const char* physical, const char* frequency)
    {
        watching.set({"0;Serving Cell", "Serving Cell Info", "Cell Identity"}, identity)
            .set({"0;Serving Cell", "Serving Cell Info", "Physical Cell ID"}, physical)
            .set({"0;Serving Cell", "Serving Cell Info", "Download Frequency"}, frequency);
    }
    void power(Value value)
    {
        watching.set({"0;Serving Cell", "Serving Cell Measurements", "Measured RSRP"}, std::move(value));
    }
    void area(Value value)
    {
        watching.set({"0;Serving Cell", "Serving Cell Info", "Tracking Area Code"}, std::move(value));
    }
    void contexts(std::vector<const char*> names)
    {
        auto list = makeArray();
        for (const char* name : names)
            list->append(makeDictionary({{"Access Point Name", name}}));
        watching.set({"3;Subscription and Data", "PDP Context Info"}, list);
    }

    Watching watching{kVoxLogChannelTechnology_Zephra_LTE, makeDictionary({{kSortedKey, kSortedKey}})};
};

constexpr LogCode kIdleMeasurement = 0xB180, kConnectedMeasurement = 0xB179, kAnyRecord = 0xB17F;

TEST_F(LteEvents, TheFirstCellIsAnEventAndOtherFirstValuesAreNone)
{
    cell("1712898", "232", "6300");
    area("5378");
    watching.message(kAnyRecord);
    EXPECT_THAT(watching.events(), ElementsAre("serving cell LTE:  -> LTE cell 1712898, PCI 232, EARFCN 6300"));
}

TEST_F(LteEvents, AChangeTellsWhatWasAndIsWhenAndTheLevels)
{
    cell("1", "2", "3");
    area("5378");
    power(Reading(inWholeDbm<signed32>, static_cast<std::uint32_t>(-98)));
    watching.message(kAnyRecord);
    area("5377");
    watching.message(kAnyRecord);
    const Event& event = watching.last();
    EXPECT_EQ(event.kind, EventKind::Registration);
    EXPECT_EQ(event.name, "tracking area");
    EXPECT_EQ(event.was, "5378");
    EXPECT_EQ(event.is, "5377");
    EXPECT_EQ(event.time, kStart + 20ms);
    EXPECT_EQ(event.levels, "RSRP -98 dBm");
}

TEST_F(LteEvents, AChangeOfCellIsAHandoverWhileConnectedAndElseAReselection)
{
    cell("1", "2", "3");
    watching.message(kIdleMeasurement);
    cell("4", "5", "3");
    watching.message(kAnyRecord);
    watching.message(kConnectedMeasurement);
    cell("6", "7", "3");
    watching.message(kAnyRecord);
    EXPECT_THAT(watching.events(),
                ElementsAre(HasSubstr("serving cell"),
                            "reselection LTE: LTE cell 1, PCI 2, EARFCN 3 -> LTE cell 4, PCI 5, EARFCN 3",
                            "RRC state RRC state: Idle -> Connected",
                            "handover LTE: LTE cell 4, PCI 5, EARFCN 3 -> LTE cell 6, PCI 7, EARFCN 3"));
}

// The service's report may come before the modem's record, which then completes the cell.
TEST_F(LteEvents, AnIdentityThatIsCompletedLaterIsTheSameCell)
{
    watching.set({"0;Serving Cell", "Serving Cell Info", "Cell Identity"}, "1");
    watching.message(kAnyRecord);
    cell("1", "2", "3");
    watching.message(kAnyRecord);
    cell("1", "2", "4");
    watching.message(kAnyRecord);
    EXPECT_EQ(watching.events().size(), 1u);
    EXPECT_EQ(watching.finder.cells().begin()->identity, "cell 1, PCI 2, EARFCN 4");
    EXPECT_EQ(watching.finder.cells().begin()->visits, 1u);
}

TEST_F(LteEvents, WithoutTheDecisivePartEveryPartTellsCellsApart)
{
    watching.set({"0;Serving Cell", "Serving Cell Info", "Physical Cell ID"}, "2");
    watching.message(kAnyRecord);
    watching.set({"0;Serving Cell", "Serving Cell Info", "Physical Cell ID"}, "3");
    watching.message(kAnyRecord);
    EXPECT_THAT(watching.events(),
                ElementsAre("serving cell LTE:  -> LTE PCI 2", "reselection LTE: LTE PCI 2 -> LTE PCI 3"));
}

TEST_F(LteEvents, AValueThatIsEmptyOrGoneIsNoChange)
{
    cell("1", "2", "3");
    area("5378");
    watching.message(kAnyRecord);
    area("");
    watching.message(kAnyRecord);
    area(Value());
    watching.message(kAnyRecord);
    area(makeArray({"5378"}));
    watching.message(kAnyRecord);
    area("5378");
    watching.message(kAnyRecord);
    EXPECT_EQ(watching.events().size(), 1u);
}

TEST_F(LteEvents, EqualTextsOfDifferentReadingsAreNoChange)
{
    area(Reading(decimalSigned32, 5378));
    watching.message(kAnyRecord);
    area(Reading(decimalUnsigned, 5378));
    watching.message(kAnyRecord);
    area("5378");
    watching.message(kAnyRecord);
    EXPECT_THAT(watching.events(), IsEmpty());
}

TEST_F(LteEvents, AListOfAccessPointsIsOneText)
{
    contexts({});
    watching.message(kAnyRecord);
    contexts({"ims.example", "internet.example"});
    watching.message(kAnyRecord);
    contexts({"ims.example"});
    watching.message(kAnyRecord);
    // The test's lists are new containers; a section edits its list in place.
    EXPECT_THAT(watching.events(), IsEmpty());

    auto list = makeArray();
    watching.set({"3;Subscription and Data", "PDP Context Info"}, list);
    watching.show(makeDictionary({{"3;Subscription and Data", makeDictionary({{"PDP Context Info", list}})}}));
    watching.message(kAnyRecord);
    list->append(makeDictionary({{"Access Point Name", "ims.example"}}));
    watching.message(kAnyRecord);
    list->append(makeDictionary({{"Access Point Name", "internet.example"}}));
    watching.message(kAnyRecord);
    EXPECT_THAT(watching.events(), ElementsAre("data access points: none -> ims.example",
                                               "data access points: ims.example -> ims.example, internet.example"));
}

TEST_F(LteEvents, CellsCountVisitsTimeAndLevels)
{
    cell("1", "2", "3");
    const auto halfSecond = [&] {
        watching.now += 490ms;
        watching.message(kAnyRecord);
    };
    power("-98.00 dBm");
    halfSecond();
    power("-90.00 dBm");
    halfSecond();
    power("Not Present");
    halfSecond();
    cell("4", "5", "3");
    power("-80.00 dBm");
    halfSecond();
    cell("1", "2", "3");
    power("-82.00 dBm");
    halfSecond();
    halfSecond();
    const auto& cells = watching.finder.cells();
    ASSERT_EQ(cells.size(), 2u);
    const auto& first = *cells.begin();
    EXPECT_EQ(first.identity, "cell 1, PCI 2, EARFCN 3");
    EXPECT_EQ(first.visits, 2u);
    EXPECT_EQ(first.time, 2s);
    EXPECT_EQ(first.lastSeen, kStart + 3s);
    EXPECT_EQ(first.unit, "dBm");
    EXPECT_EQ(first.level.least(), -98);
    EXPECT_EQ(first.level.greatest(), -82);
    EXPECT_EQ(first.level.mean(), (-98 - 90 - 82 - 82) / 4.0);
    const auto& second = *std::next(cells.begin());
    EXPECT_EQ(second.time, 500ms);
    EXPECT_EQ(second.lastSeen, kStart + 2500ms);
}

TEST_F(LteEvents, SilenceIsFoundAtTheNextMessageAndIsNoTimeOnTheCell)
{
    cell("1", "2", "3");
    watching.message(kAnyRecord);
    watching.now += 12s;
    watching.message(kAnyRecord);
    EXPECT_THAT(watching.events(), ElementsAre(HasSubstr("serving cell"), "silence log: streaming -> silent",
                                               "silence log: silent for 12.0 s -> streaming"));
    EXPECT_EQ(std::next(watching.finder.events().begin(), 2)->time, kStart + 10ms);
    EXPECT_EQ(watching.last().time, kStart + 12s + 20ms);
    EXPECT_EQ(watching.finder.cells().begin()->time, 0ms);
}

TEST_F(LteEvents, SilenceThatIsNotedAtOnceIsNotNotedAgain)
{
    watching.finder.silent(); // nothing has come yet
    watching.message(kAnyRecord);
    watching.finder.silent();
    watching.finder.silent();
    watching.now += 30s;
    watching.message(kAnyRecord);
    watching.message(kAnyRecord);
    EXPECT_THAT(watching.events(),
                ElementsAre("silence log: streaming -> silent", "silence log: silent for 30.0 s -> streaming"));
}

TEST_F(LteEvents, AClockThatIsSetIsNoSilenceAndNoTime)
{
    cell("1", "2", "3");
    watching.message(kAnyRecord);
    watching.message(kAnyRecord);
    watching.now -= std::chrono::years(40);
    watching.message(kAnyRecord);
    watching.now += std::chrono::years(40);
    watching.message(kAnyRecord);
    watching.message(kAnyRecord, std::nullopt);
    EXPECT_EQ(watching.events().size(), 1u);
    EXPECT_EQ(watching.finder.cells().begin()->time, 10ms);
}

TEST_F(LteEvents, ALostChannelIsNotedOnce)
{
    watching.finder.connected(true, kStart);
    watching.finder.connected(false, kStart);
    watching.finder.connected(false, kStart + 1s);
    watching.finder.connected(true, kStart + 5s);
    EXPECT_THAT(watching.events(),
                ElementsAre("connection log channel: connected -> lost", "connection log channel: lost -> connected"));
}

TEST_F(LteEvents, AnotherTechnologyEndsTheVisitAndBeginsAnew)
{
    cell("1", "2", "3");
    area("5378");
    watching.message(kAnyRecord);
    watching.become(kVoxLogChannelTechnology_IFX);
    watching.show(makeDictionary({{"Serving Cell", makeDictionary({{"Cell ID", "0x2a01"}})}}));
    watching.message();
    watching.become("a modem of tomorrow");
    watching.show(makeDictionary({{"Serving Cell", makeDictionary({{"Cell ID", "0x2a02"}})}}));
    watching.message();
    EXPECT_THAT(watching.events(),
                ElementsAre(HasSubstr("serving cell LTE"), "technology technology: LTE -> IFX",
                            "serving cell GSM:  -> GSM cell 0x2a01", "technology technology: IFX -> "));
    for (const auto& each : watching.finder.cells())
        EXPECT_FALSE(each.isServing);
}

TEST_F(LteEvents, EventsAreBoundedAndTheOldestAreCounted)
{
    for (int i = 0; i < 10'003; ++i) {
        area(std::to_string(i));
        watching.message(kAnyRecord);
    }
    EXPECT_EQ(watching.finder.events().size(), 10'000u);
    EXPECT_EQ(watching.finder.events().dropped(), 3u); // the technology's, and two of 10,002 changes
    EXPECT_EQ(watching.last().is, "10002");
}

TEST_F(LteEvents, CellsAreBoundedAndTheOldestAreCounted)
{
    for (int i = 0; i < 2'010; ++i) {
        cell(std::to_string(i).c_str(), "2", "3");
        watching.message(kAnyRecord);
    }
    const auto& cells = watching.finder.cells();
    EXPECT_EQ(cells.size(), 2'000u);
    EXPECT_EQ(cells.dropped(), 10u);
    EXPECT_THAT(cells.begin()->identity, HasSubstr("cell 2009"));
    EXPECT_THAT(std::prev(cells.end())->identity, HasSubstr("cell 10,"));
}

TEST_F(LteEvents, LongTextsAreCutBetweenCharacters)
{
    std::string longText;
    while (longText.size() < 100'000)
        longText += "é";
    area("5378");
    watching.message(kAnyRecord);
    area("x" + longText);
    watching.message(kAnyRecord);
    EXPECT_EQ(watching.last().is, "x" + longText.substr(0, 158) + "…");
}

TEST_F(LteEvents, ADisplayOfAnotherShapeAtEveryMessageIsHarmless)
{
    const Value shapes[] = {makeDictionary(),
                            makeArray({"Serving Cell"}),
                            "Serving Cell",
                            Value(),
                            makeDictionary({{"Serving Cell", makeArray({makeDictionary()})}}),
                            makeDictionary({{"0;Serving Cell", "text"}}),
                            makeDictionary({{"1;Serving Cell", makeDictionary({{"Serving Cell Info", makeArray()}})}})};
    for (LogCode i = 0; i < 1000; ++i) {
        watching.show(shapes[i % std::size(shapes)]);
        watching.message(i % 2 == 0 ? std::optional<LogCode>() : std::optional<LogCode>(0xB000 + i));
    }
    EXPECT_THAT(watching.events(), IsEmpty());
}

// Parts of earlier displays live on in the history.
TEST_F(LteEvents, ANewDisplayOfTheSameTechnologyIsFollowed)
{
    cell("1", "2", "3");
    power(Reading(inWholeDbm<signed32>, 5));
    watching.record(kAnyRecord);
    watching.record(kAnyRecord);
    const Value kept = watching.display();
    watching.show(makeDictionary({{kSortedKey, kSortedKey}}));
    cell("4", "5", "3");
    power(Reading(inWholeDbm<signed32>, 6));
    watching.now += 500ms;
    watching.record(kAnyRecord);
    EXPECT_THAT(watching.events(), ElementsAre(HasSubstr("LTE cell 1"), HasSubstr("LTE cell 4")));
}

TEST_F(LteEvents, ARecordOfAnUnknownTypeImpliesNothing)
{
    cell("1", "2", "3");
    watching.record(kIdleMeasurement);
    watching.record(kConnectedMeasurement, 7);
    EXPECT_THAT(watching.events(), ElementsAre(HasSubstr("LTE cell 1")));
}

TEST_F(LteEvents, RecordsHaveTheirTimeStampsTime)
{
    cell("1", "2", "3");
    watching.record(kIdleMeasurement);
    area("1");
    watching.record(kAnyRecord);
    area("2");
    watching.now += 1s;
    watching.record(kAnyRecord);
    EXPECT_EQ(watching.last().time, kStart + 1030ms);
}

class GsmEvents : public testing::Test {
protected:
    GsmEvents()
    {
        watching.set({"1;GSM", "GSM Serving Cell", "Cell ID"}, "11")
            .set({"1;GSM", "GSM Serving Cell", "ARFCN"}, "106")
            .set({"1;GSM", "GSM Serving Cell", "BSIC"}, "19")
            .set({"2;UMTS", "UMTS RR Info", "Cell ID"}, "22")
            .set({"2;UMTS", "UMTS RR Info", "Downlink Frequency"}, "10687");
    }
    static constexpr LogCode kGsmIdentity = 0x5134, kUmtsIdentity = 0x4127;
    Watching watching{kVoxLogChannelTechnology_Zephra_GSM, makeDictionary({{kSortedKey, kSortedKey}})};
};

TEST_F(GsmEvents, TheRadioThatTellsItsIdentityServes)
{
    watching.message(kUmtsIdentity);
    watching.message(kUmtsIdentity);
    watching.message(kGsmIdentity);
    watching.message(kUmtsIdentity);
    EXPECT_THAT(watching.events(),
                ElementsAre("serving cell UMTS:  -> UMTS cell 22, UARFCN 10687", "technology radio access: UMTS -> GSM",
                            "reselection GSM: UMTS cell 22, UARFCN 10687 -> GSM cell 11, ARFCN 106, BSIC 19",
                            "technology radio access: GSM -> UMTS",
                            "reselection UMTS: GSM cell 11, ARFCN 106, BSIC 19 -> UMTS cell 22, UARFCN 10687"));
    EXPECT_EQ(watching.finder.cells().size(), 2u);
    EXPECT_EQ(watching.finder.cells().begin()->visits, 2u);
}

TEST_F(GsmEvents, ARadioThatDoesNotServeHasNoCell)
{
    watching.message(kUmtsIdentity);
    watching.set({"1;GSM", "GSM Serving Cell", "Cell ID"}, "12");
    watching.message(0x5137);
    EXPECT_EQ(watching.events().size(), 1u);
}

TEST_F(GsmEvents, ADedicatedChannelMakesItAHandover)
{
    watching.set({"2;UMTS", "UMTS RR Info", "RRC State"}, "CELL_DCH");
    watching.message(kUmtsIdentity);
    watching.message(kGsmIdentity);
    EXPECT_THAT(watching.events(), testing::Contains(HasSubstr("handover GSM")));
}

TEST_F(GsmEvents, NetworkAndAreaAreOneTextThatMayBeCompleted)
{
    const std::string plmn = "0;Network and Registration";
    watching.set({plmn, "Serving PLMN", "Mobile Country Code"}, "001");
    watching.set({plmn, "Serving PLMN", "Mobile Network Code"}, "01 ");
    watching.message(0x7135);
    watching.set({plmn, "Serving PLMN", "Location Area Code"}, "4354");
    watching.message(0x7135);
    watching.set({plmn, "Serving PLMN", "Location Area Code"}, "4355")
        .set({plmn, "Serving PLMN", "Mobile Country Code"}, "2");
    watching.message(0x7135);
    EXPECT_THAT(watching.events(), ElementsAre("registration network and area: 001-01-4354 -> 2-01-4355"));
}

// The service's cell report writes the same network with fewer digits.
TEST_F(GsmEvents, TheServicesReportChangesNoNetwork)
{
    const std::string plmn = "0;Network and Registration";
    watching.set({plmn, "Serving PLMN", "Mobile Country Code"}, "001");
    watching.message(0x7135);
    watching.set({plmn, "Serving PLMN", "Mobile Country Code"}, "1");
    watching.message(0xFF0001);
    watching.set({plmn, "Serving PLMN", "Mobile Country Code"}, "001");
    watching.message(0x7135);
    EXPECT_THAT(watching.events(), IsEmpty());
}

class CdmaEvents : public testing::Test {
protected:
    CdmaEvents()
    {
        watching.set({"1;1x", "0;Device State"}, "").set({"0;EV-DO", "1;Radio", "2;Serving PN Offset"}, "");
    }
    void deviceState(const char* text) { watching.set({"1;1x", "0;Device State"}, text).message(kStatus); }

    static constexpr LogCode kStatus = 0x119C, kEvdoStatus = 0x1183;
    Watching watching{kVoxLogChannelTechnology_Zephra_CDMA, makeDictionary({{kSortedKey, kSortedKey}})};
};

TEST_F(CdmaEvents, SleepAndPagingAreOneState)
{
    deviceState("Paging [6]");
    deviceState("Slotted mode sleep state [7]");
    deviceState("Traffic [8]");
    deviceState("Paging [6]");
    EXPECT_THAT(watching.events(),
                ElementsAre("call 1x device state: Idle -> Traffic [8]", "call 1x device state: Traffic [8] -> Idle"));
}

TEST_F(CdmaEvents, AValueIsOnlyLookedAtWithItsCode)
{
    deviceState("Paging [6]");
    watching.set({"1;1x", "0;Device State"}, "Traffic [8]");
    watching.message(kEvdoStatus);
    EXPECT_THAT(watching.events(), IsEmpty());
    watching.message(kStatus);
    EXPECT_EQ(watching.events().size(), 1u);
}

TEST_F(CdmaEvents, TheUnitIsNoPartOfACellsIdentity)
{
    watching.set({"0;EV-DO", "1;Radio", "2;Serving PN Offset"}, "424 × 64chips").message(kEvdoStatus);
    EXPECT_THAT(watching.events(), ElementsAre("serving cell EV-DO:  -> EV-DO PN 424"));
}

TEST(LiveModemEvents, AreItsCellsAndStates)
{
    const auto tree = [](const char* cell, const char* access, const char* registration, const char* modem) {
        return makeDictionary({{kSortedKey, kSortedKey},
                               {"3;Serving Cell", makeDictionary({{kSortedKey, kSortedKey},
                                                                  {"1;Technology", "LTE"},
                                                                  {"2;Physical Cell ID", cell},
                                                                  {"3;Tracking Area Code", "4354"}})},
                               {"5;Registration", makeDictionary({{kSortedKey, kSortedKey},
                                                                  {"1;Registration State", registration},
                                                                  {"2;Access Technology", access}})},
                               {"9;Modem", makeDictionary({{kSortedKey, kSortedKey}, {"1;State", modem}})}});
    };
    Watching watching(kVoxLogChannelTechnology_IFX, tree("7", "LTE", "Home", "Registered"));
    watching.message();
    EXPECT_THAT(watching.events(), IsEmpty());
    watching.show(tree("8", "LTE", "Home", "Registered"));
    watching.message();
    EXPECT_THAT(watching.events(), ElementsAre("serving cell serving cell: LTE-7 -> LTE-8"));
    watching.show(tree("8", "UMTS", "Searching", "Connected"));
    watching.message();
    EXPECT_THAT(watching.events(),
                ElementsAre("serving cell serving cell: LTE-7 -> LTE-8", "technology access technology: LTE -> UMTS",
                            "registration registration: Home -> Searching", "data modem: Registered -> Connected"));
}

} // namespace
} // namespace kestrum
