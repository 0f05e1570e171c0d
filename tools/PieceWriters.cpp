#include "tools/PieceWriters.h"

#include "support/Format.h"

#include <cerrno>
#include <csignal>
#include <stdexcept>
#include <sys/wait.h>
#include <system_error>
#include <unistd.h>

namespace kestrum::tools {
namespace {

[[noreturn]] void fail(const char* what)
{
    throw std::system_error(errno, std::generic_category(), what);
}

std::unique_ptr<std::FILE, int (*)(std::FILE*)> unnamedFile()
{
    std::unique_ptr<std::FILE, int (*)(std::FILE*)> file(std::tmpfile(), std::fclose);
    if (!file)
        throw OutputFailure(std::system_error(errno, std::generic_category(), "a temporary file").what());
    return file;
}

void copy(std::FILE* from, OutputFile& to)
{
    std::rewind(from); // the writer has moved the common position
    char piece[1 << 16];
    for (std::size_t got; (got = std::fread(piece, 1, sizeof piece, from)) > 0;)
        to.control({piece, got});
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
    Writer writer{0, unnamedFile(), unnamedFile()};
    while ((writer.process = ::fork()) < 0) {
        if (_writers.empty())
            fail("a process cannot be started");
        copyOldest();
        _data.flush();
        _remarks.flush();
    }
    if (writer.process == 0) {
        _writers.clear();
        _data.redirect(::fileno(writer.data.release()));
        _remarks.redirect(::fileno(writer.remarks.release()));
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
    const auto files = std::move(oldest);
    _writers.pop_front(); // its process number may be another's now
    copy(files.remarks.get(), _remarks);
    _remarks.flush();
    copy(files.data.get(), _data);
    if (WIFSIGNALED(status))
        throw std::runtime_error(formatted("a process that writes was ended by signal %d", WTERMSIG(status)));
    if (WEXITSTATUS(status) != 0)
        throw WriterFailure();
}

} // namespace kestrum::tools
