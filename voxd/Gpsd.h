#pragma once

#include "capture/Position.h"

#include <QByteArray>
#include <QTcpSocket>
#include <QTimer>

#include <chrono>
#include <cstdint>
#include <functional>
#include <optional>
#include <string>
#include <string_view>
#include <utility>

namespace kestrum {

class SystemLog;

/// The position of this machine, from gpsd (its JSON protocol over TCP). It connects again when gpsd is not there, ends
/// or says nothing. Needs a Qt event loop.
class Gpsd {
public:
    struct Address {
        std::string host = "localhost";
        std::uint16_t port = 2947;
    };
    /// "HOST", "HOST:PORT", or with an IPv6 address "[::1]:2947"; an empty text is the default. Nothing for other texts.
    static std::optional<Address> addressFrom(std::string_view text);

    /// The longest line that is read, in bytes; gpsd's own limit is 10,240.
    static constexpr int kLongestLine = 64 << 10;

    struct Settings {
        std::chrono::milliseconds retry{2'000};     ///< the pause before another attempt to connect
        std::chrono::milliseconds patience{30'000}; ///< an attempt ends after this time without any data
        std::function<std::chrono::steady_clock::time_point()> now = std::chrono::steady_clock::now;
    };
    /// `log` must outlive this object.
    Gpsd(Address address, SystemLog& log) : Gpsd(std::move(address), log, Settings()) {}
    Gpsd(Address address, SystemLog& log, Settings settings);
    Gpsd(const Gpsd&) = delete;
    Gpsd& operator=(const Gpsd&) = delete;

    /// Nothing while there is no fix, and kLongestPositionAge after the last report of one.
    std::optional<Position> current() const;

private:
    struct Known {
        Position position;
        QString device; ///< gpsd may have several; any of them without a fix says nothing about the others
        std::chrono::steady_clock::time_point arrived;
    };

    void connect();
    void read();
    void take(const QByteArray& line);
    void tryLater(std::string_view reason);
    void tell(std::string_view what);

    const Address _address;
    SystemLog& _log;
    const Settings _settings;
    std::optional<Known> _known;
    std::string _told; ///< the last log line: attempts that fail alike are logged once
    QTcpSocket _socket;
    QTimer _timer; ///< ends the patience, or the pause before the next attempt
};

} // namespace kestrum
