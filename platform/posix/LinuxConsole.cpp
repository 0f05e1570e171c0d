#include "platform/posix/LinuxConsole.h"

#include <cstdio>
#include <cstdlib>
#include <string>

namespace kestrum {
namespace {

void writeLine(std::FILE* to, std::string_view line)
{
    // One write for the whole line, so that lines of several processes do not mix. A closed pipe only loses the line.
    const std::string whole = std::string(line) + "\n";
    std::fwrite(whole.data(), 1, whole.size(), to);
    std::fflush(to);
}

} // namespace

LinuxConsole::LinuxConsole() : _debugWatched(std::getenv("KESTRUM_DEBUG") != nullptr) {}

void LinuxConsole::printLine(std::string_view line)
{
    writeLine(stdout, line);
}

void LinuxConsole::debug(std::string_view line)
{
    if (_debugWatched)
        writeLine(stderr, line);
}

} // namespace kestrum
