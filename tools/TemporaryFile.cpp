#include "tools/TemporaryFile.h"

#include "tools/OutputFile.h"

#include <cerrno>
#include <system_error>

namespace kestrum::tools {
namespace {

[[noreturn]] void fail()
{
    throw OutputFailure(std::system_error(errno, std::generic_category(), "a temporary file").what());
}

} // namespace

TemporaryFile::TemporaryFile() : _file(std::tmpfile(), std::fclose)
{
    if (!_file)
        fail();
}

void TemporaryFile::append(std::string_view text)
{
    if (std::fwrite(text.data(), 1, text.size(), _file.get()) != text.size())
        fail();
}

void TemporaryFile::read(const std::function<void(std::string_view piece)>& take)
{
    if (std::fseek(_file.get(), 0, SEEK_SET) != 0)
        fail();
    char piece[1 << 16];
    for (std::size_t got; (got = std::fread(piece, 1, sizeof piece, _file.get())) > 0;)
        take({piece, got});
    if (std::ferror(_file.get()) != 0 || std::fseek(_file.get(), 0, SEEK_END) != 0)
        fail();
}

} // namespace kestrum::tools
