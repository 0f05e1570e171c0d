#include "platform/TelephonyService.h"
#include "platform/posix/LinuxBundle.h"
#include "tools/Comparison.h"
#include "tools/Harmless.h"
#include "tools/Program.h"

#include <CLI/CLI.hpp>

#include <algorithm>
#include <exception>
#include <iostream>
#include <map>
#include <thread>

namespace {

using namespace kestrum;
using namespace kestrum::tools;

constexpr int kFailed = 1, kUsageError = 2;

const std::map<std::string, std::string> kTechnologies = {
    {"ifx", std::string(kVoxLogChannelTechnology_IFX)},
    {"gsm", std::string(kVoxLogChannelTechnology_Zephra_GSM)},
    {"cdma", std::string(kVoxLogChannelTechnology_Zephra_CDMA)},
    {"lte", std::string(kVoxLogChannelTechnology_Zephra_LTE)},
    {"utran", std::string(kVoxLogChannelTechnology_Zephra_UTRAN2)}};

const std::map<std::string, OutputFormat> kFormats = {{"tree", OutputFormat::Tree},
                                                      {"json", OutputFormat::Json},
                                                      {"jsonl", OutputFormat::Jsonl},
                                                      {"csv", OutputFormat::Csv},
                                                      {"geojson", OutputFormat::Geojson}};

constexpr const char* kFooter = R"(Formats:
  tree     what the panes show after the last message
  json     one object: technology, messages, dropped, display, and (with --log) log
  jsonl    one object for each message that changed the display: time, code, changes by path; with --numbers, a
           measurement is an object: text, number, unit
  csv      the same changes as rows: time, code, path, value, number, unit (number and unit are empty if the value is
           not a measurement). A value that a spreadsheet would read as a formula (it begins with = + - @, a tab or a
           return, and is not a number) gets an apostrophe before it
  geojson  a map (RFC 7946): a point for each change of the serving cell or its levels at a known position, which
           "voxd --position" records; with time, technology, speed, cell and levels, whose names end in their unit

Files: channel captures (.kcap), DLF streams (.dlf), snapshots (.kestrum). Files with other names are recognised by their
content. Several files are read one after the other, as parts of one log. "dropped" counts messages of an invalid type,
messages too short for their decoder, and messages that lack the expected property list.

The display goes to standard output, everything else to standard error. Control characters are shown as \xnn on a
terminal. Extracted files replace existing files only with --force.
Exit status: 0 all input was read, 1 there was bad input (the rest is shown), 2 wrong usage. With --compare: 0 nothing
differs, 1 something does, 2 bad input or wrong usage.)";

} // namespace

int main(int argc, char** argv)
{
    DecodeOptions options;
    CLI::App commands("Decodes captures and snapshots of a modem's log offline: a file in, the display out.",
                      "kestrum-decode");
    commands.footer(kFooter);
    commands.set_version_flag("--version", std::string("kestrum-decode ") + KESTRUM_VERSION);
    commands.add_option("FILE", options.files, "Captures and snapshots; - is standard input")->required();
    std::string technology, format = "tree";
    commands.add_option("--technology", technology, "ifx, gsm, cdma, lte or utran (default: as the messages show)")
        ->check(CLI::IsMember(&kTechnologies));
    commands.add_option("--format", format, "tree, json, jsonl, csv or geojson")
        ->check(CLI::IsMember(&kFormats))
        ->capture_default_str();
    commands.add_flag("--log", options.log,
                      "Show the system log too: with json in the object, otherwise on standard error");
    commands.add_flag("--numbers", options.numbers,
                      "With jsonl: write each measurement as an object of text, number and unit");
    bool events = false, cells = false;
    auto* asksForEvents =
        commands.add_flag("--events", events,
                          "Show what happened, not the display: cell changes, areas, states, silence; not with jsonl");
    commands
        .add_flag("--cells", cells,
                  "Show the cells that served, not the display: visits, time, levels, last seen; not with jsonl")
        ->excludes(asksForEvents);
    bool compares = false;
    commands
        .add_flag("--compare", compares,
                  "Show only what differs between the ends of two files; the exit status is that of diff(1)")
        ->excludes(asksForEvents);
    commands.add_flag("--stats", options.stats, "Count the messages of each log code, on standard error");
    commands.add_flag("--follow", options.follow,
                      "Wait for more messages at the end of the last file, until interrupted");
    commands.add_option("--extract", options.extract,
                        "Write a snapshot's DLF stream, and the recovered records as .dlf and .kcap, into a directory");
    commands.add_flag("--force", options.force, "Allow --extract to replace files of the same name");
    // Every piece is decoded twice, so two processors gain nothing.
    const auto processors = std::thread::hardware_concurrency();
    options.jobs = processors < 3 ? 1 : processors;
    commands
        .add_option("-j,--jobs", options.jobs,
                    "Processes that write jsonl and csv at a time (default: as many as there are processors, or\n"
                    "1 on a machine with fewer than 3)")
        ->check(CLI::Range(1, 256));
    try {
        commands.parse(argc, argv);
        if (!options.extract.empty())
            for (const auto& file : options.files)
                if (file.ends_with(".kcap") || file.ends_with(".dlf"))
                    throw CLI::ValidationError("--extract", file + " is not a snapshot");
        if (events || cells) {
            options.shown = events ? DecodeOptions::Shown::Events : DecodeOptions::Shown::Cells;
            if (format != "tree" && format != "json" && format != "csv")
                throw CLI::ValidationError(events ? "--events" : "--cells", "needs --format tree, json or csv");
            if (options.log)
                throw CLI::ValidationError("--log", "shows nothing with --events and --cells");
        }
        if (compares && (options.files.size() != 2 || cells || options.follow || options.log || options.stats ||
                         !options.extract.empty() || format != "tree"))
            throw CLI::ValidationError("--compare", "takes two files, and of the other options only --technology");
        if (options.numbers && format != "jsonl")
            throw CLI::ValidationError("--numbers", "needs --format jsonl");
        if (options.follow && options.files.back().ends_with(".kestrum"))
            throw CLI::ValidationError("--follow", options.files.back() + " is a snapshot, which does not grow");
    } catch (const CLI::ParseError& error) {
        return commands.exit(error) == 0 ? 0 : kUsageError;
    }
    if (!technology.empty())
        options.technology = kTechnologies.at(technology);
    options.format = kFormats.at(format);

    try {
        LinuxBundle bundle;
        return compares ? compareFiles(options, bundle) : decodeFiles(options, bundle);
    } catch (const std::exception& error) {
        std::cerr << "kestrum-decode: " << onOneLine(error.what()) << '\n';
        return compares ? kUsageError : kFailed;
    }
}
