#include "tools/OutputFile.h"

#include "tools/Harmless.h"

#include <cerrno>
#include <system_error>
#include <unistd.h>

namespace kestrum::tools {
namespace {

constexpr std::size_t kPiece = 64 << 10;

} // namespace

OutputFile::OutputFile(int descriptor, Loss loss)
    : _descriptor(descriptor), _loss(loss), _isTerminal(::isatty(descriptor) != 0)
{}

void OutputFile::write(std::string_view text)
{
    if (_isTerminal)
        control(onLines(text));
    else
        control(text);
}

void OutputFile::control(std::string_view text)
{
    _held += text;
    if (_held.size() >= kPiece)
        flush();
}

void OutputFile::redirect(int descriptor)
{
    _descriptor = descriptor;
    _name = "a temporary file";
}

void OutputFile::flush()
{
    std::string_view rest = _held;
    while (!rest.empty()) {
        const auto written = ::write(_descriptor, rest.data(), rest.size());
        if (written >= 0)
            rest.remove_prefix(static_cast<std::size_t>(written));
        else if (errno != EINTR && _loss == Loss::Ignored)
            break;
        else if (errno == EPIPE)
            throw ClosedPipe{};
        else if (errno != EINTR)
            throw OutputFailure(std::system_error(errno, std::generic_category(), _name).what());
    }
    _held.clear();
}

} // namespace kestrum::tools
