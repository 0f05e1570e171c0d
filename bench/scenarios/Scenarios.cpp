// Each scenario's mix of messages: decoded as fast as possible, refreshed with all lists full, and run for a day.
#include "scenarios/Drive.h"

#include <algorithm>
#include <ctime>
#include <fstream>
#include <ranges>
#include <span>
#include <string>
#include <vector>

#include <unistd.h>

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
    if (messages.empty())
        return run.SkipWithError("no messages");
    std::size_t bytes = 0;
    for (const auto& message : messages)
        bytes += message.bytes.size();

    // As in the application: a message comes from a port's recent buffer, not from cold memory. After every two
    // seconds of the drive the display is refreshed, which also takes the raw messages. The refresh is not measured
    // here.
    std::vector<std::span<const Source::Message>> spells;
    for (auto from = messages.begin(); from != messages.end();) {
        const auto to = std::ranges::find_if(
            from, messages.end(), [until = from->at + kRefresh](const auto& message) { return message.at >= until; });
        spells.emplace_back(from, to);
        from = to;
    }

    Decoding decoding(scenario.technology);
    duration<double> decodingTime{0};
    std::size_t allocated = 0;
    std::vector<std::vector<std::byte>> arrived;
    const auto drive = [&] {
        for (const auto spell : spells) {
            arrived.resize(spell.size());
            std::ranges::copy(spell | std::views::transform(&Source::Message::bytes), arrived.begin());
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

/// Makes every list of the display as long, and every row as wide, as they can get.
void fill(const Value& node)
{
    constexpr int kRows = 32, kCells = 12;
    if (const auto dictionary = node.dictionary()) {
        for (auto& entry : *dictionary)
            if (entry.value.isText() && entry.key != kSortedKey)
                entry.value = Value("a value of usual length");
            else
                fill(entry.value);
    } else if (const auto array = node.array()) {
        array->clear();
        for (int i = 0; i < kRows; ++i) {
            auto row = makeDictionary();
            for (int k = 0; k < kCells; ++k)
                row->set(std::string("Quantity ") + std::to_string(k), Value("-101.25 dBm"));
            array->append(row);
        }
    }
}

void refresh(benchmark::State& run, const Scenario& scenario)
{
    Decoding decoding(scenario.technology);
    for (const auto& message : driven(scenario, minutes(1)))
        decoding.receive(message.bytes);
    fill(decoding.state.at("Display"));
    for (auto _ : run)
        decoding.refresh();
}

/// The memory of this process, in MiB.
double resident()
{
    std::ifstream file("/proc/self/statm");
    double size = 0, pages = 0;
    file >> size >> pages;
    return pages * static_cast<double>(::sysconf(_SC_PAGESIZE)) / (1 << 20);
}

void day(benchmark::State& run, const Scenario& scenario)
{
    for (auto _ : run) {
        Drive drive(scenario);
        Decoding decoding(scenario.technology);
        microseconds refreshAt = kRefresh;
        double afterAnHour = 0;
        std::size_t messages = 0;
        for (auto message = drive.next(); message && message->at < days(1); message = drive.next(), ++messages) {
            decoding.receive(message->bytes);
            if (message->at >= refreshAt) {
                decoding.refresh();
                refreshAt = message->at + kRefresh;
            }
            if (afterAnHour == 0 && message->at >= hours(1))
                afterAnHour = resident();
        }
        run.counters["messages"] = static_cast<double>(messages);
        run.counters["MiB after 1 h"] = afterAnHour;
        run.counters["MiB after 24 h"] = resident();
    }
}

void registerAll()
{
    for (const Scenario& scenario : scenarios()) {
        const auto named = [&](const char* what) { return std::string(what) + "/" + std::string(scenario.name); };
        benchmark::RegisterBenchmark(named("decode").c_str(), decode, scenario)
            ->UseManualTime()
            ->Unit(benchmark::kMillisecond);
        benchmark::RegisterBenchmark(named("refresh").c_str(), refresh, scenario)->Unit(benchmark::kMicrosecond);
    }
    // Registered last, because memory that the other benchmarks keep counts as resident too.
    for (const Scenario& scenario : scenarios())
        benchmark::RegisterBenchmark((std::string("day/") + std::string(scenario.name)).c_str(), day, scenario)
            ->Iterations(1)
            ->Unit(benchmark::kSecond);
}

} // namespace
} // namespace kestrum::bench

int main(int argc, char** argv)
{
    benchmark::Initialize(&argc, argv);
    kestrum::bench::registerAll();
    benchmark::RunSpecifiedBenchmarks();
}
