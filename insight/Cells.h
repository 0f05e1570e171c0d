#pragma once

#include "support/Date.h"

#include <chrono>
#include <cstddef>
#include <cstdint>
#include <limits>
#include <list>
#include <map>
#include <optional>
#include <string>
#include <string_view>
#include <utility>

namespace kestrum {

/// Counts, least, mean and greatest of numbers.
class Spread {
public:
    void add(double number)
    {
        ++_count;
        _sum += number;
        _least = number < _least ? number : _least;
        _greatest = number > _greatest ? number : _greatest;
    }
    std::uint64_t count() const { return _count; }
    // Only with a count above 0.
    double least() const { return _least; }
    double greatest() const { return _greatest; }
    double mean() const { return _sum / static_cast<double>(_count); }

private:
    std::uint64_t _count = 0;
    double _sum = 0;
    double _least = std::numeric_limits<double>::infinity(), _greatest = -std::numeric_limits<double>::infinity();
};

/// A cell that has served the phone.
struct VisitedCell {
    std::string_view radio; ///< a constant: "LTE"
    std::string key;        ///< tells the cells of the radio apart
    std::string identity;   ///< "cell 1712898, PCI 232, EARFCN 6300"
    std::uint64_t visits = 0;
    std::chrono::microseconds time{0}; ///< on it, as far as the messages' times tell; up to `since` while it serves
    std::optional<Date> since;
    std::optional<Date> lastSeen;
    bool isServing = false;
    Spread level;
    std::string unit; ///< of the level

    /// Counts the time up to `at`, and goes on counting at `from`: later when the log was silent in between.
    void count(std::optional<Date> at, std::optional<Date> from);
};

/// The cells that have served, the latest first. At most `kMost`; beyond that those seen longest ago go.
class Cells {
public:
    static constexpr std::size_t kMost = 2000;

    Cells() = default;
    Cells(const Cells&) = delete;
    Cells& operator=(const Cells&) = delete;

    /// Begins a visit. The cell stays valid until it is left.
    VisitedCell& enter(std::string_view radio, std::string key, std::optional<Date> at);
    static void leave(VisitedCell& cell, std::optional<Date> at);

    auto begin() const { return _cells.begin(); }
    auto end() const { return _cells.end(); }
    std::size_t size() const { return _cells.size(); }
    /// Cells that are no longer listed.
    std::uint64_t dropped() const { return _dropped; }

private:
    using Place = std::list<VisitedCell>::iterator;
    void dropOldest();

    std::list<VisitedCell> _cells;
    std::map<std::pair<std::string_view, std::string>, Place> _places; ///< by radio and key
    std::uint64_t _dropped = 0;
};

} // namespace kestrum
