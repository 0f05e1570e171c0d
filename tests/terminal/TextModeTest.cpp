#include "Demonstration.h"
#include "Pseudoterminal.h"
#include "apps/kestrum-terminal/TextDisplay.h"
#include "core/KestrumModelNode.h"
#include "doubles/MonitorDoubles.h"
#include "harness/Places.h"

#include <gmock/gmock.h>

#include <chrono>
#include <csignal>
#include <cstdio>
#include <optional>
#include <sstream>
#include <sys/wait.h>
#include <utility>

namespace kestrum {
namespace {

using namespace std::chrono_literals;

struct Outcome {
    int status;
    std::string output, errors;
};

/// The standard output and the exit status of a shell command.
Outcome runShell(const std::string& shell)
{
    Outcome outcome{};
    auto* pipe = popen(shell.c_str(), "r");
    for (int c; (c = std::fgetc(pipe)) != EOF;)
        outcome.output += static_cast<char>(c);
    outcome.status = WEXITSTATUS(pclose(pipe));
    return outcome;
}

std::string command(const Demonstration& device, const std::string& arguments)
{
    std::string command = "env --default-signal=PIPE"; // the process that runs the tests may ignore it
    for (const auto& [name, value] : device.environment())
        command += " " + name + "='" + value + "'";
    return command + " '" + builtProgram("kestrum-terminal") + "' " + arguments + " </dev/null";
}

/// The program with pipes for its standard streams, without a terminal or display server.
Outcome run(const Demonstration& device, const std::string& arguments)
{
    auto outcome = runShell(command(device, arguments) + " 2>&1 >/dev/null");
    outcome.errors = std::exchange(outcome.output, {});
    if (outcome.status == 0)
        outcome.output = runShell(command(device, arguments) + " 2>/dev/null").output;
    return outcome;
}

const std::string kDisplay =
    propertyList(text("_sorted", "_sorted") +
                 dictionary("0;Serving Cell", text("Physical Cell ID", "101") + text("RSRP", "-97 dBm")) +
                 text("1;State", "idle&#x9B;2J"));

TEST(TextMode, PrintsThreeRefreshesUnlessToldOtherwise)
{
    Demonstration device;
    device.serve({kDisplay});
    const auto outcome = run(device, "--text");
    EXPECT_EQ(outcome.status, 0) << outcome.errors;
    std::size_t shown = 0;
    for (auto at = outcome.output.find("Updated "); at != std::string::npos;
         at = outcome.output.find("Updated ", at + 1))
        ++shown;
    EXPECT_EQ(shown, 3u) << outcome.output;
}

TEST(TextMode, PrintsTheTreeOfTheFirstRefreshes)
{
    Demonstration device;
    device.serve({kDisplay});
    const auto outcome = run(device, "--text 2");
    EXPECT_EQ(outcome.status, 0);
    const std::string tree = "Kestrum\n"
                             "  Serving Cell\n"
                             "    Physical Cell ID: 101\n"
                             "    RSRP: -97 dBm\n"
                             "  State: idle\uFFFD2J\n\n";
    const auto first = outcome.output.find(tree);
    ASSERT_NE(first, std::string::npos) << outcome.output;
    EXPECT_EQ(outcome.output.find("Updated 20"), 0u);
    const auto second = outcome.output.find(tree, first + 1);
    ASSERT_NE(second, std::string::npos) << outcome.output;
    EXPECT_EQ(second + tree.size(), outcome.output.size());
    EXPECT_EQ(outcome.errors, "");
}

TEST(TextMode, IsNamedWhereThereIsNoTerminal)
{
    const auto outcome = run(Demonstration(), "");
    EXPECT_EQ(outcome.status, 1);
    EXPECT_EQ(outcome.errors,
              "kestrum-terminal: standard input and output are not a terminal; --text needs no terminal\n");
}

TEST(TextMode, RefusesWhatItDoesNotKnowByItsName)
{
    const auto expectRefused = [](const std::string& arguments, const std::string& named) {
        const auto outcome = run(Demonstration(), arguments);
        EXPECT_EQ(outcome.status, 2);
        EXPECT_THAT(outcome.errors, testing::HasSubstr(named));
        EXPECT_LE(outcome.errors.size(), 120u) << outcome.errors;
    };
    expectRefused("--text 0", "--text: Value 0 not in range");
    expectRefused("--text soon", "--text: Value soon not in range");
    expectRefused("--text -3", "--text: Value -3 not in range");
    expectRefused("--window", "--window");
    expectRefused("lte", "lte");
}

TEST(TextMode, SaysThatItsOutputCannotBeWritten)
{
    Demonstration device;
    device.serve({kDisplay});
    const auto full = runShell("exec 2>&1; " + command(device, "--text") + " >/dev/full");
    EXPECT_EQ(full.status, 1);
    EXPECT_EQ(full.output, "kestrum-terminal: standard output: No space left on device\n");
    const auto closed = runShell("exec 3>&1; " + command(device, "--text") + " 2>&3 >&-");
    EXPECT_EQ(closed.status, 1);
    EXPECT_EQ(closed.output, "kestrum-terminal: standard output is closed\n");
}

TEST(TextMode, EndsQuietlyAfterItsReaderHasClosed)
{
    Demonstration device;
    device.serve({kDisplay});
    // The pipe's reader closes it before the first tree is written.
    const auto outcome = runShell("{ { " + command(device, "--text 1000") + "; echo $? >&3; } 2>&3 | true; } 3>&1");
    EXPECT_EQ(outcome.output, "0\n");
    EXPECT_EQ(device.displaysSockets(), 0u);
}

TEST(TextMode, LeavesNoSocketBehindWhateverEndsIt)
{
    Demonstration device;
    device.serve({kDisplay});
    for (const int signal : {SIGTERM, SIGINT, SIGHUP}) {
        Pseudoterminal terminal(24, 80);
        terminal.start("kestrum-terminal", {"--text", "1000"}, device.environment());
        ASSERT_TRUE(terminal.waitFor("Kestrum")) << terminal.text();
        EXPECT_EQ(device.displaysSockets(), 1u);
        terminal.signal(signal);
        ASSERT_TRUE(terminal.waitForEnd());
        EXPECT_EQ(terminal.exitStatus(), 128 + signal);
        EXPECT_EQ(device.displaysSockets(), 0u);
    }
}

/// The display as text, with a virtual clock. The test is the telephony service.
class PatientText : public testing::Test, protected MonitorDoubles {
protected:
    PatientText()
    {
        propertyLists.parsed["reply"] = makeDictionary({{"GetTechnology", "kVoxLogChannelTechnology_IFX"}});
        propertyLists.parsed["list"] = makeDictionary({{"State", "idle"}});
        ports.serve("vox.commands", [](const MemoryPorts::Request& request) {
            const bool asks = request.text().find("GetTechnology") != std::string::npos;
            return asks ? MemoryPorts::Answer{0, Data(bytesOf("reply"))} : MemoryPorts::Answer{};
        });
        display.start();
    }
    void stream() { ports.send("org.kestrum.vox.baseband-state-report.log", 0, "list"); }

    std::ostringstream out;
    std::optional<int> status;
    std::string why;
    TextDisplay display{monitorRoles, out, 16, [this](int ended, const std::string& reason) {
                            status = ended;
                            why = reason;
                        }};
};

TEST_F(PatientText, GivesUpWhenNothingComes)
{
    queue.advance(29s);
    EXPECT_FALSE(status);
    queue.advance(1s);
    EXPECT_EQ(status, 1);
    EXPECT_EQ(why, "the telephony service sent nothing for 30 s");
}

TEST_F(PatientText, WaitsThirtySecondsFromTheLastData)
{
    for (int i = 0; i < 15; ++i) {
        queue.advance(25s);
        stream();
    }
    queue.advance(2s);
    EXPECT_FALSE(status) << why;
    EXPECT_THAT(out.str(), testing::HasSubstr("State: idle"));
    stream();
    queue.advance(2s);
    EXPECT_EQ(status, 0);
}

TEST_F(PatientText, GivesUpWhenNoMoreComes)
{
    queue.advance(25s);
    stream();
    queue.advance(40s);
    EXPECT_EQ(status, 1);
}

TEST(TextMode, SaysItsVersion)
{
    EXPECT_EQ(run(Demonstration(), "--version").output.find("kestrum-terminal "), 0u);
}

TEST(Service, SurvivesTheSignalOfAClosedPipe)
{
    Demonstration device;
    device.serve({kDisplay});
    device.signalService(SIGPIPE);
    EXPECT_EQ(run(device, "--text 1").status, 0);
}

TEST(Service, RefusesNumbersThatAreNone)
{
    for (const std::string number : {"nan", "inf", "-nan", "0", "x"})
        for (const std::string option : {"--speed", "--seconds"}) {
            const auto outcome = runShell("'" + builtProgram("voxd") + "' --scenario lte --write /dev/null " + option +
                                          " " + number + " 2>&1");
            EXPECT_EQ(outcome.status, 2) << option << " " << number;
            EXPECT_EQ(outcome.output.find(option + ": "), 0u) << outcome.output;
        }
    const auto unknown = runShell("'" + builtProgram("voxd") + "' --scenario lte --sped 2 2>&1");
    EXPECT_EQ(unknown.status, 2);
    EXPECT_THAT(unknown.output, testing::HasSubstr("--sped"));
}

TEST(TextMode, ShowsAnEmptyTreeAsItsTitle)
{
    PathDictionary paths;
    EXPECT_EQ(treeText(*KestrumModelNode::makeTreeFromObject(Value(), paths)), "Kestrum: (unknown)\n");
}

} // namespace
} // namespace kestrum
