// Standing still in the real program, with the real telephony service.
#include "Demonstration.h"
#include "Pseudoterminal.h"

#include <gmock/gmock.h>

#include <cstdlib>
#include <sstream>
#include <string>
#include <vector>

namespace kestrum {
namespace {

using testing::HasSubstr, testing::StartsWith;

constexpr int kBottom = 23;

/// A display of an IFX modem that names its message.
std::string display(int message)
{
    const auto level = "-" + std::to_string(80 + message % 40) + " dBm";
    return propertyList(text("_sorted", "_sorted") +
                        dictionary("0;Serving Cell", text("Message", std::to_string(message)) + text("RSRP", level)) +
                        text("1;Message", std::to_string(message)));
}

std::string withoutGaps(const std::string& line)
{
    std::istringstream words(line);
    std::string result;
    for (std::string word; words >> word;)
        result += (result.empty() ? "" : " ") + word;
    return result;
}

class TerminalFreeze : public testing::Test {
protected:
    TerminalFreeze()
    {
        for (int i = 1; i <= 200; ++i)
            messages.push_back(display(i));
    }

    void start()
    {
        device.serve(messages);
        auto environment = device.environment();
        environment.merge(std::map<std::string, std::string>{{"NO_COLOR", ""}, {"LC_ALL", "C.UTF-8"}});
        terminal.start("kestrum-terminal", {}, environment);
        ASSERT_TRUE(terminal.waitFor("Updated 20")) << terminal.text();
    }
    void expectBottom(const testing::Matcher<std::string>& matcher)
    {
        terminal.waitUntil([&] { return matcher.Matches(terminal.row(kBottom)); });
        EXPECT_THAT(terminal.row(kBottom), matcher) << terminal.text();
    }
    /// The number of the message in the row of the root pane; 0 while it shows none.
    int message() const
    {
        const auto row = withoutGaps(terminal.row(2));
        return terminal.row(0) == " Kestrum" && row.starts_with("Message ") ? std::atoi(row.substr(8).c_str()) : 0;
    }
    /// The rows of the pane "Serving Cell": "Key value".
    std::vector<std::string> rows()
    {
        std::vector<std::string> all;
        terminal.waitUntil([&] {
            all = {withoutGaps(terminal.row(1)), withoutGaps(terminal.row(2))};
            return terminal.row(0) == " Kestrum › Serving Cell" && all[0].starts_with("Message ") &&
                   all[1].ends_with(" dBm");
        });
        return all;
    }

    /// The panes as kestrum-decode shows them after that many messages.
    std::string decoded(int count) const
    {
        const auto capture = device.directory() / "beginning.kcap";
        writeCapture(capture, {messages.begin(), messages.begin() + count});
        Pseudoterminal reader(24, 80);
        reader.start("kestrum-decode", {capture.string()}, {});
        reader.waitForEnd();
        reader.takeInTheRest();
        std::string tree = withoutGaps(reader.text());
        std::erase(tree, ':');
        return tree;
    }

    Demonstration device;
    Pseudoterminal terminal{24, 80};
    std::vector<std::string> messages;
};

TEST_F(TerminalFreeze, StandsStillWithSpaceAndFollowsTheModemAgain)
{
    start();
    terminal.type(" ");
    expectBottom(StartsWith(" Frozen since "));
    expectBottom(HasSubstr("Space live"));
    const auto rows = terminal.row(2);
    expectBottom(HasSubstr(". on")); // a refresh came meanwhile
    EXPECT_EQ(terminal.row(2), rows);
    terminal.type(" ");
    expectBottom(StartsWith(" Updated 20"));
    EXPECT_TRUE(terminal.waitUntil([&] { return terminal.row(2) != rows; }));
    EXPECT_TRUE(terminal.waitUntil([&] { return !terminal.shows("live"); })) << terminal.text();
}

TEST_F(TerminalFreeze, ShowsWhatTheDecoderShowsAtThatMessage)
{
    start();
    terminal.type(" ");
    expectBottom(HasSubstr(". on"));
    terminal.type(".");
    expectBottom(HasSubstr(", frozen since "));
    int before = 0;
    for (int step = 0; step < 2; ++step) {
        ASSERT_TRUE(terminal.waitUntil([&] { return message() != 0 && message() != before; })) << terminal.text();
        const int shown = message();
        terminal.type("l");
        EXPECT_EQ(decoded(shown), "Serving Cell " + rows()[0] + " " + rows()[1] + " Message " + std::to_string(shown));
        terminal.type("h");
        EXPECT_TRUE(terminal.waitUntil([&] { return message() == shown; })) << "the same moment\n" << terminal.text();
        terminal.type(",");
        before = shown;
    }
}

TEST_F(TerminalFreeze, TypesABlankWhereATextIsEdited)
{
    device.offerSave();
    start();
    terminal.type("/g C");
    expectBottom(" /g C");
    terminal.type("\r");
    expectBottom(StartsWith(" Updated 20"));
    terminal.type("sa b");
    ASSERT_TRUE(terminal.waitUntil([&] { return terminal.row(3) == " a b"; })) << terminal.text();
    EXPECT_FALSE(terminal.shows("rozen"));
}

TEST_F(TerminalFreeze, OffersItsWaysToTheMouse)
{
    device.offerSave();
    terminal.resize(20, 40);
    start();
    terminal.type(" ");
    ASSERT_TRUE(terminal.waitFor("Space live")) << terminal.text();
    EXPECT_THAT(terminal.row(19), HasSubstr("s save")) << "on 40 columns too";
    const int row = terminal.rowOf("Space live");
    terminal.click(row, static_cast<int>(terminal.row(row).find("Space live")));
    EXPECT_TRUE(terminal.waitFor("Updated 20")) << terminal.text();
}

} // namespace
} // namespace kestrum
