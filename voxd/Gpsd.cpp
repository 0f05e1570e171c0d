#include "voxd/Gpsd.h"

#include "capture/MessageTime.h"
#include "platform/SystemLog.h"
#include "support/Format.h"

#include <QJsonDocument>
#include <QJsonObject>

#include <algorithm>
#include <charconv>
#include <cmath>

namespace kestrum {
namespace {

/// A number from `least` to `most`.
std::optional<double> number(const QJsonValue& value, double least, double most)
{
    const double number = value.toDouble(std::nan(""));
    return number >= least && number <= most ? std::optional(number) : std::nullopt;
}

/// The position in a time-position-velocity report (TPV), whose mode is 2 or 3.
std::optional<Position> positionIn(const QJsonObject& report, int mode)
{
    const auto latitude = number(report[u"lat"], -kMostLatitude, kMostLatitude),
               longitude = number(report[u"lon"], -kMostLongitude, kMostLongitude);
    if (!latitude || !longitude)
        return std::nullopt;
    return Position{mode, *latitude, *longitude, number(report[u"speed"], 0, kMostSpeed),
                    momentFromText(report[u"time"].toString().toStdString())};
}

} // namespace

std::optional<Gpsd::Address> Gpsd::addressFrom(std::string_view text)
{
    Address address;
    if (text.empty())
        return address;
    const bool isBracketed = text.front() == '[';
    const auto end = std::min(isBracketed ? text.find(']') : text.find(':'), text.size());
    address.host = isBracketed ? text.substr(1, end - 1) : text.substr(0, end);
    if (isBracketed && end == text.size())
        return std::nullopt;
    text.remove_prefix(isBracketed ? end + 1 : end);
    if (text.starts_with(':')) {
        text.remove_prefix(1);
        const auto [behind, error] = std::from_chars(text.data(), text.data() + text.size(), address.port);
        if (error != std::errc{} || address.port == 0)
            return std::nullopt;
        text.remove_prefix(static_cast<std::size_t>(behind - text.data()));
    }
    return address.host.empty() || !text.empty() ? std::nullopt : std::optional(address);
}

Gpsd::Gpsd(Address address, SystemLog& log, Settings settings)
    : _address(std::move(address)), _log(log), _settings(std::move(settings))
{
    _socket.setReadBufferSize(kLongestLine);
    _timer.setSingleShot(true);
    QObject::connect(&_socket, &QTcpSocket::connected, &_socket,
                     [this] { _socket.write("?WATCH={\"enable\":true,\"json\":true};\n"); });
    QObject::connect(&_socket, &QTcpSocket::readyRead, &_socket, [this] { read(); });
    QObject::connect(&_socket, &QTcpSocket::errorOccurred, &_socket,
                     [this] { tryLater(_socket.errorString().toStdString()); });
    QObject::connect(&_timer, &QTimer::timeout, &_timer, [this] {
        if (_socket.state() == QTcpSocket::UnconnectedState)
            return connect();
        _socket.abort();
        tryLater("no data");
    });
    connect();
}

std::optional<Position> Gpsd::current() const
{
    const bool isRecent = _known && _settings.now() - _known->arrived < kLongestPositionAge;
    return isRecent ? std::optional(_known->position) : std::nullopt;
}

void Gpsd::connect()
{
    _timer.start(_settings.patience);
    _socket.connectToHost(QString::fromStdString(_address.host), _address.port);
}

void Gpsd::read()
{
    _timer.start(_settings.patience);
    while (_socket.canReadLine())
        take(_socket.readLine());
    if (_socket.bytesAvailable() < kLongestLine)
        return;
    _socket.abort();
    tryLater(formatted("a line of more than %d bytes", kLongestLine));
}

void Gpsd::take(const QByteArray& line)
{
    const QJsonObject report = QJsonDocument::fromJson(line).object();
    if (report[u"class"].toString() != u"TPV")
        return;
    const int mode = report[u"mode"].toInt();
    const QString device = report[u"device"].toString();
    if (mode == 2 || mode == 3) {
        const auto position = positionIn(report, mode);
        if (!position)
            return;
        _known = {*position, device, _settings.now()};
        tell("has a position");
    } else if (_known && _known->device == device) {
        _known.reset();
    }
}

void Gpsd::tryLater(std::string_view reason)
{
    tell(reason);
    _timer.start(_settings.retry);
}

void Gpsd::tell(std::string_view what)
{
    if (what != _told)
        _log.write(Priority::Notice, "gpsd at %@, port %d: %@", _address.host, int{_address.port}, what);
    _told = what;
}

} // namespace kestrum
