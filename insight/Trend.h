#pragma once

#include "insight/Events.h"
#include "support/Date.h"
#include "support/Value.h"

#include <array>
#include <chrono>
#include <cstddef>
#include <cstdint>
#include <deque>
#include <limits>
#include <map>
#include <optional>
#include <string>
#include <string_view>
#include <vector>

namespace kestrum {

struct SectionEntry;

/// How the values of a display have been: sampled at each refresh, exact for 15 minutes, then by minute for a day.
///
/// A value is followed by its path, whose steps are display names, with "/" and "~" in a name as in a JSON Pointer. In a
/// list a row is followed by its identity ("Physical Cell ID=232") and not by its index, because neighbours change
/// places. Memory is bounded: at most `kMost` values, those seen longest ago go.
class Trends {
public:
    static constexpr std::size_t kExact = 450; ///< refreshes: 15 minutes at one in 2 s
    static constexpr std::size_t kMinutes = 24 * 60;
    static constexpr std::size_t kMost = 1500;
    /// Values that are looked at in one refresh: a display of more must not stop the program.
    static constexpr std::size_t kMostLooked = 20'000;
    static constexpr std::size_t kLongestPath = 512; ///< bytes
    static constexpr std::chrono::minutes kExactTime{15};

    Trends() = default;
    Trends(const Trends&) = delete;
    Trends& operator=(const Trends&) = delete;

    /// Samples all values of the display of a technology.
    void sample(const Value& display, std::string_view technology, Date now);

    /// The paths that are followed, in order.
    std::vector<std::string_view> paths() const;
    /// The path of a value in the display; empty when it is not followed. `steps` are keys, and indexes of rows.
    static std::string pathOf(const Value& display, std::string_view technology, const std::vector<std::string>& steps);

    /// A moment of the last 15 minutes; not a number where there was none: "nan", "Not Present", empty, disconnected.
    struct Point {
        Date time;
        double number;
    };
    struct Minute {
        Date time; ///< its beginning
        double least, mean, greatest;
    };
    /// A name or an identity from a moment on; empty where there was none.
    struct Word {
        Date since;
        std::string text;
    };
    // In order of time; empty for a path that is not followed, and for one of the other kind.
    std::vector<Point> exact(std::string_view path) const;
    std::vector<Minute> minutes(std::string_view path) const;
    std::vector<Word> words(std::string_view path) const;
    /// Of the numbers; empty for a plain number.
    std::string_view unit(std::string_view path) const;

    /// "Measured RSRP, -98 dBm now, -121 to -91 in 15 minutes, falling": the trend for a screen reader. What came later
    /// than `now` is left out.
    std::string sentence(std::string_view path, Date now = Date::max()) const;

    /// Values of the last refresh that were not followed, because there were too many or their paths too long.
    std::size_t left() const { return _left; }
    /// Values that are no longer followed.
    std::uint64_t dropped() const { return _dropped; }

private:
    static constexpr std::size_t kMostWords = 400, kMostNames = 64, kLongestName = 64;

    struct MinuteOf {
        std::uint32_t minute; ///< counts the minutes in which there was a refresh
        float least, mean, greatest;
    };
    struct WordOf {
        Date since;
        std::uint8_t name; ///< an index; kNoName: none
    };
    struct Series {
        bool isOfWords = false; ///< a number may be an identity
        std::uint64_t last = 0; ///< the refresh of the last sample
        std::string unit = {};
        std::vector<float> exact = {}; ///< a ring by refresh; empty for words
        std::uint32_t minute = 0;
        Spread now = {}; ///< of the minute
        std::deque<MinuteOf> minutes = {};
        std::vector<std::string> names = {};
        std::deque<WordOf> words = {};
    };

    class Walk;
    Series* seriesAt(std::string_view path, std::string_view technology);
    const Series* find(std::string_view path) const;
    void add(Series& series, double number, std::string_view unit);
    void add(Series& series, std::string_view name);
    static void closeMinute(Series& series);
    bool dropOldest();

    std::map<std::string, Series, std::less<>> _series;
    std::uint64_t _refresh = 0; ///< the number of the last refresh, from 1
    std::array<Date, kExact> _times{};
    std::uint32_t _minute = 0;
    std::array<Date, kMinutes> _minuteTimes{};
    std::vector<std::map<std::string, Series, std::less<>>::iterator> _old; ///< not seen lately, the oldest last
    std::uint64_t _oldestOf = 0;                                            ///< the refresh of `_old`
    std::size_t _left = 0;
    std::uint64_t _dropped = 0;
};

} // namespace kestrum
