#include "platform/qt/LinuxClock.h"

#include <QDateTime>
#include <QLocale>
#include <QTimeZone>

#include <ctime>

namespace kestrum {

using namespace std::chrono;

Date LinuxClock::now() const
{
    return floor<microseconds>(system_clock::now());
}

Clock::Zone LinuxClock::zoneAt(Date date) const
{
    const std::time_t moment = system_clock::to_time_t(floor<seconds>(date));
    std::tm local{};
    ::tzset(); // localtime_r is not required to read TZ
    ::localtime_r(&moment, &local);
    return {seconds(local.tm_gmtoff), local.tm_isdst > 0};
}

std::string LinuxClock::localText(Date date, std::string_view pattern) const
{
    // The offset comes from `zoneAt`: Qt may find another time zone than the C library.
    const auto milliseconds = floor<std::chrono::milliseconds>(date).time_since_epoch().count();
    const auto offset = static_cast<int>(zoneAt(date).offset.count());
#if QT_VERSION >= QT_VERSION_CHECK(6, 5, 0) // newer versions deprecate the other constructor
    const auto local = QDateTime::fromMSecsSinceEpoch(milliseconds, QTimeZone::fromSecondsAheadOfUtc(offset));
#else
    const auto local = QDateTime::fromMSecsSinceEpoch(milliseconds, Qt::OffsetFromUTC, offset);
#endif
    return QLocale::system()
        .toString(local, QString::fromUtf8(pattern.data(), static_cast<qsizetype>(pattern.size())))
        .toStdString();
}

} // namespace kestrum
