// Each technology's scenario: its mix of messages decoded as fast as possible, and a refresh with all lists full.
#include "decoding/Main.h"
#include "scenarios/Drive.h"

#include <algorithm>
#include <ctime>
#include <ranges>
#include <string>
#include <vector>

namespace kestrum::bench {
namespace {

using namespace std::chrono;

/// The time of this process alone, without the machine's other work.
duration<double> processorTime()
{
    return duration<double>(static_cast<double>(std::clock()) / CLOCKS_PER_SEC);
}

void decode(benchmark::State& run, const Scenario& scenario)
{
    const auto messages = driven(scenario, minutes(10));
    std::size_t bytes = 0;
    for (const auto& message : messages)
        bytes += message.bytes.size();

    // As in the application: a message comes from a port's recent buffer, not from cold memory. After every two
    // seconds of the drive the display is refreshed, which also takes the raw messages. The refresh is not measured
    // here.
    const auto parts = betweenRefreshes(messages);
    Decoding decoding(scenario.technology);
    duration<double> decodingTime{0};
    std::size_t allocated = 0;
    std::vector<std::vector<std::byte>> arrived;
    const auto drive = [&] {
        for (const auto part : parts) {
            arrived.resize(part.size());
            std::ranges::copy(part | std::views::transform(&Source::Message::bytes), arrived.begin());
            const auto begin = processorTime();
            allocated -= allocations();
            for (const auto& message : arrived)
                decoding.receive(message);
            allocated += allocations();
            decodingTime += processorTime() - begin;
            decoding.refresh();
        }
    };
    drive(); // creates the display's values
    decodingTime = {};
    allocated = 0;

    std::vector<std::byte> copies(bytes);
    duration<double> copyingTime{0};
    for (auto _ : run) {
        const auto before = decodingTime;
        drive();
        run.SetIterationTime((decodingTime - before).count());
        const auto begin = processorTime();
        auto* to = copies.data();
        for (const auto& message : messages) {
            std::memcpy(to, message.bytes.data(), message.bytes.size());
            to += message.bytes.size();
        }
        benchmark::ClobberMemory();
        copyingTime += processorTime() - begin;
    }
    const auto all = static_cast<double>(run.iterations()) * static_cast<double>(messages.size());
    run.counters["messages/s"] = all / decodingTime.count();
    run.counters["bytes"] = static_cast<double>(bytes) / static_cast<double>(messages.size());
    run.counters["allocations"] = static_cast<double>(allocated) / all;
    run.counters["plain copies"] = decodingTime / copyingTime;
}

void refresh(benchmark::State& run, const Scenario& scenario)
{
    Decoding decoding(scenario.technology);
    for (const auto& message : driven(scenario, minutes(1)))
        decoding.receive(message.bytes);
    decoding.fill(0);
    for (auto _ : run)
        decoding.refresh();
}

void registerAll()
{
    for (const Scenario& scenario : scenarios()) {
        if (scenario.name == "drive") // a mix of the others
            continue;
        const auto named = [&](const char* what) { return std::string(what) + "/" + std::string(scenario.name); };
        benchmark::RegisterBenchmark(named("decode").c_str(), decode, scenario)
            ->UseManualTime()
            ->Unit(benchmark::kMillisecond);
        benchmark::RegisterBenchmark(named("refresh").c_str(), refresh, scenario)->Unit(benchmark::kMicrosecond);
    }
}

} // namespace
} // namespace kestrum::bench

int main(int argc, char** argv)
{
    kestrum::bench::registerAll();
    return kestrum::bench::runAll(argc, argv);
}
