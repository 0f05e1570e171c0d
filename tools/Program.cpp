#include "tools/Program.h"

#include "capture/CaptureReader.h"
#include "platform/propertylist/PropertyListCodec.h"
#include "support/Format.h"
#include "tools/EventsOutput.h"
#include "tools/Extraction.h"
#include "tools/Harmless.h"
#include "tools/Input.h"
#include "tools/PieceWriters.h"
#include "tools/Snapshot.h"

#include <algorithm>
#include <chrono>
#include <csignal>
#include <filesystem>
#include <set>
#include <stdexcept>
#include <unistd.h>

namespace kestrum::tools {
namespace {

using Existing = WholeFile::Existing;
using SteadyClock = std::chrono::steady_clock;

constexpr int kBadInput = 1, kUsageError = 2;

/// Thrown for a followed snapshot, which is not possible.
struct WrongUsage {};
constexpr std::uint64_t kMostFaultLines = 100;
/// The shortest interval between two displays of a followed file, as in the panes.
constexpr std::chrono::milliseconds kRefresh{2000};

/// A process has written its piece of the log.
struct PieceWritten {};
/// The messages of one piece, in bytes: some tenths of a second of work.
constexpr std::size_t kReaderPiece = 1 << 20;

std::unique_ptr<Output> makeOutput(const DecodeOptions& options, OutputFile& data, OutputFile& remarks)
{
    switch (options.shown) {
    case DecodeOptions::Shown::Events:
        return makeEventsOutput(options.format, data, remarks);
    case DecodeOptions::Shown::Cells:
        return makeCellsOutput(options.format, data, remarks);
    case DecodeOptions::Shown::Display:
        break;
    }
    return Output::make(options.format, {.log = options.log, .numbers = options.numbers}, data, remarks);
}

/// Whether pieces of the log can be written by several processes: each of them reads the files by itself.
bool mayShare(const DecodeOptions& options)
{
    const auto isReadTwice = [](const std::string& file) {
        std::error_code none;
        const auto type = std::filesystem::status(file, none).type();
        return file != "-" &&
               (type == std::filesystem::file_type::regular || type == std::filesystem::file_type::not_found);
    };
    return options.jobs > 1 && options.shown == DecodeOptions::Shown::Display &&
           (options.format == OutputFormat::Jsonl || options.format == OutputFormat::Csv) && !options.follow &&
           options.extract.empty() && std::ranges::all_of(options.files, isReadTwice);
}

/// Shows the progress of a long run on a terminal.
class Progress {
public:
    Progress(OutputFile& to, bool isWanted) : _to(to), _isWatched(isWanted && ::isatty(STDERR_FILENO) != 0) {}

    void show(const std::string& file, std::uint64_t done, std::optional<std::uint64_t> size)
    {
        const auto now = SteadyClock::now();
        if (!_isWatched || now < _next)
            return;
        _next = now + std::chrono::milliseconds(250);
        const auto part = size && *size != 0 ? formatted(" (%lu%%)", std::min<std::uint64_t>(100, done * 100 / *size))
                                             : std::string();
        _to.control(formatted("\r%s: %lu MB%s\x1b[K", onOneLine(file), done / 1'000'000, part));
        _to.flush();
        _isShown = true;
    }
    /// Removes the progress, so that a line can be written.
    void clear()
    {
        if (std::exchange(_isShown, false))
            _to.control("\r\x1b[K");
    }

private:
    OutputFile& _to;
    const bool _isWatched;
    bool _isShown = false;
    SteadyClock::time_point _next = SteadyClock::now() + std::chrono::seconds(1);
};

class Program {
public:
    Program(const DecodeOptions& options, Bundle& bundle, std::unique_ptr<Output> output)
        : _options(options),
          _output(output ? std::move(output) : makeOutput(options, _data, _remarks)),
          _decoding(options.technology, bundle, _lists,
                    options.log ? [this](Priority priority, std::string_view text) {
                                if (!_isSilent)
                                    _output->logLine(priority, text);
                            }
                                : Decoding::LogLine(),
                    [this](const Decoding::Decoded& decoded) {
                        if (!_isSilent)
                            _output->message(_decoding, decoded);
                    })
    {
        if (mayShare(options))
            _writers.emplace(options.jobs, _data, _remarks);
    }

    int run()
    {
        try {
            for (const auto& file : _options.files)
                decode(file, &file == &_options.files.back());
            endPiece();
            finish();
        } catch (const PieceWritten&) {
            _data.flush();
            _remarks.flush();
            return 0;
        } catch (const WriterFailure&) {
            return kBadInput;
        } catch (const ClosedPipe&) {
            return 0; // The reader wants no more.
        } catch (const WrongUsage&) {
            complain(_file + ": cannot be followed, because a snapshot does not grow");
            _output->finish();
            _data.flush();
            return kUsageError;
        }
        return _isBad ? kBadInput : 0;
    }

private:
    // After the first piece this process only decodes, so that each writer begins with the display of its piece.
    void take(Bytes message)
    {
        if (_writers && _inPiece >= kReaderPiece) {
            if (_isWriter)
                throw PieceWritten();
            _inPiece = 0;
            _progress.clear();
            _isWriter = _writers->start();
            _isSilent = !_isWriter;
            if (_isWriter)
                _output->resume(_decoding);
        }
        _inPiece += message.size();
        _decoding.take(message);
    }

    void endPiece()
    {
        if (_isWriter)
            throw PieceWritten();
        if (_writers)
            _writers->finish();
        _isSilent = false;
    }

    void decode(const std::string& file, bool isLast)
    {
        _file = file == "-" ? "standard input" : file;
        _faults = {};
        try {
            Input input(file, _options.follow && isLast);
            do {
                // Shows the decoded messages before it waits for more.
                ByteWindow window([&](std::span<std::byte> into) {
                    _data.flush();
                    _remarks.flush();
                    if (!_isWriter)
                        _progress.show(_file, _window == nullptr ? 0 : _window->offset(), input.size());
                    return input.read(into);
                });
                _window = &window;
                _isRestarted = false;
                decode(file, input, window);
                _window = nullptr;
            } while (_isRestarted);
        } catch (const OutputFailure&) {
            throw;
        } catch (const std::runtime_error& error) {
            complain(formatted("%s: %s", _file, error.what()));
        }
        _window = nullptr;
        if (_faults.lines > kMostFaultLines)
            complain(formatted("%s: %lu more errors, with %lu bytes skipped", _file, _faults.lines - kMostFaultLines,
                               _faults.unreported));
    }

    void decode(const std::string& file, Input& input, ByteWindow& window)
    {
        const Bytes begin = window.peek(8);
        const auto known = captureFormat(file);
        if (!known &&
            (file.ends_with(".kestrum") || textOf(begin).starts_with("<") || textOf(begin).starts_with("bplist")))
            return decodeSnapshot(file, input, window);
        const auto reader = CaptureReader::make(known.value_or(captureFormatFromBytes(begin)), window, OnDamage::Search,
                                                [this](const CaptureFault& fault) { report(fault); });
        read(*reader, input, window);
    }

    void read(CaptureReader& reader, Input& input, ByteWindow& window)
    {
        for (bool mayGrow = input.mayGrow(); mayGrow;) {
            while (const auto message = reader.next(true))
                take(*message);
            mayGrow = waitForMore(input);
            if (_isRestarted)
                break;
            window.resume();
        }
        while (const auto message = _isRestarted ? std::nullopt : reader.next())
            take(*message);
        _missing += reader.missing();
    }

    bool waitForMore(Input& input)
    {
        for (;;) {
            const auto messages = _decoding.total().messages;
            if (messages != _shownMessages && SteadyClock::now() >= _nextDisplay) {
                _output->display(_decoding);
                _shownMessages = messages;
                _nextDisplay = SteadyClock::now() + kRefresh;
            }
            _data.flush();
            _remarks.flush();
            std::optional<std::chrono::milliseconds> atMost;
            if (messages != _shownMessages)
                atMost = std::chrono::ceil<std::chrono::milliseconds>(_nextDisplay - SteadyClock::now());
            const auto woken = input.wait(atMost);
            _isRestarted = woken == Input::Woken::Restarted;
            if (_isRestarted)
                remark(_file + " was replaced or emptied: it is read from its start");
            if (woken == Input::Woken::Gone)
                remark(_file + " was deleted: waiting for a new file");
            else if (woken != Input::Woken::TimedOut)
                return woken != Input::Woken::Ended;
        }
    }

    void decodeSnapshot(const std::string& file, Input& input, ByteWindow& window)
    {
        if (input.mayGrow())
            throw WrongUsage();
        const Bytes all = window.peek(PropertyListCodec::kMaxBytes + 1);
        const auto parsed = _lists.parseWithError(all);
        const Value list = parsed ? parsed.value : Snapshot::salvaged(all);
        if (!parsed) {
            const auto reason = formatted("at offset %lu: %s", parsed.offset, parsed.reason);
            if (!list)
                throw std::runtime_error(reason);
            complain(formatted("%s: %s; the remaining raw records are shown", _file, reason));
        }
        const Snapshot snapshot(file, list, [this](const CaptureFault& fault) { report(fault); });
        if (!_isSilent)
            _output->snapshot(snapshot.listing());
        std::optional<Extraction> extraction;
        if (!_options.extract.empty())
            try {
                const auto stem = std::filesystem::path(file).stem().string();
                // A snapshot of this run must not replace the files of an earlier snapshot of this run.
                const bool mayReplace = _options.force && _extracted.insert(stem).second;
                extraction.emplace(_options.extract, snapshot, mayReplace ? Existing::Replaced : Existing::Kept);
            } catch (const std::exception& error) {
                complain(formatted("%s: %s", _file, error.what()));
            }
        snapshot.recover(_lists, [&](Bytes message) {
            if (extraction)
                extraction->take(message);
            take(message);
        });
        if (!extraction)
            return;
        extraction->finish();
        if (extraction->inKcapAlone() != 0 && snapshot.dlf())
            remark(formatted("%s: %lu messages that are not ordinary records are only in the extracted .kcap", _file,
                             extraction->inKcapAlone()));
    }

    void finish()
    {
        try {
            _decoding.finish();
        } catch (const std::runtime_error& error) {
            complain(error.what());
        }
        if (_decoding.total().messages == 0)
            remark("no message was found");
        _progress.clear();
        _remarks.flush();
        if (_shownMessages == 0 || _shownMessages != _decoding.total().messages)
            _output->display(_decoding);
        _output->finish();
        _data.flush();
        if (_options.stats)
            showStatistics();
        _remarks.flush();
    }

    void showStatistics()
    {
        _remarks.write("code        messages     decoded   too short  without subscriber     refused\n");
        const auto row = [this](const std::string& name, const Tally& tally) {
            const auto column = [](std::uint64_t count, std::size_t width) {
                const auto digits = std::to_string(count);
                return std::string(width - std::min(width - 1, digits.size()), ' ') + digits;
            };
            std::string line = name;
            line.resize(std::max<std::size_t>(line.size(), 8), ' ');
            _remarks.write(line + column(tally.messages, 12) + column(tally.decoded, 12) + column(tally.tooShort, 12) +
                           column(tally.withoutSubscriber, 20) + column(tally.refused, 12) + '\n');
        };
        for (const auto& [code, tally] : _decoding.statistics())
            row(code ? codeText(*code) : "(none)", tally);
        row("total", _decoding.total());
        _remarks.write(formatted("bytes skipped: %lu\n", _skipped));
        if (_missing > 0)
            _remarks.write(formatted("messages missing: %lu\n", _missing));
    }

    void report(const CaptureFault& fault)
    {
        _skipped += fault.size;
        _isBad = true;
        if (++_faults.lines > kMostFaultLines) {
            _faults.unreported += fault.size;
            return;
        }
        const auto skipped = fault.size == 0 ? std::string() : formatted("; %lu bytes skipped", fault.size);
        complain(formatted("%s: at offset %lu: %s%s", _file, fault.offset, fault.reason, skipped));
    }
    void complain(const std::string& line)
    {
        _isBad = true;
        remark(line);
    }
    void remark(const std::string& line)
    {
        if (_isSilent)
            return;
        _progress.clear();
        _remarks.write("kestrum-decode: " + onOneLine(line) + '\n');
        _remarks.flush();
    }

    const DecodeOptions& _options;
    OutputFile _data{STDOUT_FILENO}, _remarks{STDERR_FILENO, OutputFile::Loss::Ignored};
    // Not shown on a terminal that shows the rows.
    Progress _progress{_remarks,
                       !_options.follow && (_options.format == OutputFormat::Tree ||
                                            _options.format == OutputFormat::Json || ::isatty(STDOUT_FILENO) == 0)};
    std::optional<PieceWriters> _writers; ///< empty: this process writes everything
    std::size_t _inPiece = 0;             ///< bytes
    bool _isWriter = false, _isSilent = false;
    PropertyListCodec _lists;
    std::unique_ptr<Output> _output;
    Decoding _decoding;

    std::string _file; ///< its name in remarks
    ByteWindow* _window = nullptr;
    struct {
        std::uint64_t lines = 0, unreported = 0; ///< faults; bytes skipped by faults that were not reported in a line
    } _faults;
    std::uint64_t _skipped = 0, _missing = 0;
    std::set<std::string> _extracted; ///< the snapshots' names without extension
    bool _isBad = false, _isRestarted = false;
    std::uint64_t _shownMessages = 0;
    SteadyClock::time_point _nextDisplay{};
};

} // namespace

int decodeFiles(const DecodeOptions& options, Bundle& bundle, std::unique_ptr<Output> output)
{
    // With SIGPIPE ignored, write() reports that the reader has closed the pipe.
    std::signal(SIGPIPE, SIG_IGN);
    return Program(options, bundle, std::move(output)).run();
}

} // namespace kestrum::tools
