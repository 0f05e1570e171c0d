// A capture file. What is read are the file's own bytes, in their order and without a gap, up to its end or to a fault
// with its place.
#include "voxd/capture/Capture.h"
#include "Require.h"

#include <algorithm>
#include <cstdint>
#include <sstream>
#include <string>

namespace kestrum::fuzz {
namespace {

/// The message as the file holds it.
std::string inFile(CaptureFormat format, Bytes message)
{
    std::ostringstream written;
    if (format == CaptureFormat::Kcap)
        writeKcap(written, message);
    else
        written << textOf(message.subspan(1)); // less the type byte that was put before it
    return written.str();
}

void read(Bytes input)
{
    if (input.empty())
        return;
    const auto format = input.front() == std::byte{0} ? CaptureFormat::Kcap : CaptureFormat::Dlf;
    const std::string file(textOf(input.subspan(1)));
    std::istringstream stream(file);
    CaptureReader reader(stream, format);
    std::string known;
    // Notes are passed over: they are the file's own bytes too.
    const auto passNotes = [&] {
        while (format == CaptureFormat::Kcap && known.size() <= file.size() &&
               kcapGap(bytesOf(std::string_view(file).substr(known.size()))))
            known += std::string_view(file).substr(known.size(), kKcapGapSize);
    };
    while (const auto message = reader.next()) {
        passNotes();
        known += inFile(format, *message);
        require(reader.offset() == known.size(), "a gap between two messages");
        require(known.size() <= file.size() && std::string_view(file).starts_with(known), "not what the file holds");
    }
    passNotes();
    require(reader.offset() == known.size(), "the fault's place is not behind the last message");
    require(reader.fault().empty() == (known.size() == file.size()), "it ends early without a fault");
    require(!reader.next(), "it goes on behind its end");
}

} // namespace
} // namespace kestrum::fuzz

extern "C" int LLVMFuzzerTestOneInput(const std::uint8_t* data, std::size_t size)
{
    kestrum::fuzz::read(std::as_bytes(std::span(data, size)));
    return 0;
}
