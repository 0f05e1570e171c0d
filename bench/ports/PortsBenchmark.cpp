// Messages from one process to another through the message ports: this program sends to itself, started once more.
#include "platform/SystemLog.h"
#include "platform/linux/FrameSocket.h"
#include "platform/linux/LinuxMessagePorts.h"
#include "platform/linux/QtMainQueue.h"

#include <QCoreApplication>
#include <QProcess>
#include <benchmark/benchmark.h>

#include <chrono>
#include <cstring>
#include <filesystem>
#include <string>
#include <string_view>
#include <vector>

#include <unistd.h>

namespace {

using namespace kestrum;
using namespace std::chrono;

constexpr std::size_t kMessages = 200'000; // in one measurement
constexpr std::size_t kKept = 256 << 10;   // as the service lets a socket keep

struct NoLog final : SystemLog {
    void write(Priority, std::string_view) override {}
};

int sendAll(const std::string& path, std::size_t size)
{
    NoLog log;
    const auto connection = FrameConnection::connectTo(path, seconds(5), log);
    if (!connection)
        return 1;
    const std::vector<std::byte> payload(size);
    for (std::size_t i = 0; i < kMessages; ++i) {
        if (!connection->send({Frame::Kind::Message, 0, 0, payload}))
            return 1;
        if (connection->unsent() >= kKept && !connection->waitUntilSent(seconds(10)))
            return 1;
    }
    return connection->waitUntilSent(seconds(10)) ? 0 : 1;
}

void copyPlainly(const std::vector<std::byte>& from, std::vector<std::byte>& to)
{
    std::memcpy(to.data(), from.data(), from.size());
    benchmark::DoNotOptimize(to.data());
    benchmark::ClobberMemory();
}

void throughPorts(benchmark::State& state)
{
    const auto size = static_cast<std::size_t>(state.range(0));
    NoLog log;
    QtMainQueue queue;
    const auto directory = std::filesystem::temp_directory_path() / ("kestrum-bench-" + std::to_string(::getpid()));
    LinuxMessagePorts ports(directory.string(), queue, log);
    duration<double> all{0}, copies{0};
    for (auto _ : state) {
        std::size_t received = 0;
        steady_clock::time_point begin;
        const auto port = ports.createLocal("bench", [&](std::int32_t, Bytes payload) {
            if (received++ == 0)
                begin = steady_clock::now();
            benchmark::DoNotOptimize(payload.data());
            if (received == kMessages)
                QCoreApplication::quit();
        });
        if (!port)
            return state.SkipWithError("the port cannot be made");
        port->setDeliveryQueue(queue);
        QProcess sender;
        sender.start(QCoreApplication::applicationFilePath(),
                     {"--send", QString::fromStdString((directory / ("bench." + std::to_string(::getpid()))).string()),
                      QString::number(size)});
        QCoreApplication::exec();
        const duration<double> took = steady_clock::now() - begin;
        sender.waitForFinished();
        state.SetIterationTime(took.count());
        all += took;

        const std::vector<std::byte> from(size);
        std::vector<std::byte> to(size);
        const auto copyBegin = steady_clock::now();
        for (std::size_t i = 0; i < kMessages; ++i)
            copyPlainly(from, to);
        copies += steady_clock::now() - copyBegin;
    }
    const auto messages = static_cast<double>(state.iterations()) * kMessages;
    state.counters["messages"] = benchmark::Counter(messages / all.count());
    state.counters["bytes"] = benchmark::Counter(messages * static_cast<double>(size) / all.count());
    state.counters["times a plain copy"] = benchmark::Counter(all / copies);
    std::filesystem::remove_all(directory);
}

BENCHMARK(throughPorts)
    ->Name("one process to another, message bytes:")
    ->Arg(64)
    ->Arg(200)
    ->Arg(2000)
    ->UseManualTime()
    ->Iterations(5)
    ->Unit(benchmark::kMillisecond);

} // namespace

int main(int argc, char** argv)
{
    QCoreApplication application(argc, argv);
    if (argc == 4 && std::string_view(argv[1]) == "--send")
        return sendAll(argv[2], std::stoul(argv[3]));
    benchmark::Initialize(&argc, argv);
    benchmark::RunSpecifiedBenchmarks();
}
