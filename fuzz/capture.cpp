// A capture file, damaged or not. The first byte chooses the format: .kcap, .dlf, or the raw records of a snapshot's
// interval, which are only searched.
//
// Read by lengths: the messages are the file's bytes, in order and without a gap, up to the end or to a fault with
// its offset. Searched after damage: messages and skipped bytes together are the whole file, in order. Where the
// lengths lead to the end, both ways give the same messages and nothing is skipped.
#include "Require.h"
#include "capture/CaptureWriter.h"
#include "capture/RecordReader.h"

#include <cstdint>
#include <memory>
#include <sstream>
#include <string>
#include <vector>

namespace kestrum::fuzz {
namespace {

using Messages = std::vector<std::string>;

/// The message in the form that the file holds.
std::string inFile(CaptureFormat format, Bytes message)
{
    std::ostringstream written;
    if (format == CaptureFormat::Kcap)
        writeKcap(sinkTo(written), message);
    else
        written << textOf(message.subspan(1)); // without the type byte that the reader added
    return written.str();
}

/// The messages; empty unless the lengths lead to the end.
std::optional<Messages> byLengths(Bytes file, CaptureFormat format)
{
    std::istringstream stream{std::string(textOf(file))};
    ByteWindow window(stream);
    std::optional<CaptureFault> found;
    const auto reader = CaptureReader::make(format, window, OnDamage::Stop, [&](const CaptureFault& fault) {
        require(!found, "two faults");
        require(!fault.reason.empty() && fault.size == 0, "a fault without a reason, or bytes were skipped");
        found = fault;
    });
    Messages messages;
    std::size_t behind = 0, notes = 0;
    while (const auto message = reader->next()) {
        require(window.offset() >= behind, "messages overlap");
        // Only whole notes stand between messages.
        require((window.offset() - behind) % kKcapGapSize == 0, "a gap between two messages");
        notes += (window.offset() - behind) / kKcapGapSize;
        behind = window.offset();
        const auto held = inFile(format, *message);
        require(behind + held.size() <= file.size() && textOf(file).substr(behind, held.size()) == held,
                "not what the file holds");
        behind += held.size();
        messages.emplace_back(textOf(*message));
    }
    require(format == CaptureFormat::Kcap || notes == 0, "a note in a format that has none");
    const auto end = found ? found->offset : file.size();
    require(end >= behind && (end - behind) % kKcapGapSize == 0, "it ends elsewhere than behind the last message");
    require(!found || end < file.size(), "a fault behind the end");
    require(!reader->next(), "it goes on behind its end");
    return found ? std::nullopt : std::optional(messages);
}

struct Searched {
    Messages messages;
    std::uint64_t skipped = 0;
};

Searched searched(Bytes file, unsigned kind)
{
    ByteWindow window(file);
    Searched result;
    const auto report = [&](const CaptureFault& fault) {
        require(fault.offset + fault.size <= file.size(), "a fault outside the file");
        result.skipped += fault.size;
    };
    const auto reader =
        kind == 2 ? std::make_unique<RecordReader>(window, OnDamage::Search, report, RecordReader::Origin::Interval)
                  : CaptureReader::make(kind == 0 ? CaptureFormat::Kcap : CaptureFormat::Dlf, window, OnDamage::Search,
                                        report);
    std::uint64_t behind = 0, size = 0;
    while (const auto message = reader->next()) {
        require(result.messages.empty() || window.offset() > behind, "a message that does not follow the last one");
        behind = window.offset();
        require(behind < file.size(), "a message outside the file");
        result.messages.emplace_back(textOf(*message));
        size += message->size();
    }
    require(result.skipped <= file.size() && !reader->next(), "it goes on behind its end");
    require(kind != 0 || size + result.skipped <= file.size(), "more than the file holds");
    return result;
}

void read(Bytes input)
{
    if (input.empty())
        return;
    const unsigned kind = std::to_integer<unsigned>(input.front()) % 3;
    const Bytes file = input.subspan(1);
    const auto found = searched(file, kind);
    if (kind == 2)
        return;
    if (const auto framed = byLengths(file, kind == 0 ? CaptureFormat::Kcap : CaptureFormat::Dlf))
        require(found.messages == *framed && found.skipped == 0, "lengths that lead to the end, read in another way");
}

} // namespace
} // namespace kestrum::fuzz

extern "C" int LLVMFuzzerTestOneInput(const std::uint8_t* data, std::size_t size)
{
    kestrum::fuzz::read(std::as_bytes(std::span(data, size)));
    return 0;
}
