#include "capture/CaptureWriter.h"
#include "platform/posix/LinuxSystemLog.h"
#include "platform/posix/RuntimeDirectory.h"
#include "platform/propertylist/PropertyListCodec.h"
#include "platform/qt/LinuxClock.h"
#include "platform/qt/QtMainQueue.h"
#include "platform/qt/TerminationSignals.h"
#include "support/Format.h"
#include "voxd/Faults.h"
#include "voxd/Gpsd.h"
#include "voxd/PositionTrack.h"
#include "voxd/ReplaySource.h"
#include "voxd/Service.h"
#include "voxd/modem/ModemManager.h"
#include "voxd/modem/ModemSource.h"
#include "voxd/scenarios/Scenario.h"

#include <CLI/CLI.hpp>
#include <QCoreApplication>

#include <cmath>
#include <csignal>
#include <cstdlib>
#include <fstream>
#include <iostream>
#include <stdexcept>

namespace {

using namespace kestrum;

constexpr int kRunTimeError = 1, kUsageError = 2;
// The maximum time for putting the modem's settings back when the service ends.
constexpr std::chrono::seconds kPutBackLimit{3};
constexpr std::string_view kFirstModem = "first", kEveryModem = "all";

struct Options {
    std::string scenario, replay, modem, record, write, start;
    double speed = 1, seconds = 60;
    bool loop = false, identities = false;
    std::uint64_t seed = 1;
    std::vector<std::string> faults;
    std::optional<std::string> position;
};

std::string scenarioNames()
{
    std::string lines = "The live scenario:";
    for (const auto& each : scenarios())
        lines += formatted("\n%s: %s", each.name, each.summary);
    return lines;
}

std::unique_ptr<Source> makeSource(const Options& options, PropertyLists& lists)
{
    if (!options.replay.empty())
        return std::make_unique<ReplaySource>(options.replay, options.loop, lists);
    const Date start = options.start.empty() ? LinuxClock().now() : *dateFromIso(options.start);
    return makeScenario(options.scenario, {options.seed, start, lists});
}

std::ofstream openForWriting(const std::string& path)
{
    std::ofstream file(path, std::ios::binary | std::ios::trunc);
    if (!file)
        throw std::runtime_error(path + ": cannot be written");
    return file;
}

ModemTreeSetting treeSetting(const Options& options)
{
    ModemTreeSetting setting{.everyModem = options.modem == kEveryModem, .identities = options.identities};
    if (options.modem != kFirstModem && options.modem != kEveryModem)
        setting.wanted = options.modem;
    return setting;
}

// Needed because CLI11's ranges accept not-a-number.
std::string notFinite(const std::string& text)
{
    return std::isfinite(std::strtod(text.c_str(), nullptr)) ? std::string() : text + " is not a finite number";
}

// Writes the source's first seconds to a file, without pacing and without a service.
void writeCapture(Source& source, const Options& options)
{
    auto file = openForWriting(options.write);
    const std::chrono::duration<double> end(options.seconds);
    const auto sink = sinkTo(file);
    for (auto message = source.next(); message && message->at < end; message = source.next())
        writeKcap(sink, message->bytes);
    if (!file.flush())
        throw std::runtime_error(options.write + ": cannot be written completely");
}

int serve(QCoreApplication& application, const Options& options)
{
    // A closed log or output must not end the service.
    std::signal(SIGPIPE, SIG_IGN);
    std::unique_ptr<ModemManager> modems;
    const TerminationSignals termination([&, ending = false]() mutable {
        if (modems && !std::exchange(ending, true))
            modems->end(kPutBackLimit, [] { QCoreApplication::quit(); });
        else
            application.quit();
    });
    LinuxSystemLog log(standardErrorSink("voxd"), logLevel("voxd", LOG_INFO));
    PropertyListCodec lists;
    const LinuxClock clock;
    QtMainQueue queue;
    std::unique_ptr<Source> source;
    if (options.modem.empty()) {
        source = makeSource(options, lists);
    } else {
        modems = std::make_unique<ModemManager>(ModemManager::systemBus, options.modem, queue, log);
        source = std::make_unique<ModemSource>(*modems, treeSetting(options), queue, clock, lists);
    }
    std::ofstream record;
    if (!options.record.empty())
        record = openForWriting(options.record);
    Faults faults(options.faults, log);
    const auto unsteady = faults.unsteady(*source);
    Service::Settings settings{runtimeDirectory(), options.speed};
    if (!options.faults.empty())
        settings.send = [&](FrameConnection& connection, const Frame& frame) { return faults.send(connection, frame); };
    std::optional<Gpsd> gpsd;
    std::optional<PositionTrack> track;
    if (options.position) {
        gpsd.emplace(*Gpsd::addressFrom(*options.position), log);
        track.emplace([&] { return gpsd->current(); }, lists);
        settings.accompany = [&](Source::Message& message) { return track->accompany(message); };
    }
    const auto recorded = [&](const auto& write) {
        if (!record.is_open())
            return;
        write();
        if (!record.flush()) {
            log.write(Priority::Error, options.record + ": cannot be written; the recording ends here");
            record.close();
        }
    };
    Service service(settings, unsteady ? *unsteady : *source, lists, log,
                    {.streamed = [&](Bytes message) { recorded([&] { writeKcap(sinkTo(record), message); }); },
                     .dropped = [&](std::uint64_t count) { recorded([&] { writeKcapGap(sinkTo(record), count); }); }});
    service.sourceEnded = [&] {
        const auto* const replay = dynamic_cast<const ReplaySource*>(source.get());
        if (replay != nullptr && !replay->fault().empty())
            log.write(Priority::Error, replay->fault());
        else
            log.write(Priority::Notice, "the log has ended; clients stay connected");
    };
    if (const auto problem = service.start())
        throw std::runtime_error(problem->text);
    std::cout << "voxd: serving " << source->technology() << " in " << runtimeDirectory() << std::endl;
    return QCoreApplication::exec();
}

} // namespace

int main(int argc, char** argv)
{
    Options options;
    CLI::App commands("Kestrum's telephony service: streams a modem's log to field-test displays.", "voxd");
    commands.set_version_flag("--version", std::string("voxd ") + KESTRUM_VERSION);
    auto* const scenario = commands.add_option("--scenario", options.scenario, scenarioNames());
    auto* const replay = commands.add_option("--replay", options.replay, "A capture, .kcap or .dlf");
    commands.add_flag("--loop", options.loop, "Start the capture again when it ends")->needs(replay);
    auto* const modem =
        commands
            .add_option("--modem", options.modem,
                        "The machine's own modem, live, of ModemManager: the first, all of them, or the one "
                        "whose device identifier begins with ID")
            ->type_name("[ID|first|all]")
            ->expected(0, 1)
            ->excludes(scenario)
            ->excludes(replay);
    commands
        .add_flag("--identities", options.identities,
                  "Show the identities of the SIM and the modem in full, not masked")
        ->needs(modem);
    auto* const speed = commands.add_option("--speed", options.speed, "Speed relative to real time")
                            ->check(notFinite)
                            ->check(CLI::Range(0.001, 1e6))
                            ->capture_default_str();
    modem->excludes(speed);
    commands.add_option("--seed", options.seed, "Seed of the scenario; equal seeds give equal scenarios")
        ->needs(scenario)
        ->capture_default_str();
    commands
        .add_option("--start", options.start,
                    "Time at which the scenario begins, such as 2026-11-16T06:05:42Z (default: now)")
        ->needs(scenario)
        ->check([](const std::string& text) {
            return dateFromIso(text) ? "" : text + " is not a date such as 2026-11-16T06:05:42Z";
        });
    auto* const record =
        commands.add_option("--record", options.record, "Write all streamed messages to a capture (.kcap)");
    auto* const write =
        commands.add_option("--write", options.write, "Write a capture without waiting and without serving, then end");
    commands.add_option("--seconds", options.seconds, "Length in seconds of the capture that --write writes")
        ->needs(write)
        ->check(notFinite)
        ->check(CLI::Range(0.001, 1e9))
        ->capture_default_str();
    commands
        .add_option("--position", options.position,
                    "Add this machine's position to the log, from gpsd (default: localhost:2947)")
        ->type_name("[HOST:PORT]")
        ->expected(0, 1)
        ->excludes(write)
        ->check([](const std::string& text) {
            return Gpsd::addressFrom(text) ? "" : text + " is not an address such as localhost:2947";
        });
    commands.add_option("--fault", options.faults, Faults::help())
        ->type_name("NAME[,NAME...]")
        ->delimiter(',')
        ->allow_extra_args(false)
        ->excludes(write)
        ->check([](const std::string& name) { return Faults::exists(name) ? "" : "there is no fault " + name; });
    scenario->excludes(replay)->check([](const std::string& name) {
        for (const auto& each : scenarios())
            if (each.name == name)
                return std::string();
        return "there is no scenario " + name;
    });
    record->excludes(write);
    modem->excludes(write);
    try {
        commands.parse(argc, argv);
        if (modem->count() > 0 && options.modem.empty())
            options.modem = kFirstModem;
        if (options.scenario.empty() && options.replay.empty() && options.modem.empty())
            throw CLI::RequiredError("--scenario, --replay or --modem");
    } catch (const CLI::ParseError& error) {
        return commands.exit(error) == 0 ? 0 : kUsageError;
    }

    try {
        if (!options.write.empty()) {
            PropertyListCodec lists;
            writeCapture(*makeSource(options, lists), options);
            return 0;
        }
        QCoreApplication application(argc, argv);
        return serve(application, options);
    } catch (const std::exception& error) {
        std::cerr << "voxd: " << error.what() << std::endl;
        return kRunTimeError;
    }
}
