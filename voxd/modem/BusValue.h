#pragma once

#include <QDBusArgument>
#include <QDBusObjectPath>
#include <QList>
#include <QMap>
#include <QString>
#include <QVariant>

#include <cstdint>
#include <optional>
#include <string>
#include <string_view>

/// Values of another program on the bus. They can have any type, number and size: what is not of the expected kind is
/// nothing.
namespace kestrum {

/// The properties of an object, by interface.
using BusInterfaces = QMap<QString, QVariantMap>;
using BusObjects = QMap<QDBusObjectPath, BusInterfaces>;

/// The longest text, in bytes, that is kept of the bus. The rest is cut off, between two characters.
inline constexpr std::size_t kLongestBusText = 256;

std::string textFrom(const QString& text);
/// Empty for a value that is no text.
std::string textFrom(const QVariant& value);
std::optional<bool> flagFrom(const QVariant& value);
/// A whole number of any of D-Bus's types, within 32 bits or 64 bits, not negative.
std::optional<std::uint32_t> numberFrom(const QVariant& value);
std::optional<std::uint64_t> longNumberFrom(const QVariant& value);
/// A whole number within 32 bits, negative ones included.
std::optional<std::int32_t> signedNumberFrom(const QVariant& value);
/// A level in dBm or dB, or a percentage.
std::optional<double> levelFrom(const QVariant& value);
/// A number that is sent as a hexadecimal text, or as a number.
std::optional<std::uint64_t> longHexadecimalFrom(const QVariant& value);
std::optional<std::uint32_t> hexadecimalFrom(const QVariant& value);

/// A container to read from; nothing when its signature is another one.
std::optional<QDBusArgument> argumentFrom(const QVariant& value, std::string_view signature);
/// Empty for a value that is no "a{sv}".
QVariantMap mapFrom(const QVariant& value);
/// At most `most` elements of an "aa{sv}".
QList<QVariantMap> mapsFrom(const QVariant& value, qsizetype most);
/// At most `most` elements of an "ao".
QList<QDBusObjectPath> pathsFrom(const QVariant& value, qsizetype most);
/// A path; empty for a value that is no path, and for "/", which stands for no object.
QString pathFrom(const QVariant& value);

} // namespace kestrum
