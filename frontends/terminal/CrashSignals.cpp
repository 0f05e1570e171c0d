#include "frontends/terminal/CrashSignals.h"

#include <array>
#include <csignal>
#include <cstddef>
#include <cstdint>
#include <unistd.h>

// term.h defines macros like `columns`.
#include <curses.h>
#include <term.h>

namespace kestrum::terminal {

namespace {

constexpr std::array kSignals = {SIGSEGV, SIGABRT, SIGBUS, SIGFPE, SIGILL};

// The handler uses only what was prepared before: in a crash neither memory nor the terminal library can be trusted.
termios modes;
std::array<char, 512> farewell;
std::size_t farewellBytes = 0;
std::array<struct sigaction, kSignals.size()> before;
// for the handler: the program's stack may have overflowed
alignas(std::max_align_t) std::array<std::byte, 64 << 10> stack;

void giveBack(int signal)
{
    tcsetattr(STDOUT_FILENO, TCSANOW, &modes);
    [[maybe_unused]] const auto written = write(STDOUT_FILENO, farewell.data(), farewellBytes);
    for (std::size_t i = 0; i < kSignals.size(); ++i)
        sigaction(kSignals[i], &before[i], nullptr);
    raise(signal); // pending until this handler returns; then the signal has its default effect
}

// The library marks a capability that is not a string by -1.
bool isText(const char* capability)
{
    return capability != nullptr && reinterpret_cast<std::intptr_t>(capability) != -1;
}

void add(const char* capability)
{
    if (!isText(capability))
        return;
    tputs(capability, 1, [](int byte) {
        if (farewellBytes < farewell.size())
            farewell[farewellBytes++] = static_cast<char>(byte);
        return byte;
    });
}

// The same steps as the terminal library's when it closes the screen.
void composeFarewell()
{
    farewellBytes = 0;
    if (char* const mouse = tigetstr("XM"); isText(mouse))
        add(tparm(mouse, 0));
    else if (has_mouse())
        add("\x1B[?1000l");
    for (const char* each : {"sgr0", "op", "rmkx", "cnorm"})
        add(tigetstr(each));
    if (const char* const leave = tigetstr("rmcup"))
        add(leave);
    else
        add(tparm(tigetstr("cup"), LINES - 1, 0));
}

} // namespace

CrashSignals::CrashSignals(const termios& modesBefore)
{
    modes = modesBefore;
    composeFarewell();
    stack_t own{};
    own.ss_sp = stack.data();
    own.ss_size = stack.size();
    if (stack_t present{}; sigaltstack(nullptr, &present) == 0 && (present.ss_flags & SS_DISABLE) != 0)
        sigaltstack(&own, nullptr);
    struct sigaction action {};
    action.sa_handler = giveBack;
    action.sa_flags = SA_ONSTACK;
    for (std::size_t i = 0; i < kSignals.size(); ++i)
        sigaction(kSignals[i], &action, &before[i]);
}

CrashSignals::~CrashSignals()
{
    for (std::size_t i = 0; i < kSignals.size(); ++i)
        sigaction(kSignals[i], &before[i], nullptr);
}

} // namespace kestrum::terminal
