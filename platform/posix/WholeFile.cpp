#include "platform/posix/WholeFile.h"

#include <cerrno>
#include <cstdio>
#include <cstdlib>
#include <fcntl.h>
#include <filesystem>
#include <string_view>
#include <sys/stat.h>
#include <system_error>
#include <unistd.h>
#include <utility>

namespace kestrum {
namespace {

constexpr std::size_t kPiece = 64 << 10;

std::string directoryOf(const std::string& path)
{
    const auto slash = path.rfind('/');
    return slash == path.npos ? "." : slash == 0 ? "/" : path.substr(0, slash);
}

} // namespace

WholeFile::WholeFile(std::string path) : _path(std::move(path)), _written(_path + ".XXXXXX")
{
    _file = ::mkostemp(_written.data(), O_CLOEXEC); // creates the file, mode 0600
    if (_file < 0)
        fail();
}

void WholeFile::createDirectoryOf(const std::string& path)
{
    std::error_code ignored;
    std::filesystem::create_directories(directoryOf(path), ignored);
}

WholeFile::~WholeFile()
{
    ::close(_file);
    if (!_written.empty())
        ::unlink(_written.c_str());
}

void WholeFile::fail() const
{
    throw std::system_error(errno, std::generic_category(), _path);
}

void WholeFile::write(Bytes bytes)
{
    _held += textOf(bytes);
    if (_held.size() >= kPiece)
        store();
}

void WholeFile::store()
{
    for (std::string_view rest = _held; !rest.empty();) {
        const auto written = ::write(_file, rest.data(), rest.size());
        if (written < 0 && errno != EINTR)
            fail();
        rest.remove_prefix(written < 0 ? 0 : static_cast<std::size_t>(written));
    }
    _held.clear();
}

bool WholeFile::finish(Existing existing)
{
    store();
    // The contents must reach the disk before the name does.
    if (::fsync(_file) != 0)
        fail();
    if (existing == Existing::Replaced) {
        if (::rename(_written.c_str(), _path.c_str()) != 0)
            fail();
    } else if (::renameat2(AT_FDCWD, _written.c_str(), AT_FDCWD, _path.c_str(), RENAME_NOREPLACE) != 0) {
        if (errno == EEXIST)
            return false;
        // Some file systems do not support this.
        if ((errno != EINVAL && errno != ENOSYS) || ::link(_written.c_str(), _path.c_str()) != 0) {
            if (errno == EEXIST)
                return false;
            fail();
        }
        ::unlink(_written.c_str());
    }
    _written.clear();
    // Best effort: the file has its name even when its directory cannot be opened or synced.
    if (const int directory = ::open(directoryOf(_path).c_str(), O_RDONLY | O_DIRECTORY | O_CLOEXEC); directory >= 0) {
        ::fsync(directory);
        ::close(directory);
    }
    return true;
}

WholeFile::Identity WholeFile::identity() const
{
    struct stat status {};
    if (::fstat(_file, &status) != 0)
        fail();
    return {status.st_dev, status.st_ino};
}

WholeFile::Identity WholeFile::at(const std::string& path)
{
    struct stat status {};
    return ::lstat(path.c_str(), &status) == 0 ? Identity{status.st_dev, status.st_ino} : Identity();
}

} // namespace kestrum
