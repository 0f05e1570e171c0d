// Messages through the message ports between two processes, which both run this program.
#include "decoding/Main.h"
#include "platform/SystemLog.h"
#include "platform/qt/FrameSocket.h"
#include "platform/qt/LinuxMessagePorts.h"
#include "platform/qt/QtMainQueue.h"
#include "scenarios/Drive.h"

#include <QCoreApplication>
#include <QProcess>
#include <benchmark/benchmark.h>

#include <algorithm>
#include <chrono>
#include <cstring>
#include <filesystem>
#include <functional>
#include <string>
#include <string_view>
#include <vector>

#include <unistd.h>

namespace kestrum::bench {
namespace {

using namespace std::chrono;

using Payloads = std::vector<std::vector<std::byte>>;

constexpr std::size_t kMessages = 200'000; // per measurement
constexpr std::size_t kKept = 256 << 10;   // the buffer that the service gives a socket

struct NoLog final : SystemLog {
    void write(Priority, std::string_view) override {}
};

/// Gives both processes the same payloads for the same argument: a number is a size, everything else a scenario's
/// name.
Payloads payloadsOf(const std::string& what)
{
    if (std::ranges::all_of(what, [](char c) { return c >= '0' && c <= '9'; }))
        return Payloads(kMessages, std::vector<std::byte>(std::stoul(what)));
    const auto scenario = std::ranges::find(scenarios(), what, &Scenario::name);
    Payloads payloads;
    for (auto& message : driven(*scenario, minutes(10)))
        payloads.push_back(std::move(message.bytes));
    return payloads;
}

int sendAll(const std::string& path, const std::string& what)
{
    NoLog log;
    const auto payloads = payloadsOf(what);
    const auto connection = FrameConnection::connectTo(path, seconds(5), log);
    if (!connection)
        return 1;
    for (const auto& payload : payloads) {
        if (!connection->send({Frame::Kind::Message, 0, 0, payload}))
            return 1;
        if (connection->unsent() >= kKept && !connection->waitUntilSent(seconds(10)))
            return 1;
    }
    return connection->waitUntilSent(seconds(10)) ? 0 : 1;
}

duration<double> timeOfCopies(const Payloads& payloads)
{
    const auto longest = std::ranges::max(payloads, {}, &std::vector<std::byte>::size).size();
    std::vector<std::byte> to(longest);
    const auto begin = steady_clock::now();
    for (const auto& from : payloads) {
        std::memcpy(to.data(), from.data(), from.size());
        benchmark::DoNotOptimize(to.data());
        benchmark::ClobberMemory();
    }
    return steady_clock::now() - begin;
}

/// Measures from the first message's arrival to the last one's end. Calls `receive` with each message.
void throughPorts(benchmark::State& state, const std::string& what, const std::function<void(Bytes)>& receive)
{
    NoLog log;
    QtMainQueue queue;
    const auto directory = std::filesystem::temp_directory_path() / ("kestrum-bench-" + std::to_string(::getpid()));
    LinuxMessagePorts ports(directory.string(), queue, log);
    const auto payloads = payloadsOf(what);
    std::size_t bytes = 0;
    for (const auto& payload : payloads)
        bytes += payload.size();
    duration<double> all{0}, copies{0};
    for (auto _ : state) {
        std::size_t received = 0;
        steady_clock::time_point begin;
        const auto port = ports.createLocal("bench", [&](std::int32_t, Bytes payload) {
            if (received++ == 0)
                begin = steady_clock::now();
            receive(payload);
            if (received == payloads.size())
                QCoreApplication::quit();
        });
        if (!port)
            return state.SkipWithError("the port cannot be made");
        port->setDeliveryQueue(queue);
        QProcess sender;
        sender.start(QCoreApplication::applicationFilePath(),
                     {"--send", QString::fromStdString((directory / ("bench." + std::to_string(::getpid()))).string()),
                      QString::fromStdString(what)});
        QCoreApplication::exec();
        const duration<double> took = steady_clock::now() - begin;
        sender.waitForFinished();
        state.SetIterationTime(took.count());
        all += took;
        copies += timeOfCopies(payloads);
    }
    const auto runs = static_cast<double>(state.iterations());
    state.counters["messages/s"] = runs * static_cast<double>(payloads.size()) / all.count();
    state.counters["bytes/s"] = runs * static_cast<double>(bytes) / all.count();
    state.counters["plain copies"] = all / copies;
    std::filesystem::remove_all(directory);
}

void transport(benchmark::State& state)
{
    throughPorts(state, std::to_string(state.range(0)),
                 [](Bytes payload) { benchmark::DoNotOptimize(payload.data()); });
}

/// The whole path of the application's messages, up to the display.
void endToEnd(benchmark::State& state, const Scenario& scenario)
{
    constexpr std::size_t kMessagesOfARefresh = 300; // as in two seconds of a drive
    Decoding decoding(scenario.technology);
    std::size_t received = 0;
    throughPorts(state, std::string(scenario.name), [&](Bytes payload) {
        decoding.receive(payload);
        if (++received % kMessagesOfARefresh == 0)
            decoding.refresh();
    });
}

void registerAll()
{
    benchmark::RegisterBenchmark("transport, message bytes:", transport)
        ->Arg(64)
        ->Arg(200)
        ->Arg(2000)
        ->UseManualTime()
        ->Iterations(5)
        ->Unit(benchmark::kMillisecond);
    for (const Scenario& scenario : scenarios())
        if (scenario.name != "drive") // the scenario "drive" changes its technology on the way
            benchmark::RegisterBenchmark(("to the display: " + std::string(scenario.name)).c_str(), endToEnd, scenario)
                ->UseManualTime()
                ->Iterations(5)
                ->Unit(benchmark::kMillisecond);
}

} // namespace
} // namespace kestrum::bench

int main(int argc, char** argv)
{
    QCoreApplication application(argc, argv);
    if (argc == 4 && std::string_view(argv[1]) == "--send")
        return kestrum::bench::sendAll(argv[2], argv[3]);
    kestrum::bench::registerAll();
    return kestrum::bench::runAll(argc, argv);
}
