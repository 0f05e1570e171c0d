// A simulated day of a scenario at full speed, with a refresh every 2 s. The resident size after an hour and after the
// day must hardly differ. One scenario to a process: what another one leaves on the heap would hide growth.
#include "Resident.h"
#include "scenarios/Drive.h"

#include <algorithm>
#include <cstdio>
#include <string_view>

namespace kestrum::bench {
namespace {

using namespace std::chrono;

void runDay(const Scenario& scenario)
{
    PropertyListCodec lists;
    const auto source = begin(scenario, lists);
    std::string_view technology = source->technology();
    Decoding decoding(technology);
    microseconds refreshAt = kRefresh;
    double afterAnHour = 0;
    long messages = 0;
    for (auto message = source->next(); message && message->at < days(1); message = source->next(), ++messages) {
        if (source->technology() != technology)
            decoding.changeTo(technology = source->technology());
        decoding.receive(message->bytes);
        if (message->at >= refreshAt) {
            decoding.refresh();
            refreshAt = message->at + kRefresh;
        }
        if (afterAnHour == 0 && message->at >= hours(1))
            afterAnHour = resident();
    }
    std::printf("messages\t%ld\t\nafter 1 h\t%.1f\tMiB\nafter 24 h\t%.1f\tMiB\n", messages, afterAnHour, resident());
}

} // namespace
} // namespace kestrum::bench

int main(int argc, char** argv)
{
    using namespace kestrum;
    const auto scenario = std::ranges::find(scenarios(), std::string_view(argc == 2 ? argv[1] : ""), &Scenario::name);
    if (scenario == scenarios().end()) {
        std::fputs("Usage: bench_day SCENARIO\n", stderr);
        return 2;
    }
    bench::runDay(*scenario);
}
