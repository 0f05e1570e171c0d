#include "platform/posix/SyslogSocket.h"

#include "support/Format.h"

#include <ctime>
#include <iomanip>
#include <locale>
#include <sstream>
#include <utility>

#include <sys/socket.h>
#include <sys/un.h>
#include <syslog.h>
#include <unistd.h>

namespace kestrum {
namespace {

/// "Nov  2 06:05:42" in local time, as RFC 3164 has it.
std::string timeStamp()
{
    const std::time_t now = std::time(nullptr);
    std::tm local{};
    ::localtime_r(&now, &local);
    std::ostringstream text;
    text.imbue(std::locale::classic());
    text << std::put_time(&local, "%b %e %H:%M:%S");
    return text.str();
}

} // namespace

SyslogSocket::SyslogSocket(std::string program, std::string path, Now now)
    : _program(std::move(program)), _path(std::move(path)), _now(std::move(now)), _resume(_now())
{}

SyslogSocket::~SyslogSocket()
{
    close();
}

bool SyslogSocket::write(int level, const std::string& text)
{
    if (_now() < _resume)
        return false;
    const auto line =
        formatted("<%d>%s %s[%d]: %s", LOG_MAKEPRI(LOG_USER, level), timeStamp(), _program, ::getpid(), text);
    // A daemon that was restarted has a new socket at the path.
    if (send(line) || (connect() && send(line)))
        return true;
    close();
    _resume = _now() + kPause;
    return false;
}

bool SyslogSocket::connect()
{
    close();
    sockaddr_un address{};
    address.sun_family = AF_UNIX;
    if (_path.size() >= sizeof address.sun_path)
        return false;
    _path.copy(address.sun_path, _path.size());
    _descriptor = ::socket(AF_UNIX, SOCK_DGRAM | SOCK_CLOEXEC, 0);
    return ::connect(_descriptor, reinterpret_cast<const sockaddr*>(&address), sizeof address) == 0;
}

bool SyslogSocket::send(const std::string& line) const
{
    return _descriptor >= 0 &&
           ::send(_descriptor, line.data(), line.size(), MSG_NOSIGNAL) == static_cast<ssize_t>(line.size());
}

void SyslogSocket::close()
{
    if (_descriptor >= 0)
        ::close(std::exchange(_descriptor, -1));
}

} // namespace kestrum
