#include "Demonstration.h"
#include "Pseudoterminal.h"
#include "core/KestrumModelNode.h"
#include "doubles/Places.h"
#include "frontends/terminal/TextDisplay.h"

#include <gtest/gtest.h>

#include <cstdio>
#include <sys/wait.h>

namespace kestrum {
namespace {

struct Outcome {
    int status;
    std::string output, errors;
};

/// The program between pipes, with neither terminal nor display server.
Outcome run(const Demonstration& device, const std::string& arguments)
{
    std::string command = "env";
    for (const auto& [name, value] : device.environment())
        command += " " + name + "='" + value + "'";
    command += " '" + builtProgram("kestrum-terminal") + "' " + arguments + " </dev/null";
    const auto output = [](const std::string& shell, int& status) {
        std::string text;
        auto* pipe = popen(shell.c_str(), "r");
        for (int c; (c = std::fgetc(pipe)) != EOF;)
            text += static_cast<char>(c);
        status = WEXITSTATUS(pclose(pipe));
        return text;
    };
    Outcome outcome;
    const auto all = output(command + " 2>&1 >/dev/null", outcome.status);
    outcome.errors = all;
    outcome.output = outcome.status == 0 ? output(command + " 2>/dev/null", outcome.status) : std::string();
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
              "kestrum-terminal: standard input and output are no terminal; --text prints without one\n");
}

TEST(TextMode, RefusesWhatIsNoNumberOfRefreshes)
{
    EXPECT_EQ(run(Demonstration(), "--text 0").status, 2);
    EXPECT_EQ(run(Demonstration(), "--text soon").status, 2);
    EXPECT_EQ(run(Demonstration(), "--window").status, 2);
}

TEST(TextMode, SaysItsVersion)
{
    EXPECT_EQ(run(Demonstration(), "--version").output.find("kestrum-terminal "), 0u);
}

TEST(TextMode, ShowsAnEmptyTreeAsItsTitle)
{
    PathDictionary paths;
    EXPECT_EQ(treeText(*KestrumModelNode::makeTreeFromObject(Value(), paths)), "Kestrum: (unknown)\n");
}

} // namespace
} // namespace kestrum
