// For callgrind, which counts the instructions inside `counted` alone: two minutes of a scenario, after the same two
// minutes have created the display's values.
//
//   valgrind --tool=callgrind --toggle-collect='kestrum::bench::counted*' bench_count lte
//
// With the argument "logged" every line of the system log is formatted, not the errors alone. With "events" the events
// of the drive are found too.
#include "decoding/Counting.h"
#include "scenarios/Drive.h"

#include <algorithm>
#include <cstdio>
#include <string_view>

namespace kestrum::bench {

[[gnu::noinline]] void counted(Decoding& decoding, std::span<const Source::Message> messages)
{
    for (const auto& message : messages)
        decoding.receive(message.bytes);
}

} // namespace kestrum::bench

int main(int argc, char** argv)
{
    using namespace kestrum;
    const auto argument = [&](int index) { return std::string_view(index < argc ? argv[index] : ""); };
    const auto scenario = std::ranges::find(scenarios(), argument(1), &Scenario::name);
    if (scenario == scenarios().end() || (argc > 2 && argument(2) != "logged" && argument(2) != "events")) {
        std::fputs("Usage: bench_count SCENARIO [logged|events]\n", stderr);
        return 2;
    }
    const auto messages = bench::driven(*scenario, std::chrono::minutes(2));
    const auto parts = bench::betweenRefreshes(messages);
    bench::Decoding decoding(scenario->technology);
    if (argument(2) == "logged")
        decoding.logEverything();
    else if (argument(2) == "events")
        decoding.findEvents();
    for (const auto& message : messages)
        decoding.receive(message.bytes);
    decoding.refresh();
    for (const auto part : parts) {
        bench::counted(decoding, part);
        decoding.refresh();
    }
    std::printf("messages\t%zu\t\n", messages.size());
}
