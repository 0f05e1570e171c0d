#include "frontends/terminal/TerminalToolkit.h"
#include "frontends/terminal/TextDisplay.h"
#include "platform/qt/LinuxDevice.h"
#include "ui/KestrumApp.h"

#include <CLI/CLI.hpp>
#include <QCoreApplication>

#include <fcntl.h>
#include <iostream>
#include <unistd.h>

using namespace kestrum;

int main(int argc, char** argv)
{
    // What the program opens first would take the place of a closed output.
    const bool hasOutput = fcntl(STDOUT_FILENO, F_GETFD) != -1;
    const auto charset = chooseLocale();
    const QCoreApplication loop(argc, argv);

    CLI::App arguments("Cellular field test in a terminal. Keys: ? shows them.");
    constexpr int kRefreshes = 3;
    int refreshes = 0; // stays 0 for a bare --text
    arguments.set_version_flag("--version", "kestrum-terminal " KESTRUM_VERSION);
    const auto* text = arguments.add_option("--text", refreshes, "Print the tree of the first N refreshes, then end")
                           ->option_text("[N=3]")
                           ->expected(0, 1)
                           ->check(CLI::Range(1, 1'000'000'000));
    try {
        arguments.parse(argc, argv);
    } catch (const CLI::ParseError& error) {
        return arguments.exit(error) == 0 ? 0 : 2;
    }

    const auto problem = TerminalToolkit::problem();
    if (!*text && problem) {
        std::cerr << "kestrum-terminal: " << *problem << "; --text prints without one\n";
        return 1;
    }

    if (*text && !hasOutput) {
        std::cerr << "kestrum-terminal: standard output is closed\n";
        return 1;
    }
    if (refreshes == 0)
        refreshes = kRefreshes;

    TerminalToolkit toolkit(charset);
    LinuxDevice device("kestrum-terminal", LinuxDevice::Output::Quiet);
    auto roles = device.applicationRoles(toolkit);
    int status = 0;
    if (*text) {
        status = printDisplay(roles, refreshes);
    } else {
        const auto application = KestrumApp::make(roles);
        status = toolkit.run(*application);
    }
    device.dropQueued();
    return status;
}
