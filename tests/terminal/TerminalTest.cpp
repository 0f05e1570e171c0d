#include "Demonstration.h"
#include "Pseudoterminal.h"

#include <gmock/gmock.h>

#include <csignal>
#include <filesystem>
#include <fstream>
#include <iterator>

// The real program on a separate terminal, with the real telephony service.
namespace kestrum {
namespace {

using Key = Pseudoterminal::Key;
using testing::AllOf, testing::EndsWith, testing::HasSubstr, testing::SizeIs, testing::StartsWith;

std::string neighbours()
{
    std::string entries;
    for (int i = 0; i < 40; ++i) {
        const std::string number = (i < 10 ? "0" : "") + std::to_string(i);
        entries += text("Cell " + number, "-" + std::to_string(60 + i) + " dBm");
    }
    return entries;
}

/// All kinds of rows. `beat` is the value that changes.
std::string display(const std::string& beat)
{
    return propertyList(
        text("_sorted", "_sorted") +
        dictionary("0;Serving Cell", text("Physical Cell ID", "101") + text("RSRP", "-97 dBm")) +
        dictionary("1;Neighbours", text("_sorted", "_sorted") + neighbours()) + dictionary("2;Nothing", "") +
        text("3;Beat", beat) + text("4;PLMN 日本", "漢字") + text("5;Hostile", "a&#x9B;31m&#x202E;b&#x7F;") +
        text("6;A key that is long enough", "and a value that goes on far beyond the right edge of eighty columns"));
}

class Terminal : public testing::Test {
protected:
    void serve() { device.serve({display("tick"), display("tock")}); }

    void start(std::map<std::string, std::string> changes = {})
    {
        auto environment = device.environment();
        environment.merge(std::map<std::string, std::string>{{"NO_COLOR", ""}, {"LC_ALL", "C.UTF-8"}});
        for (auto& [name, value] : changes)
            environment[name] = value;
        terminal.start("kestrum-terminal", {}, environment);
    }

    /// Waits until the first display is on the screen.
    void startAndWait(std::map<std::string, std::string> changes = {})
    {
        serve();
        start(std::move(changes));
        ASSERT_TRUE(terminal.waitFor("Updated 20")) << terminal.text();
    }

    void expectChosen(const std::string& name)
    {
        EXPECT_TRUE(terminal.waitUntil([&] { return terminal.chosen().find(name) != std::string::npos; }))
            << "not chosen: " << name << "\n"
            << terminal.text();
    }
    void expectShown(const std::string& text)
    {
        EXPECT_TRUE(terminal.waitFor(text)) << text << "\n" << terminal.text();
    }
    void expectGone(const std::string& text)
    {
        EXPECT_TRUE(terminal.waitUntil([&] { return !terminal.shows(text); })) << text << "\n" << terminal.text();
    }
    void expectTitle(const std::string& title)
    {
        EXPECT_TRUE(terminal.waitUntil([&] { return terminal.row(0).substr(0, title.size() + 1) == " " + title; }))
            << title << "\n"
            << terminal.text();
    }
    /// A frame may arrive in pieces, so the test also waits for the row's contents.
    void expectRow(int row, const testing::Matcher<std::string>& matcher)
    {
        terminal.waitUntil([&] { return matcher.Matches(terminal.row(row)); });
        EXPECT_THAT(terminal.row(row), matcher) << terminal.text();
    }
    void expectCursor()
    {
        EXPECT_TRUE(terminal.waitUntil([&] { return terminal.cursorVisible(); }));
    }
    void clickOn(const std::string& text)
    {
        ASSERT_TRUE(terminal.waitFor(text)) << terminal.text();
        const int row = terminal.rowOf(text);
        terminal.click(row, static_cast<int>(terminal.row(row).find(text)));
    }
    /// Waits until rows were drawn again from later data.
    void expectRefresh()
    {
        const auto updated = terminal.row(23);
        EXPECT_TRUE(terminal.waitUntil([&] { return terminal.row(23) != updated; })) << terminal.text();
    }
    void expectRestored(const termios& before)
    {
        EXPECT_FALSE(terminal.onAlternateScreen());
        EXPECT_TRUE(terminal.cursorVisible());
        const auto after = terminal.modes();
        EXPECT_EQ(after.c_lflag, before.c_lflag);
        EXPECT_EQ(after.c_iflag, before.c_iflag);
        EXPECT_EQ(after.c_oflag, before.c_oflag);
    }

    Demonstration device;
    Pseudoterminal terminal{24, 80};
};

TEST_F(Terminal, SaysConnectingUntilTheServiceAnswers)
{
    start();
    expectTitle("Kestrum");
    expectShown("Connecting...");
    EXPECT_TRUE(terminal.onAlternateScreen());
    EXPECT_FALSE(terminal.cursorVisible());
}

TEST_F(Terminal, SaysWhatItWaitsForWhenNoServiceAnswers)
{
    start();
    expectShown("Waiting for the telephony service.");
    expectShown("voxd --scenario");
    EXPECT_TRUE(terminal.shows("Connecting..."));
    serve();
    expectShown("Updated 20");
    expectGone("Waiting for the telephony service.");
}

TEST_F(Terminal, ShowsKeysBoldAndValuesAgainstTheRightEdge)
{
    startAndWait();
    expectRow(0, " Kestrum");
    expectRow(1, " Serving Cell" + std::string(65, ' ') + "›");
    expectRow(3, " Nothing" + std::string(70, ' ') + "›");
    expectRow(4, StartsWith(" Beat"));
    expectRow(4, SizeIs(79));
    EXPECT_TRUE(terminal.isBold(4, 1));
    EXPECT_FALSE(terminal.isBold(4, 76));
    expectRow(23, HasSubstr("? help  q quit"));
}

TEST_F(Terminal, ShowsWideCharactersAndNothingThatSteersTheTerminal)
{
    startAndWait();
    expectRow(5, " PLMN 日本" + std::string(65, ' ') + "漢字");
    expectRow(6, HasSubstr("a\uFFFD31m\uFFFDb␡"));
}

TEST_F(Terminal, ScrollsALongRowSideways)
{
    startAndWait();
    terminal.press(Key::End);
    expectChosen("A key that is long enough");
    expectRow(7, StartsWith(" A key that is long enough     and a v"));
    expectRow(7, EndsWith("…"));
    terminal.press(Key::ShiftRight);
    expectRow(7, StartsWith("…"));
    terminal.type(">>>>>>>>");
    expectRow(7, EndsWith("eighty columns"));
    const auto furthest = terminal.row(7);
    expectRefresh();
    expectRow(7, furthest); // a refresh does not scroll
    terminal.type("<<<<<<<<<");
    expectRow(7, StartsWith(" A key"));
}

TEST_F(Terminal, OpensRowsAndGoesBackWithArrows)
{
    startAndWait();
    expectChosen("Serving Cell");
    terminal.press(Key::Right);
    expectTitle("Kestrum › Serving Cell");
    expectShown("-97 dBm");
    terminal.press(Key::Left);
    expectTitle("Kestrum");
    expectShown("Neighbours");
    terminal.press(Key::Down);
    terminal.press(Key::Enter);
    expectTitle("Kestrum › Neighbours");
    terminal.press(Key::Escape);
    expectChosen("Neighbours");
    terminal.press(Key::Backspace);
    expectChosen("Neighbours"); // the root pane has no pane behind it
}

TEST_F(Terminal, OpensRowsAndGoesBackWithLetters)
{
    startAndWait();
    terminal.type("jl");
    expectTitle("Kestrum › Neighbours");
    terminal.type("jjk");
    expectChosen("Cell 01");
    terminal.type("G");
    expectChosen("Cell 39");
    terminal.type("g");
    expectChosen("Cell 00");
    terminal.type("hk");
    expectChosen("Serving Cell");
}

TEST_F(Terminal, LeavesALeafChosenThatIsOpened)
{
    startAndWait();
    terminal.type("/beat\r\r");
    expectChosen("Beat");
    expectTitle("Kestrum");
}

TEST_F(Terminal, OpensARowWithoutChildren)
{
    startAndWait();
    terminal.type("jjl");
    expectTitle("Kestrum › Nothing");
    expectRow(1, "");
    terminal.type("jkl");
    terminal.press(Key::End);
    terminal.press(Key::PageDown);
    terminal.type("h");
    expectChosen("Nothing");
}

TEST_F(Terminal, MovesByPagesAndSaysWhereItIs)
{
    startAndWait();
    terminal.type("jl");
    expectShown("1/40");
    terminal.press(Key::PageDown);
    expectChosen("Cell 21");
    terminal.press(Key::PageDown);
    expectChosen("Cell 39");
    expectShown("40/40");
    terminal.press(Key::PageUp);
    expectChosen("Cell 18");
    terminal.press(Key::Home);
    expectChosen("Cell 00");
}

TEST_F(Terminal, JumpsToARowByItsName)
{
    startAndWait();
    terminal.type("jl/LL 3");
    expectChosen("Cell 30");
    expectRow(23, " /LL 3");
    expectCursor();
    terminal.type("7");
    expectChosen("Cell 37");
    terminal.press(Key::Enter);
    expectShown("? help");
    expectChosen("Cell 37");
    terminal.type("n"); // the next match, after the last row: the same row
    expectChosen("Cell 37");
}

TEST_F(Terminal, ComesBackFromAJumpThatFindsNothing)
{
    startAndWait();
    terminal.type("jl/nothing like it");
    expectShown("no such row");
    expectChosen("Cell 00");
    terminal.press(Key::Escape);
    expectGone("no such row");
    expectChosen("Cell 00");
    expectTitle("Kestrum › Neighbours"); // Escape ended only the search
}

TEST_F(Terminal, KeepsChoiceAndPlaceThroughARefresh)
{
    startAndWait();
    terminal.type("jl/Cell 30\rkk");
    expectChosen("Cell 28");
    const auto rows = terminal.text().substr(0, terminal.text().rfind(" Updated"));
    const auto updated = terminal.row(23);
    EXPECT_TRUE(terminal.waitUntil([&] { return terminal.row(23) != updated; }));
    EXPECT_EQ(terminal.text().substr(0, terminal.text().rfind(" Updated")), rows);
    terminal.type("h");
    expectChosen("Neighbours");
}

TEST_F(Terminal, SendsOnlyWhatChanged)
{
    startAndWait();
    terminal.type("jl");
    expectTitle("Kestrum › Neighbours");
    expectRefresh(); // by then the pane is drawn completely
    terminal.forgetWritten();
    expectRefresh();
    // Two digits of the time, and their position.
    EXPECT_LT(terminal.written().size(), 100u) << terminal.written();
    EXPECT_EQ(terminal.written().find("dBm"), std::string::npos);
}

TEST_F(Terminal, FollowsTheMouse)
{
    startAndWait();
    EXPECT_NE(terminal.written().find("\x1B[?1006;1000h"), std::string::npos);
    terminal.click(2, 10);
    expectTitle("Kestrum › Neighbours");
    terminal.turnWheel(true);
    expectRow(1, StartsWith(" Cell 03"));
    terminal.turnWheel(false);
    expectChosen("Cell 00");
    terminal.click(0, 3); // the title line goes back
    expectTitle("Kestrum");
    expectShown("Serving Cell");
    clickOn("? help");
    expectShown("choose a row");
}

TEST_F(Terminal, ShowsItsKeysAndHidesThemAtTheNextOne)
{
    startAndWait();
    terminal.type("?");
    expectShown("jump to a name, next");
    terminal.type("q");
    expectGone("jump to a name, next");
    expectShown("Serving Cell");
}

TEST_F(Terminal, ShowsAllItsKeysAtOnceOnAnOrdinaryTerminal)
{
    startAndWait();
    terminal.type("?");
    for (const std::string line :
         {"Up Down  k j  choose a row", "K             keep 15 minutes", "v             Show as table",
          "o             Overview", "t             Trend", "i             What it means", "e             Events",
          "c             Cells", "mouse         click, wheel"})
        expectShown(line);
    EXPECT_FALSE(terminal.shows("any key: more"));
}

TEST_F(Terminal, ShowsTheRestOfItsKeysAtTheNextKeyOnASmallTerminal)
{
    terminal.resize(12, 40);
    startAndWait();
    terminal.type("?");
    expectShown("choose a row");
    expectShown("any key: more");
    terminal.type("? ");
    expectShown("click, wheel");
    expectGone("any key: more");
    terminal.type("?");
    expectGone("click, wheel");
    expectShown("Serving Cell");
    terminal.type("?");
    expectShown("any key: more");
    terminal.press(Key::Escape);
    expectGone("any key: more");
}

TEST_F(Terminal, FitsFortyColumnsAndTwentyLines)
{
    terminal.resize(20, 40);
    startAndWait();
    expectRow(1, " Serving Cell" + std::string(25, ' ') + "›");
    expectRow(4, SizeIs(39));
    expectRow(19, StartsWith(" Updated "));
    expectRow(19, EndsWith("? help"));
    terminal.type("?");
    expectShown("scroll a row sideways │");
}

TEST_F(Terminal, KeepsSaveInSightOnFortyColumns)
{
    device.offerSave();
    terminal.resize(20, 40);
    startAndWait();
    expectRow(19, EndsWith("s save"));
}

TEST_F(Terminal, FollowsTheTerminalsSize)
{
    startAndWait();
    terminal.type("jl/Cell 20\r");
    expectChosen("Cell 20");
    terminal.resize(10, 40);
    expectRow(9, StartsWith(" Updated"));
    expectChosen("Cell 20");
    EXPECT_TRUE(terminal.waitUntil([&] { return terminal.chosen().size() == 39; })) << terminal.text();
    terminal.resize(50, 132);
    expectRow(49, StartsWith(" Updated"));
    expectChosen("Cell 20");
    expectRow(1, StartsWith(" Cell 00"));
    EXPECT_TRUE(terminal.waitUntil([&] { return terminal.chosen().size() == 79; })) << terminal.text();
}

TEST_F(Terminal, WorksAtTheSmallestSizes)
{
    startAndWait();
    for (const auto& [rows, columns] : {std::pair{1, 1}, {2, 3}, {3, 10}, {1, 80}, {24, 1}}) {
        terminal.resize(rows, columns);
        terminal.type("jlkh?x/a\r");
    }
    terminal.resize(24, 80);
    expectShown("Updated 20");
    expectShown("Serving Cell");
}

TEST_F(Terminal, ReportsALostServiceAndContinuesAfterItsReturn)
{
    startAndWait();
    terminal.type("jjj");
    expectChosen("Beat");
    device.killService();
    expectShown("Connecting...");
    EXPECT_TRUE(terminal.shows("Serving Cell")); // the last known values stay
    device.restartService();
    expectShown("Updated 20");
    expectRefresh();
    expectChosen("Beat");
}

TEST_F(Terminal, GoesBackWhenItsNodeIsRemoved)
{
    const auto without = propertyList(text("_sorted", "_sorted") + text("3;Beat", "alone") + text("4;Other", "1"));
    device.serve({display("tick"), without}, {"--speed", "0.1"}); // the second display comes after 5 s
    start();
    expectShown("Neighbours");
    terminal.type("jl");
    expectTitle("Kestrum › Neighbours");
    expectShown("alone");
    expectRow(0, " Kestrum");
}

TEST_F(Terminal, ShowsTheValueOfARowThatOpenedBefore)
{
    const auto before = propertyList(dictionary("Changing", text("a", "1") + text("b", "2")) + text("Other", "1"));
    const auto after = propertyList(text("Changing", "has a value now") + text("Other", "1"));
    device.serve({before, after}, {"--speed", "0.1"});
    start();
    expectShown("›");
    expectShown("has a value now");
    expectRow(1, " Changing" + std::string(55, ' ') + "has a value now");
}

/// A pane whose rows change: `rows` are shown one after the other.
class TerminalRows : public Terminal {
protected:
    static std::string list(const std::vector<std::string>& names)
    {
        std::string entries = text("_sorted", "_sorted");
        int number = 100;
        for (const auto& each : names)
            entries += dictionary(std::to_string(number++) + ";" + each,
                                  text("Name", "this is " + each) + text("Number", "1"));
        return propertyList(entries);
    }
    static std::vector<std::string> numbered(const std::string& name, int count)
    {
        std::vector<std::string> names;
        for (int i = 0; i < count; ++i)
            names.push_back(name + " " + std::to_string(100 + i));
        return names;
    }
    void show(const std::vector<std::string>& before, const std::vector<std::string>& after)
    {
        device.serve({list(before), list(after)}, {"--speed", "0.1"}); // the second display comes after 5 s
        start();
        expectShown(before.back().substr(0, 4));
    }
};

TEST_F(TerminalRows, KeepTheChoiceWhenOneIsInsertedAbove)
{
    show({"Neighbours", "State"}, {"Serving", "Neighbours", "State"});
    expectChosen("Neighbours");
    expectRow(1, StartsWith(" Serving"));
    expectRow(2, StartsWith(" Neighbours"));
    expectChosen("Neighbours");
    terminal.press(Key::Enter);
    expectTitle("Kestrum › Neighbours");
}

TEST_F(TerminalRows, HandTheChoiceToTheirNeighbour)
{
    show({"Serving", "Neighbours", "State", "Timers"}, {"Beacon", "Serving", "State", "Timers"});
    terminal.type("j");
    expectChosen("Neighbours");
    expectRow(1, StartsWith(" Beacon"));
    expectChosen("State");
}

TEST_F(TerminalRows, PassTheChoiceUpWhenTheLastIsRemoved)
{
    show({"Serving", "Neighbours", "State"}, {"Serving", "Neighbours"});
    terminal.type("G");
    expectChosen("State");
    expectGone("State");
    expectChosen("Neighbours");
}

TEST_F(TerminalRows, StayOnTheirLinesWhenSomeAreInsertedOutOfSight)
{
    auto before = numbered("Row", 60), after = numbered("New", 5);
    after.insert(after.end(), before.begin(), before.end());
    show(before, after);
    terminal.type("/Row 140\r");
    expectChosen("Row 140");
    const auto rows = terminal.row(1);
    const int line = terminal.rowOf("Row 140");
    expectShown("46/65"); // the new rows are there
    EXPECT_EQ(terminal.rowOf("Row 140"), line) << terminal.text();
    EXPECT_EQ(terminal.row(1), rows);
    expectChosen("Row 140");
}

TEST_F(TerminalRows, KeepTheirPlaceSideways)
{
    const std::string far(90, 'x');
    const auto row = [&](const std::string& name) { return text(name, "from " + far + " to"); };
    device.serve({propertyList(row("Long") + row("Other")), propertyList(row("Extra") + row("Long") + row("Other"))},
                 {"--speed", "0.1"});
    start();
    expectShown("Long");
    terminal.type(">>>>>>>>");
    expectRow(1, EndsWith("x to"));
    expectShown("Extra");
    expectRow(1, StartsWith(" Extra"));
    expectRow(2, EndsWith("x to"));
    expectRow(3, StartsWith(" Other"));
}

TEST_F(Terminal, StaysFastWithValuesOfMegabytes)
{
    const std::string huge(7 << 20, 'h');
    device.serve({propertyList(text("Huge", huge) + text("Other", "1"))});
    start();
    expectRow(1, StartsWith(" Huge     hhh"));
    expectRow(1, EndsWith("…"));
    terminal.type("jk>>j");
    expectChosen("Other");
    expectRow(1, StartsWith("…"));
    terminal.type("q");
    ASSERT_TRUE(terminal.waitForEnd());
    EXPECT_EQ(terminal.exitStatus(), 0);
}

class TerminalSave : public Terminal {
protected:
    void open()
    {
        device.offerSave();
        startAndWait();
        terminal.type("s");
        expectShown("Save Snapshot");
    }
    std::string saved()
    {
        std::error_code none;
        for (const auto& each : std::filesystem::directory_iterator(device.diagnosticLogs(), none)) {
            std::ifstream file(each.path());
            return {std::istreambuf_iterator<char>(file), {}};
        }
        return {};
    }
};

TEST_F(TerminalSave, IsNotOfferedOnOrdinaryDevices)
{
    startAndWait();
    EXPECT_FALSE(terminal.shows("s save"));
    terminal.type("sjj");
    expectChosen("Nothing");
    EXPECT_FALSE(terminal.shows("Save Snapshot"));
}

TEST_F(TerminalSave, WritesTheDescriptionThatWasTyped)
{
    open();
    expectShown("Snapshot (20");
    expectShown("✓");
    expectCursor();
    terminal.type("roof, north é 漢");
    expectShown("roof, north é 漢");
    terminal.press(Key::Enter);
    EXPECT_TRUE(terminal.waitUntil([&] { return terminal.chosen().empty() && !terminal.cursorVisible(); }));
    EXPECT_EQ(saved(), "") << "Return closes the field, and saves nothing";
    terminal.press(Key::Enter);
    expectGone("Save Snapshot");
    expectShown("Serving Cell");
    EXPECT_NE(saved().find("<string>roof, north é 漢</string>"), std::string::npos) << saved();
}

TEST_F(TerminalSave, ConfirmsWhereTheSnapshotIsForAWhile)
{
    open();
    clickOn("[ Save ]");
    expectShown("Saved to /");
    expectShown(".kestrum");
    expectRow(23, StartsWith(" Updated"));
    expectGone("Saved to /");
    expectGone(".kestrum");
}

TEST_F(TerminalSave, WritesATimestampAloneBeforeTheFirstConnection)
{
    device.offerSave();
    start();
    expectShown("Connecting...");
    terminal.type("s");
    expectShown("Save Snapshot");
    terminal.type("never seen\r\r");
    expectGone("Save Snapshot");
    EXPECT_THAT(saved(), HasSubstr("<key>Timestamp</key>"));
    EXPECT_THAT(saved(), testing::Not(HasSubstr("<key>Data</key>")));
    EXPECT_THAT(saved(), testing::Not(HasSubstr("<key>Description</key>")));
}

TEST_F(TerminalSave, StaysOverRemovedPanes)
{
    const auto without = [](const std::string& beat) {
        return propertyList(text("_sorted", "_sorted") + text("3;Beat", beat) + text("4;Other", "1"));
    };
    const auto deep = propertyList(
        dictionary("Top", dictionary("Middle", text("a", "1") + text("b", "2")) + text("Other", "1")) + text("x", "1"));
    device.offerSave();
    device.serve({deep, without("second"), without("third")}, {"--speed", "0.1"}); // one every 5 s
    start();
    expectShown("Top");
    terminal.type("ll");
    expectTitle("Kestrum › Top › Middle");
    terminal.type("s");
    expectShown("Save Snapshot");
    // A second display client shows the third message: the display under test has had the second, and only the root
    // pane is left under its sheet.
    Pseudoterminal other(24, 80);
    other.start("kestrum-terminal", {}, device.environment());
    EXPECT_TRUE(other.waitFor("third")) << other.text();
    EXPECT_TRUE(terminal.shows("Save Snapshot")) << terminal.text();
    terminal.press(Key::Escape);
    expectGone("Save Snapshot");
    expectRow(0, " Kestrum");
    expectShown("Beat");
}

TEST_F(TerminalSave, IsLeftWithEscape)
{
    open();
    terminal.type("q"); // typed like any other letter
    terminal.press(Key::Escape);
    expectGone("Save Snapshot");
    expectShown("Serving Cell");
    EXPECT_EQ(saved(), "");
}

TEST_F(TerminalSave, GoesRoundItsPartsWithTab)
{
    open();
    EXPECT_TRUE(terminal.waitFor("Snapshot (20"));
    terminal.press(Key::Tab);
    expectChosen("Snapshot (20");
    terminal.press(Key::Tab);
    const auto reverse = [&](const std::string& button) {
        const int row = terminal.rowOf(button);
        return row >= 0 && terminal.isReverse(row, static_cast<int>(terminal.row(row).find(button)));
    };
    EXPECT_TRUE(terminal.waitUntil([&] { return reverse("[ Save ]"); })) << terminal.text();
    terminal.press(Key::Tab);
    EXPECT_TRUE(terminal.waitUntil([&] { return reverse("[ Cancel ]"); })) << terminal.text();
    terminal.press(Key::Enter);
    expectGone("Save Snapshot");
    EXPECT_EQ(saved(), "");
}

TEST_F(TerminalSave, IsPressedWithTheMouse)
{
    open();
    clickOn("[ Save ]");
    expectGone("Save Snapshot");
    EXPECT_NE(saved(), "");
}

TEST_F(TerminalSave, SaysWhenTheFileCannotBeWritten)
{
    std::filesystem::create_directories(device.diagnosticLogs().parent_path());
    std::ofstream(device.diagnosticLogs()) << "in the way";
    open();
    terminal.type("\r\r");
    expectShown("File Error");
    expectShown("Unable to write file to disk");
    expectShown("[ Close ]");
    expectGone("Save Snapshot"); // closed behind the alert
    terminal.type("jq");         // the alert takes the keys
    terminal.press(Key::Enter);
    expectGone("File Error");
    expectChosen("Serving Cell");
}

TEST_F(Terminal, QuitsAndLeavesTheTerminalAsItWas)
{
    const auto before = terminal.modes();
    startAndWait();
    EXPECT_NE(terminal.modes().c_lflag, before.c_lflag);
    terminal.type("q");
    ASSERT_TRUE(terminal.waitForEnd());
    EXPECT_EQ(terminal.exitStatus(), 0);
    expectRestored(before);
}

class TerminalSignal : public Terminal, public testing::WithParamInterface<int> {};

TEST_P(TerminalSignal, EndsItAndLeavesTheTerminalAsItWas)
{
    const auto before = terminal.modes();
    startAndWait();
    terminal.signal(GetParam());
    ASSERT_TRUE(terminal.waitForEnd());
    EXPECT_EQ(terminal.exitStatus(), 0);
    expectRestored(before);
}

INSTANTIATE_TEST_SUITE_P(Signals, TerminalSignal, testing::Values(SIGTERM, SIGHUP, SIGINT),
                         [](const auto& each) { return std::string("Signal") + sigabbrev_np(each.param); });

class TerminalCrash : public Terminal, public testing::WithParamInterface<int> {};

TEST_P(TerminalCrash, GivesTheTerminalBackAndEndsWithItsSignal)
{
    const auto before = terminal.modes();
    // A sanitizer's handlers would end the program in another way.
    const std::string none = "handle_segv=0:handle_abort=0:handle_sigbus=0:handle_sigfpe=0:handle_sigill=0";
    startAndWait({{"ASAN_OPTIONS", none}, {"UBSAN_OPTIONS", none}});
    terminal.signal(GetParam());
    ASSERT_TRUE(terminal.waitForEnd());
    EXPECT_EQ(terminal.exitStatus(), 128 + GetParam());
    expectRestored(before);
    EXPECT_NE(terminal.written().find("\x1B[?1006;1000l"), std::string::npos) << "the mouse is still reported";
}

INSTANTIATE_TEST_SUITE_P(Signals, TerminalCrash, testing::Values(SIGSEGV, SIGABRT, SIGBUS, SIGFPE, SIGILL),
                         [](const auto& each) { return std::string("Signal") + sigabbrev_np(each.param); });

TEST_F(Terminal, EndsWithCtrlC)
{
    const auto before = terminal.modes();
    startAndWait();
    terminal.type("\x03");
    ASSERT_TRUE(terminal.waitForEnd());
    EXPECT_EQ(terminal.exitStatus(), 0);
    expectRestored(before);
}

TEST_F(Terminal, EndsWhenItsTerminalIsClosed)
{
    startAndWait();
    terminal.hangUp();
    ASSERT_TRUE(terminal.waitForEnd());
    EXPECT_EQ(terminal.exitStatus(), 0);
}

TEST_F(Terminal, StopsWithCtrlZAndComesBack)
{
    const auto before = terminal.modes();
    startAndWait();
    terminal.type("j\x1A");
    ASSERT_TRUE(terminal.waitForStop());
    expectRestored(before);
    terminal.signal(SIGCONT);
    EXPECT_TRUE(terminal.waitUntil([&] { return terminal.onAlternateScreen(); }));
    expectChosen("Neighbours");
    expectRefresh();
}

TEST_F(Terminal, EndsWhileItIsStopped)
{
    startAndWait();
    terminal.type("\x1A");
    ASSERT_TRUE(terminal.waitForStop());
    terminal.signal(SIGTERM);
    terminal.signal(SIGCONT);
    ASSERT_TRUE(terminal.waitForEnd());
    EXPECT_EQ(terminal.exitStatus(), 0);
    EXPECT_FALSE(terminal.onAlternateScreen());
}

bool setsColour(const std::string& written)
{
    // ESC [ 3x, 4x, 9x, 10x ... m: parameters from 30 to 49 and from 90 to 107 are colours.
    for (auto at = written.find("\x1B["); at != std::string::npos; at = written.find("\x1B[", at + 1)) {
        const auto end = written.find_first_not_of("0123456789;", at + 2);
        if (end == std::string::npos || written[end] != 'm')
            continue;
        int parameter = 0;
        for (auto each = at + 2; each <= end; ++each) {
            if (written[each] >= '0' && written[each] <= '9') {
                parameter = parameter * 10 + (written[each] - '0');
                continue;
            }
            if ((parameter >= 30 && parameter <= 49) || (parameter >= 90 && parameter <= 107))
                return true;
            parameter = 0;
        }
    }
    return false;
}

TEST_F(Terminal, UsesTheTerminalsColours)
{
    startAndWait();
    EXPECT_TRUE(terminal.isColoured(2, 78)); // the mark of a row that opens a pane
    EXPECT_FALSE(terminal.isColoured(2, 1));
    EXPECT_TRUE(setsColour(terminal.written()));
}

TEST_F(Terminal, SendsNoColourWhereNoneIsWanted)
{
    startAndWait({{"NO_COLOR", "1"}});
    terminal.type("?");
    expectShown("choose a row");
    EXPECT_FALSE(setsColour(terminal.written()));
    terminal.type("?");
    expectChosen("Serving Cell"); // in reverse video
}

TEST_F(Terminal, LosesNothingOnAMonochromeTerminal)
{
    startAndWait({{"TERM", "vt220"}});
    EXPECT_FALSE(setsColour(terminal.written()));
    expectChosen("Serving Cell");
    expectShown("›");
}

TEST_F(Terminal, DrawsInAsciiInAnAsciiLocale)
{
    startAndWait({{"LC_ALL", "POSIX"}});
    expectRow(1, " Serving Cell" + std::string(65, ' ') + ">");
    expectRow(5, " PLMN ????" + std::string(65, ' ') + "????");
    expectRow(7, EndsWith("~"));
}

TEST_F(Terminal, AssumesUnicodeIfNoLocaleIsSet)
{
    startAndWait({{"LC_ALL", ""}, {"LC_CTYPE", ""}, {"LANG", ""}});
    expectRow(1, EndsWith("›"));
}

TEST_F(Terminal, NamesAnUnknownKindOfTerminal)
{
    start({{"TERM", "no-such-terminal"}});
    ASSERT_TRUE(terminal.waitForEnd());
    EXPECT_EQ(terminal.exitStatus(), 1);
    EXPECT_TRUE(terminal.shows("kestrum-terminal: the terminal \"no-such-terminal\" is unknown on this system"))
        << terminal.text();
}

TEST_F(Terminal, RefusesATerminalThatCannotPlaceItsCursor)
{
    start({{"TERM", "dumb"}});
    ASSERT_TRUE(terminal.waitForEnd());
    EXPECT_EQ(terminal.exitStatus(), 1);
    EXPECT_TRUE(terminal.shows("cannot place its cursor")) << terminal.text();
}

// Tables and the overview

std::string cell(const char* number, const char* channel, const char* level)
{
    return dictionary(number, text("ARFCN", channel) + text("BSIC", "7") + text("RSSI", level) + text("C1", "12") +
                                  text("A first long key of the modem", "1") +
                                  text("A second long key of the modem", "2"));
}

/// `level` is that of the second neighbour.
std::string cells(const char* level)
{
    return propertyList(dictionary("Serving Cell", text("ARFCN", "60") + text("BSIC", "28") + text("RSSI", "-53 dBm")) +
                        dictionary("Neighbor Cells", cell("0", "38", "-79 dBm") + cell("1", "64", level)));
}

class TerminalSheets : public Terminal {
protected:
    void startWithCells(std::map<std::string, std::string> changes = {})
    {
        device.serve({cells("-110 dBm"), cells("-110 dBm")});
        start(std::move(changes));
        ASSERT_TRUE(terminal.waitFor("Updated 20")) << terminal.text();
    }
    void openTable()
    {
        terminal.type("jl");
        expectTitle("Kestrum › Neighbor Cells");
        expectShown("v table");
        terminal.type("v");
        expectRow(1, HasSubstr("BSIC  ARFCN  RSSI dBm"));
    }
};

TEST_F(TerminalSheets, ShowAListAsATable)
{
    startWithCells();
    openTable();
    expectTitle("Neighbor Cells");
    expectRow(0, EndsWith("S serving cell"));
    expectRow(1, StartsWith("  BSIC  ARFCN  RSSI dBm ↓"));
    expectRow(2, StartsWith("S   28     60         -53 █████████▎ excellent"));
    expectRow(3, StartsWith("     7     38         -79 █████····· good        12"));
    expectRow(4, StartsWith("     7     64        -110 ·········· no service  12"));
    expectRow(23, HasSubstr("Tab sort  ? help  Esc back"));
    EXPECT_TRUE(terminal.shows("…")) << "more columns stand at the right";
    terminal.press(Key::Escape);
    expectTitle("Kestrum › Neighbor Cells");
    expectChosen("0");
}

TEST_F(TerminalSheets, SortByAnyColumn)
{
    startWithCells();
    openTable();
    terminal.press(Key::Tab);
    expectRow(1, HasSubstr("C1 ↓"));
    terminal.type("r");
    expectRow(1, HasSubstr("C1 ↑"));
    clickOn("ARFCN");
    expectRow(1, HasSubstr("ARFCN ↑"));
    expectRow(3, HasSubstr("38"));
    clickOn("ARFCN");
    expectRow(3, HasSubstr("64"));
}

TEST_F(TerminalSheets, ScrollColumnsSideways)
{
    startWithCells();
    openTable();
    EXPECT_FALSE(terminal.shows("A second long key"));
    terminal.type("l");
    terminal.press(Key::Right);
    expectRow(1, AllOf(StartsWith("  BSIC  ARFCN  A first"), HasSubstr("A second long key")));
    terminal.type("hh");
    expectRow(1, HasSubstr("RSSI dBm"));
}

TEST_F(TerminalSheets, UseTheWholeWidthOfTheTerminal)
{
    startWithCells();
    openTable();
    EXPECT_FALSE(terminal.shows("A second long key"));
    terminal.resize(24, 140);
    expectRow(1, AllOf(HasSubstr("RSSI dBm"), HasSubstr("A second long key")));
}

TEST_F(TerminalSheets, LoseNothingWithoutColourAndUnicode)
{
    startWithCells({{"LC_ALL", "POSIX"}, {"NO_COLOR", "1"}});
    terminal.type("jl");
    expectShown("v table");
    terminal.type("v");
    expectRow(3, StartsWith("     7     38         -79 #####..... good"));
    expectRow(1, HasSubstr("RSSI dBm v"));
}

TEST_F(TerminalSheets, OverviewOpensFromTheFirstPaneAndCloses)
{
    startWithCells();
    expectShown("o overview");
    terminal.type("o");
    expectTitle("Overview");
    expectRow(1, StartsWith(" Serving cell  ARFCN 60  BSIC 28"));
    expectRow(2, AllOf(HasSubstr("RSSI"), HasSubstr("-53 dBm"), HasSubstr("excellent")));
    expectShown("Neighbor Cells");
    terminal.type("?");
    expectShown("What it means");
    terminal.type("?");
    expectGone("What it means");
    terminal.click(0, 3);
    expectTitle("Kestrum");
    expectChosen("Serving Cell");
}

TEST_F(TerminalSheets, TrendOpensFromARowAndTakesTheKeys)
{
    startWithCells();
    terminal.type("l");
    expectTitle("Kestrum › Serving Cell");
    terminal.type("G");
    expectChosen("RSSI");
    expectShown("t trend  i meaning");
    terminal.type("t");
    expectTitle("RSSI");
    const auto isReverse = [&](const std::string& text) {
        const int row = terminal.rowOf("15 min  1 h  1 day");
        return row >= 0 && terminal.isReverse(row, static_cast<int>(terminal.row(row).find(text)));
    };
    EXPECT_TRUE(terminal.waitUntil([&] { return isReverse("15 min"); })) << terminal.text();
    expectShown("excellent");
    terminal.type("2");
    EXPECT_TRUE(terminal.waitUntil([&] { return isReverse("1 h"); })) << terminal.text();
    terminal.press(Key::Tab);
    EXPECT_TRUE(terminal.waitUntil([&] { return isReverse("1 day"); })) << terminal.text();
    clickOn("15 min");
    EXPECT_TRUE(terminal.waitUntil([&] { return isReverse("15 min"); })) << terminal.text();
    expectShown("RSSI, -53 dBm now");
    const int reading = terminal.rowOf("-53 dBm, excellent");
    terminal.press(Key::Home);
    EXPECT_TRUE(terminal.waitUntil([&] { return terminal.isBold(reading, 77); })) << terminal.text();
    terminal.type("t");
    expectTitle("Kestrum › Serving Cell");
    expectChosen("RSSI");
}

struct PlotCase {
    std::map<std::string, std::string> environment;
    std::string samples; ///< two samples of -53 dBm
};
class TerminalPlots : public TerminalSheets, public testing::WithParamInterface<PlotCase> {};

TEST_P(TerminalPlots, AreDrawnWithTheCharactersThatTheTerminalHas)
{
    startWithCells(GetParam().environment);
    terminal.type("lGt");
    expectShown("RSSI, -53 dBm now");
    expectShown(" " + GetParam().samples);
}

INSTANTIATE_TEST_SUITE_P(Terminals, TerminalPlots,
                         testing::Values(PlotCase{{}, "⠈"}, PlotCase{{{"TERM", "linux"}}, "▇"},
                                         PlotCase{{{"KESTRUM_PLOT", "blocks"}}, "▇"},
                                         PlotCase{{{"LC_ALL", "POSIX"}}, "'"}));

TEST_F(TerminalSheets, MeaningIsWrappedAndEventsAreListed)
{
    terminal.resize(24, 40);
    startWithCells();
    terminal.type("lGi");
    expectTitle("RSSI");
    EXPECT_TRUE(terminal.waitUntil([&] { return !terminal.row(3).empty(); })) << terminal.text();
    for (int row = 1; row < 10; ++row)
        EXPECT_THAT(terminal.row(row), testing::Not(HasSubstr("…")));
    terminal.type("i");
    expectTitle("Kestrum › Serving Cell");
    terminal.type("e");
    expectTitle("Events");
    expectShown("Time");
    terminal.press(Key::Escape);
    expectTitle("Kestrum › Serving Cell");
}

TEST_F(TerminalSheets, FollowTheRefresh)
{
    device.serve({cells("-110 dBm"), cells("-110 dBm"), cells("-60 dBm")}); // four in each refresh
    start();
    ASSERT_TRUE(terminal.waitFor("Updated 20"));
    openTable();
    expectShown("-110");
    expectRefresh();
    EXPECT_TRUE(terminal.waitUntil([&] { return terminal.shows("-60"); })) << terminal.text();
}

TEST_F(TerminalSheets, KeepTheirPlaceWhenRowsComeAtTheFront)
{
    const auto many = [](int more) {
        std::string list;
        for (int i = 0; i < 40 + more; ++i) // the newest have the best levels, and come first
            list += cell(std::to_string(i).c_str(), std::to_string(100 + i).c_str(),
                         ("-" + std::to_string(110 - i) + " dBm").c_str());
        return propertyList(dictionary("Neighbor Cells", list));
    };
    std::vector<std::string> displays(12, many(0)); // 6 s
    displays.resize(200, many(5));
    device.serve(displays);
    start();
    ASSERT_TRUE(terminal.waitFor("Updated 20")) << terminal.text();
    terminal.type("l");
    expectShown("v table");
    terminal.type("v");
    expectRow(0, EndsWith("1-22/41")); // with the heading
    terminal.type("jjjjj");
    expectRow(0, EndsWith("6-27/41"));
    const auto third = terminal.row(3);
    EXPECT_THAT(third, HasSubstr("133")) << terminal.text();
    expectRow(0, EndsWith("11-32/46"));
    expectRow(3, third);
}

TEST_F(TerminalSheets, FitASmallTerminal)
{
    startWithCells();
    openTable();
    terminal.resize(6, 20);
    expectRow(1, StartsWith("  BSIC  ARFCN"));
    terminal.resize(1, 3);
    terminal.resize(24, 80);
    expectRow(4, HasSubstr("-110"));
}

} // namespace
} // namespace kestrum
