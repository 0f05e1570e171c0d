// The references for the other figures: the same bytes, only copied; and an iteration that does nothing.
#include "decoding/Messages.h"

namespace kestrum::bench {
namespace {

void plainCopy(benchmark::State& run)
{
    const std::vector<std::byte> message(static_cast<std::size_t>(run.range(0)), std::byte{0x2A});
    std::vector<std::byte> copy(message.size());
    measure(run, message, [&] {
        std::memcpy(copy.data(), message.data(), message.size());
        benchmark::DoNotOptimize(copy.data());
        benchmark::ClobberMemory();
    });
}
BENCHMARK(plainCopy)->Arg(60)->Arg(700)->Arg(2500);

void emptyIteration(benchmark::State& run)
{
    for (auto _ : run)
        benchmark::ClobberMemory();
}
BENCHMARK(emptyIteration);

} // namespace
} // namespace kestrum::bench
