// A capture as kestrum-decode reads it, damaged or not. The first byte chooses the format: .kcap, .dlf, or the raw
// records of a snapshot's interval.
//
// Messages and skipped bytes are all of the file, in its order; where the plain reader reads a .kcap to its end, both
// give the same messages and nothing is skipped.
#include "Require.h"
#include "tools/ByteWindow.h"
#include "tools/KcapScanner.h"
#include "tools/RecordScanner.h"
#include "voxd/capture/Capture.h"

#include <cstdint>
#include <memory>
#include <sstream>
#include <string>
#include <vector>

namespace kestrum::fuzz {
namespace {

std::unique_ptr<MessageScanner> scannerOf(unsigned kind, ByteWindow& window, MessageScanner::Tell tell)
{
    if (kind == 0)
        return std::make_unique<KcapScanner>(window, std::move(tell));
    const auto origin = kind == 1 ? RecordScanner::Origin::Dlf : RecordScanner::Origin::Interval;
    return std::make_unique<RecordScanner>(window, std::move(tell), origin);
}

void scan(Bytes input)
{
    if (input.empty())
        return;
    const unsigned kind = std::to_integer<unsigned>(input.front()) % 3;
    const Bytes file = input.subspan(1);

    ByteWindow window(file);
    std::uint64_t skipped = 0, size = 0, behind = 0;
    const auto scanner = scannerOf(kind, window, [&](const Fault& fault) {
        require(fault.offset + fault.size <= file.size(), "a fault outside the file");
        skipped += fault.size;
    });
    std::vector<std::string> messages;
    while (const auto message = scanner->next()) {
        require(messages.empty() || scanner->offset() > behind, "a message that does not follow the last one");
        behind = scanner->offset();
        require(behind < file.size(), "a message outside the file");
        messages.emplace_back(textOf(*message));
        size += message->size();
    }
    require(skipped <= file.size() && !scanner->next(), "it goes on behind its end");

    if (kind != 0)
        return;
    std::istringstream stream{std::string(textOf(file))};
    CaptureReader reader(stream, CaptureFormat::Kcap);
    std::vector<std::string> read;
    while (const auto message = reader.next())
        read.emplace_back(textOf(*message));
    if (reader.fault().empty())
        require(messages == read && skipped == 0, "lengths that lead to the end, read in another way");
    require(size + skipped <= file.size(), "more than the file holds");
}

} // namespace
} // namespace kestrum::fuzz

extern "C" int LLVMFuzzerTestOneInput(const std::uint8_t* data, std::size_t size)
{
    kestrum::fuzz::scan(std::as_bytes(std::span(data, size)));
    return 0;
}
