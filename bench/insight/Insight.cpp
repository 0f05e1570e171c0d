// What a history costs: the trends of a day in memory, and one refresh of a display with far too many keys.
#include "LogGenerator/State.h"
#include "Resident.h"
#include "doubles/VirtualClock.h"
#include "insight/History.h"
#include "support/Format.h"

#include <chrono>
#include <cstdio>

namespace kestrum::bench {
namespace {

using namespace std::chrono;

/// A display of sections with that many levels, and a name in every tenth place. They change with each turn.
DictionaryRef displayOf(std::size_t keys, unsigned turn)
{
    constexpr std::size_t kSection = 50;
    auto display = makeDictionary();
    for (std::size_t first = 0; first < keys; first += kSection) {
        auto section = makeDictionary();
        for (std::size_t i = first; i < first + kSection && i < keys; ++i) {
            const auto number = static_cast<unsigned>(i) * 7 + turn;
            section->set(formatted("Key %lu", i), i % 10 == 0
                                                      ? formatted("State %u", number / 300 % 5)
                                                      : formatted("-%u.%02u dBm", 80 + number % 40, number % 100));
        }
        display->set(formatted("Section %lu", first / kSection), section);
    }
    return display;
}

void reportTrendsOfADay()
{
    const double before = resident();
    Trends trends;
    Date now{};
    unsigned turn = 0;
    for (const Date end = now + days(1); now < end; now += seconds(2))
        trends.sample(Value(displayOf(500, turn++)), "", now);
    std::printf("insight/trends of 500 keys over a day\t%.1f\tMiB\n", resident() - before);
}

void reportLargeRefresh()
{
    VirtualClock clock;
    History history(clock);
    double longest = 0;
    for (unsigned turn = 0; turn < 10; ++turn) {
        const auto entry = makeDictionary({{StateKey::kDisplay, displayOf(100'000, turn)}});
        const auto begin = steady_clock::now();
        history.displayMade(*entry);
        longest = std::max(longest, duration<double, std::milli>(steady_clock::now() - begin).count());
    }
    std::printf("insight/a refresh of 100000 keys, the longest\t%.1f\tms\n", longest);
}

} // namespace
} // namespace kestrum::bench

int main()
{
    kestrum::bench::reportTrendsOfADay();
    kestrum::bench::reportLargeRefresh();
}
