// The environment of every test program and of the programs that it starts: free of settings of the machine, the user
// and the shell. It is linked into each test program, and runs before main() and before other objects' constructors.
#include "harness/Places.h"

#include <csignal>
#include <cstdlib>
#include <string>
#include <string_view>
#include <sys/stat.h>
#include <unistd.h>
#include <vector>

namespace {

/// Variables for the paths of programs and scratch space, and for the settings of the test libraries and the
/// sanitizers.
bool isKept(std::string_view variable)
{
    for (const std::string_view kept : {"PATH=", "TMPDIR=", "LD_LIBRARY_PATH=", "GTEST_", "RC_PARAMS=", "ASAN_OPTIONS=",
                                        "LSAN_OPTIONS=", "UBSAN_OPTIONS=", "QT_NO_GLIB="})
        if (variable.starts_with(kept))
            return true;
    return false;
}

[[gnu::constructor(101)]] void leanOnNothingOfTheHost()
{
    std::vector<std::string> kept;
    for (char** each = environ; *each != nullptr; ++each)
        if (isKept(*each))
            kept.emplace_back(*each);
    ::clearenv();
    for (const auto& each : kept)
        ::setenv(each.substr(0, each.find('=')).c_str(), each.c_str() + each.find('=') + 1, 1);

    ::setenv("LC_ALL", "C.UTF-8", 1);
    ::setenv("TZ", "UTC", 1);
    ::setenv("HOME", "/nonexistent", 1);
    ::setenv("DBUS_SESSION_BUS_ADDRESS", "unix:path=/nonexistent/session", 1);
    ::setenv("DBUS_SYSTEM_BUS_ADDRESS", "unix:path=/nonexistent/system", 1);
    ::setenv("FONTCONFIG_FILE", kestrum::inCheckout("tests/harness/fonts.conf").c_str(), 1);
    ::umask(022);

    // A shell's background jobs and nohup start with some signals ignored. Child processes would inherit that.
    for (const int each : {SIGHUP, SIGINT, SIGQUIT, SIGPIPE, SIGTERM})
        std::signal(each, SIG_DFL);
    sigset_t none;
    sigemptyset(&none);
    sigprocmask(SIG_SETMASK, &none, nullptr);
}

} // namespace
