#include "voxd/modem/BusValue.h"

#include "support/Utf8.h"

#include <QMetaType>

#include <cfloat>
#include <charconv>
#include <cmath>
#include <utility>

namespace kestrum {
namespace {

// No level of a modem is greater: a greater number is a mistake or a mark for "unknown".
constexpr double kGreatestLevel = 1000;

bool isWhole(const QVariant& value)
{
    switch (value.typeId()) {
    case QMetaType::UChar:
    case QMetaType::Short:
    case QMetaType::UShort:
    case QMetaType::Int:
    case QMetaType::UInt:
    case QMetaType::LongLong:
    case QMetaType::ULongLong:
        return true;
    default:
        return false;
    }
}

template <typename Number>
std::optional<Number> wholeFrom(const QVariant& value)
{
    if (!isWhole(value))
        return std::nullopt;
    if (value.typeId() == QMetaType::ULongLong) {
        const auto number = value.toULongLong();
        return std::in_range<Number>(number) ? std::optional(static_cast<Number>(number)) : std::nullopt;
    }
    const auto number = value.toLongLong();
    return std::in_range<Number>(number) ? std::optional(static_cast<Number>(number)) : std::nullopt;
}

template <typename Element>
QList<Element> elementsFrom(const QVariant& value, std::string_view signature, qsizetype most)
{
    QList<Element> elements;
    const auto argument = argumentFrom(value, signature);
    if (!argument)
        return elements;
    argument->beginArray();
    while (!argument->atEnd() && elements.size() < most) {
        Element element;
        *argument >> element;
        elements.push_back(element);
    }
    argument->endArray();
    return elements;
}

} // namespace

std::optional<QDBusArgument> argumentFrom(const QVariant& value, std::string_view signature)
{
    if (value.metaType() != QMetaType::fromType<QDBusArgument>())
        return std::nullopt;
    const auto argument = value.value<QDBusArgument>();
    if (argument.currentSignature().toStdString() != signature)
        return std::nullopt;
    return argument;
}

std::string textFrom(const QString& text)
{
    return std::string(beginOf(text.left(kLongestBusText).toStdString(), kLongestBusText));
}

std::string textFrom(const QVariant& value)
{
    return value.typeId() == QMetaType::QString ? textFrom(value.toString()) : std::string();
}

std::optional<bool> flagFrom(const QVariant& value)
{
    return value.typeId() == QMetaType::Bool ? std::optional(value.toBool()) : std::nullopt;
}

std::optional<std::uint32_t> numberFrom(const QVariant& value)
{
    return wholeFrom<std::uint32_t>(value);
}

std::optional<std::uint64_t> longNumberFrom(const QVariant& value)
{
    return wholeFrom<std::uint64_t>(value);
}

std::optional<std::int32_t> signedNumberFrom(const QVariant& value)
{
    return wholeFrom<std::int32_t>(value);
}

std::optional<double> levelFrom(const QVariant& value)
{
    if (value.typeId() != QMetaType::Double && !isWhole(value))
        return std::nullopt;
    const double level = value.toDouble();
    // ModemManager marks an unknown level with the least positive number. Not-a-number is not below any limit.
    if (!(std::fabs(level) <= kGreatestLevel) || level == DBL_MIN)
        return std::nullopt;
    return level;
}

std::optional<std::uint64_t> longHexadecimalFrom(const QVariant& value)
{
    if (value.typeId() != QMetaType::QString)
        return longNumberFrom(value);
    const std::string text = textFrom(value);
    const char* const end = text.data() + text.size();
    std::uint64_t number = 0;
    const auto [read, error] = std::from_chars(text.data(), end, number, 16);
    return error == std::errc() && read == end ? std::optional(number) : std::nullopt;
}

std::optional<std::uint32_t> hexadecimalFrom(const QVariant& value)
{
    const auto number = longHexadecimalFrom(value);
    return number && std::in_range<std::uint32_t>(*number) ? std::optional(static_cast<std::uint32_t>(*number))
                                                           : std::nullopt;
}

QVariantMap mapFrom(const QVariant& value)
{
    if (value.typeId() == QMetaType::QVariantMap)
        return value.toMap();
    const auto argument = argumentFrom(value, "a{sv}");
    return argument ? qdbus_cast<QVariantMap>(*argument) : QVariantMap();
}

QList<QVariantMap> mapsFrom(const QVariant& value, qsizetype most)
{
    return elementsFrom<QVariantMap>(value, "aa{sv}", most);
}

QList<QDBusObjectPath> pathsFrom(const QVariant& value, qsizetype most)
{
    return elementsFrom<QDBusObjectPath>(value, "ao", most);
}

QString pathFrom(const QVariant& value)
{
    if (value.metaType() != QMetaType::fromType<QDBusObjectPath>())
        return {};
    const QString path = value.value<QDBusObjectPath>().path();
    return path == u"/" ? QString() : path;
}

} // namespace kestrum
