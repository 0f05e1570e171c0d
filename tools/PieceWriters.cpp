#include "tools/PieceWriters.h"

#include "support/Format.h"

#include <cerrno>
#include <csignal>
#include <sys/wait.h>
#include <system_error>
#include <unistd.h>

namespace kestrum::tools {
namespace {

[[noreturn]] void fail(const char* what)
{
    throw OutputFailure(std::system_error(errno, std::generic_category(), what).what());
}

} // namespace

PieceWriters::~PieceWriters()
{
    for (const auto& writer : _writers) {
        ::kill(writer.process, SIGKILL);
        ::waitpid(writer.process, nullptr, 0);
    }
}

bool PieceWriters::start()
{
    if (_writers.size() >= _most)
        copyOldest();
    // What this process still holds would be written twice.
    _data.flush();
    _remarks.flush();
    Writer writer;
    while ((writer.process = ::fork()) < 0) {
        if (_writers.empty())
            fail("a process cannot be started");
        copyOldest();
    }
    if (writer.process == 0) {
        _writers.clear();
        _data.redirect(::dup(writer.data.descriptor()));
        _remarks.redirect(::dup(writer.remarks.descriptor()));
        return true;
    }
    _writers.push_back(std::move(writer));
    return false;
}

void PieceWriters::finish()
{
    while (!_writers.empty())
        copyOldest();
}

void PieceWriters::copyOldest()
{
    auto& oldest = _writers.front();
    int status = 0;
    while (::waitpid(oldest.process, &status, 0) < 0)
        if (errno != EINTR)
            fail("a process cannot be waited for");
    auto ended = std::move(oldest);
    _writers.pop_front(); // its process number may be another's now
    const auto copy = [](TemporaryFile& from, OutputFile& to) {
        from.read([&to](std::string_view piece) { to.control(piece); });
        to.flush();
    };
    copy(ended.remarks, _remarks);
    copy(ended.data, _data);
    if (WIFSIGNALED(status))
        throw OutputFailure(formatted("a process that writes was ended by signal %d", WTERMSIG(status)));
    if (WEXITSTATUS(status) != 0)
        throw WriterFailure();
}

} // namespace kestrum::tools
