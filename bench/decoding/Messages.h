#pragma once

#include "decoding/Counting.h"
#include "doubles/MemoryBundle.h"
#include "doubles/VirtualClock.h"
#include "platform/Console.h"
#include "platform/Roles.h"
#include "platform/SystemLog.h"
#include "platform/propertylist/PropertyListCodec.h"

#include <benchmark/benchmark.h>

#include <cstring>
#include <vector>

namespace kestrum::bench {

/// The roles that decoding needs, all without effect: the benchmark measures only the decoding.
struct Surroundings {
    class Log final : public SystemLog {
        void write(Priority, std::string_view) override {}
        bool passes(Priority priority) const override { return everything || priority == Priority::Error; }

    public:
        bool everything = false; ///< the programs pass errors alone, unless the user asks for more
    } log;
    class Nowhere final : public Console {
        void printLine(std::string_view) override {}
        void debug(std::string_view) override {}
        bool isDebugWatched() const override { return false; }
    } console;
    VirtualClock clock;
    MemoryBundle bundle;
    PropertyListCodec propertyLists;

    DecodingRoles roles{log, console, clock, bundle, propertyLists};
};

inline std::vector<std::byte> copied(Bytes bytes)
{
    return {bytes.begin(), bytes.end()};
}

/// Measures `work` on one message: messages and bytes per second, heap allocations per message. Compare it with
/// `plainCopy` of as many bytes.
template <typename Work>
void measure(benchmark::State& run, const std::vector<std::byte>& message, Work work)
{
    for (int i = 0; i < 1000; ++i)
        work();
    const std::size_t before = allocations();
    for (auto _ : run)
        work();
    run.SetItemsProcessed(run.iterations());
    run.SetBytesProcessed(run.iterations() * static_cast<std::int64_t>(message.size()));
    run.counters["allocations"] =
        benchmark::Counter(static_cast<double>(allocations() - before), benchmark::Counter::kAvgIterations);
}

} // namespace kestrum::bench
