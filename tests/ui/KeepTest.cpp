// What the user keeps, and what the program reads of the user's.
#include "capture/CaptureWriter.h"
#include "doubles/ApplicationDoubles.h"
#include "ui/KestrumApp.h"
#include "ui/ServedModem.h"

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <sstream>
#include <string>
#include <vector>

namespace kestrum {
namespace {

using namespace std::chrono_literals;
using testing::AllOf;
using testing::ElementsAre;
using testing::HasSubstr;
using testing::IsEmpty;
using testing::StartsWith;

class KeepTest : public testing::Test {
protected:
    void launch()
    {
        modem.serve();
        app->applicationDidFinishLaunching();
        doubles.queue.run();
    }
    void TearDown() override { EXPECT_THAT(doubles.toolkit.record.faults, IsEmpty()); }

    void send(const std::string& message)
    {
        ASSERT_TRUE(doubles.ports.send(std::string(kLogChannelServiceName), 0, message));
        doubles.queue.run();
    }
    static std::string capture(const std::vector<std::string>& messages)
    {
        std::ostringstream stream;
        for (const auto& each : messages)
            writeKcap(sinkTo(stream), bytesOf(each));
        return stream.str();
    }
    RecordingNavigationView& view() const { return *doubles.toolkit.navigation; }
    const auto& files() const { return doubles.files.files; }

    ApplicationDoubles doubles;
    ServedModem modem{doubles, doubles.propertyLists};
    std::shared_ptr<KestrumApp> app = KestrumApp::make(doubles.applicationRoles);
};

TEST_F(KeepTest, WritesTheMessagesAndTheEventsBesideThem)
{
    launch();
    ASSERT_TRUE(modem.show(makeDictionary({{"Serving Cell", ServedModem::cell("-80 dBm")}, {"RAT", "GSM"}})));
    send("no message of any kind");
    modem.kill();
    doubles.queue.advance(2s);
    view().keep();
    ASSERT_EQ(files().size(), 2u);
    const auto& [kcap, messages] = *files().rbegin();
    const auto& [csv, events] = *files().begin();
    EXPECT_EQ(kcap, "/logs/KestrumKept-1794809146.kcap");
    EXPECT_EQ(csv, "/logs/KestrumKept-1794809146.csv");
    EXPECT_EQ(view().notice, "Kept in /logs/KestrumKept-1794809146.kcap and .csv");
    EXPECT_TRUE(messages.ends_with(capture({"no message of any kind"}))) << "an invalid message is evidence";
    EXPECT_GT(messages.size(), capture({"no message of any kind"}).size());
    EXPECT_THAT(events, AllOf(StartsWith("time,event,name,was,is,levels\r\n"),
                              HasSubstr("2026-11-16T06:05:46.000000Z,connection,log channel,connected,lost,")));
}

TEST_F(KeepTest, WhileThePanesStandStillItIsTheNewestToo)
{
    launch();
    ASSERT_TRUE(modem.show(makeDictionary({{"RAT", "GSM"}, {"Band", "3"}})));
    view().look(Look::Freeze);
    send("after");
    view().keep();
    EXPECT_TRUE(files().rbegin()->second.ends_with(capture({"after"})));
}

TEST_F(KeepTest, NotesWhereTheServiceDroppedMessages)
{
    launch();
    send("one");
    ASSERT_TRUE(doubles.ports.send(std::string(kLogChannelServiceName), 1, std::string("\5\0\0\0\0\0\0\0", 8)));
    doubles.queue.run();
    view().keep();
    std::ostringstream gap;
    writeKcapGap(sinkTo(gap), 5);
    EXPECT_EQ(files().rbegin()->second, capture({"one"}) + gap.str());
}

TEST_F(KeepTest, ForgetsWhatIsOlderThanFifteenMinutes)
{
    launch();
    send("early");
    doubles.queue.advance(14min);
    send("late");
    doubles.queue.advance(2min);
    view().keep();
    EXPECT_EQ(files().rbegin()->second, capture({"late"}));
}

TEST_F(KeepTest, SaysWhenThereIsNothing)
{
    launch();
    view().keep();
    EXPECT_THAT(files(), IsEmpty());
    EXPECT_EQ(view().notice, "There is nothing to keep yet");
}

TEST_F(KeepTest, TakesAnotherNameWhereItsOwnIsTaken)
{
    launch();
    send("one");
    view().keep();
    view().keep();
    EXPECT_EQ(files().size(), 4u);
    EXPECT_EQ(files().rbegin()->first, "/logs/KestrumKept-1794809143.kcap");
}

TEST_F(KeepTest, TellsOfADiskThatIsFull)
{
    launch();
    send("one");
    doubles.files.writable = false;
    view().keep();
    EXPECT_EQ(view().notice, "");
    ASSERT_EQ(doubles.toolkit.alerts.size(), 1u);
    EXPECT_EQ(doubles.toolkit.alerts[0].title, "File Error");
    EXPECT_EQ(doubles.toolkit.alerts[0].message, "Unable to write file to disk");
}

using ThresholdsFileTest = KeepTest;

TEST_F(ThresholdsFileTest, GradesByTheUsersProfile)
{
    doubles.files.configurations["thresholds"] = "use mine\nprofile mine\nsource me\n"
                                                 "RxLev excellent -10 good -20 fair -30 poor -120\n";
    launch();
    EXPECT_EQ(view().notice, "");
    ASSERT_TRUE(modem.show(makeDictionary({{"Serving Cell", ServedModem::cell("-53 dBm")}, {"RAT", "GSM"}})));
    view().press(SheetKind::Overview);
    ASSERT_TRUE(view().sheet);
    std::vector<std::string> words;
    for (const auto& part : view().sheet->contents.parts)
        for (const auto& fact : part.facts)
            if (!fact.value.word.empty())
                words.push_back(fact.value.text + " " + fact.value.word);
    EXPECT_THAT(words, ElementsAre("-53 dBm poor"));
}

TEST_F(ThresholdsFileTest, TellsWhichLineIsBadAndGoesOn)
{
    doubles.files.configurations["thresholds"] = "# mine\nuse it well\n";
    launch();
    EXPECT_THAT(view().notice, StartsWith("/config/thresholds: line 2: "));
    ASSERT_TRUE(modem.show(makeDictionary({{"Serving Cell", ServedModem::cell("-53 dBm")}, {"RAT", "GSM"}})));
    view().press(SheetKind::Overview);
    EXPECT_TRUE(view().sheet);
}

TEST_F(ThresholdsFileTest, TellsThatItCannotBeRead)
{
    doubles.files.configurations["thresholds"] = std::string(FileSystem::kLongestConfiguration + 1, '#');
    launch();
    EXPECT_EQ(view().notice, "/config/thresholds: it is too long");
}

} // namespace
} // namespace kestrum
