#include "capture/PositionRecord.h"

#include "capture/MessageTime.h"
#include "platform/PropertyLists.h"
#include "support/FieldWriter.h"
#include "support/Format.h"

#include <charconv>
#include <cmath>
#include <string>

namespace kestrum {
namespace {

constexpr std::string_view kFix = "Fix", kLatitude = "Latitude", kLongitude = "Longitude", kSpeed = "Speed",
                           kTime = "Time";
constexpr std::string_view kFlat = "2D", kFull = "3D", kSpeedUnit = " m/s";
constexpr int kMilliseconds = 3; // digits of a second's fraction

std::string_view textAt(const Dictionary& node, std::string_view key)
{
    const auto* value = node.find(key);
    const auto* text = value != nullptr ? value->borrowedString() : nullptr;
    return text != nullptr ? std::string_view(*text) : std::string_view();
}

/// Nothing for a text that is not one number from `-limit` to `limit`.
std::optional<double> number(std::string_view text, double limit)
{
    double value = 0;
    const auto [end, error] = std::from_chars(text.data(), text.data() + text.size(), value, std::chars_format::fixed);
    if (error != std::errc{} || end != text.data() + text.size() || !(std::abs(value) <= limit))
        return std::nullopt;
    return value;
}

} // namespace

DictionaryRef positionNode(const std::optional<Position>& position)
{
    if (!position)
        return makeDictionary({{std::string(kFix), ""},
                               {std::string(kLatitude), ""},
                               {std::string(kLongitude), ""},
                               {std::string(kSpeed), ""},
                               {std::string(kTime), ""}});
    // The seventh digit of a degree is a centimetre.
    return makeDictionary(
        {{std::string(kFix), position->dimensions == 3 ? kFull : kFlat},
         {std::string(kLatitude), formatted("%.7f", position->latitude)},
         {std::string(kLongitude), formatted("%.7f", position->longitude)},
         {std::string(kSpeed), position->speed ? formatted("%.2f m/s", *position->speed) : std::string()},
         {std::string(kTime), position->time ? isoText(*position->time, kMilliseconds) : std::string()}});
}

std::optional<Position> positionIn(const Value& node)
{
    const auto* texts = node.borrowedDictionary();
    if (texts == nullptr)
        return std::nullopt;
    const auto fix = textAt(*texts, kFix);
    const auto latitude = number(textAt(*texts, kLatitude), kMostLatitude),
               longitude = number(textAt(*texts, kLongitude), kMostLongitude);
    if ((fix != kFlat && fix != kFull) || !latitude || !longitude)
        return std::nullopt;
    auto speed = textAt(*texts, kSpeed);
    speed.remove_suffix(speed.ends_with(kSpeedUnit) ? kSpeedUnit.size() : 0);
    auto known = number(speed, kMostSpeed);
    if (known && *known < 0)
        known.reset();
    return Position{fix == kFull ? 3 : 2, *latitude, *longitude, known, momentFromText(textAt(*texts, kTime))};
}

std::vector<std::byte> positionRecord(const std::optional<Position>& position, std::uint64_t timeStamp,
                                      const PropertyLists& lists)
{
    constexpr Field kType = u8(0), kLength = u16(1), kCode = u16(3);
    constexpr std::size_t kTimeStamp = 5, kTypeSize = 1;
    std::vector<std::byte> record(ChannelMessage::kHeaderSize);
    if (const auto list = lists.toXml(positionNode(position)))
        record.insert(record.end(), list->bytes().begin(), list->bytes().end());
    FieldWriter(record)
        .set(kType, ChannelMessage::kExtraCode)
        .set(kLength, static_cast<std::int64_t>(record.size() - kTypeSize))
        .set(kCode, kPositionRecord - ChannelMessage::kExtraCodes)
        .set64(kTimeStamp, timeStamp);
    return record;
}

} // namespace kestrum
