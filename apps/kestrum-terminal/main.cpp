#include "apps/kestrum-terminal/TextDisplay.h"
#include "frontends/terminal/TerminalToolkit.h"
#include "platform/posix/SignalPipe.h"
#include "platform/qt/LinuxDevice.h"
#include "ui/KestrumApp.h"

#include <CLI/CLI.hpp>
#include <QCoreApplication>
#include <QSocketNotifier>

#include <csignal>
#include <fcntl.h>
#include <iostream>
#include <string>
#include <unistd.h>

using namespace kestrum;

namespace {

/// Prints the display to standard output; returns the exit status. After SIGTERM, SIGINT or SIGHUP it removes its
/// sockets and returns 128 plus the signal's number.
int printDisplay(MonitorRoles& roles, int refreshes)
{
    std::signal(SIGPIPE, SIG_IGN); // the write reports a reader that has closed the pipe
    int endedBy = 0;
    SignalPipe pipe({SIGTERM, SIGHUP, SIGINT});
    QSocketNotifier signalled(pipe.descriptor(), QSocketNotifier::Read);
    QObject::connect(&signalled, &QSocketNotifier::activated, [&] {
        for (const int each : pipe.taken())
            endedBy = each;
        if (endedBy != 0)
            QCoreApplication::quit();
    });
    TextDisplay display(roles, std::cout, refreshes, [](int status, const std::string& why) {
        if (!why.empty())
            std::cerr << "kestrum-terminal: " << why << '\n';
        QCoreApplication::exit(status);
    });
    display.start();
    const int status = QCoreApplication::exec();
    return endedBy == 0 ? status : 128 + endedBy;
}

} // namespace

int main(int argc, char** argv)
{
    // The first file that the program opens would take the descriptor of a closed standard output.
    const bool hasOutput = fcntl(STDOUT_FILENO, F_GETFD) != -1;
    const auto charset = terminal::chooseLocale();
    const QCoreApplication loop(argc, argv);

    CLI::App arguments("Cellular field test in a terminal. The key ? shows all keys.");
    constexpr int kRefreshes = 3;
    int refreshes = 0; // stays 0 when --text has no number
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

    const auto problem = terminal::TerminalToolkit::problem();
    if (!*text && problem) {
        std::cerr << "kestrum-terminal: " << problem->text << "; --text needs no terminal\n";
        return 1;
    }

    if (*text && !hasOutput) {
        std::cerr << "kestrum-terminal: standard output is closed\n";
        return 1;
    }
    if (refreshes == 0)
        refreshes = kRefreshes;

    terminal::TerminalToolkit toolkit(charset);
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
