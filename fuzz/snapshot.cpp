// A snapshot file, whole or damaged.
//
// It is listed and recovered, or refused with a reason, and a second run gives the same result. The messages
// recovered from a damaged file can be listed and recovered too.
#include "tools/Snapshot.h"
#include "Require.h"
#include "platform/propertylist/PropertyListCodec.h"

#include <cstdint>
#include <stdexcept>
#include <string>
#include <vector>

namespace kestrum::fuzz {
namespace {

using namespace tools;

PropertyListCodec kCodec;

/// The listing for users and the messages; empty where the snapshot is refused.
std::vector<std::string> recovered(const Value& list)
{
    std::vector<std::string> all;
    std::uint64_t faults = 0;
    try {
        const Snapshot snapshot("file", list, [&](const CaptureFault& fault) {
            require(!fault.reason.empty(), "a fault without a reason");
            ++faults;
        });
        for (const auto& entry : snapshot.listing().entries) {
            require(!entry.content.empty(), "an entry of no kind");
            all.push_back(entry.description);
        }
        snapshot.recover(kCodec, [&](Bytes message) { all.emplace_back(textOf(message)); });
    } catch (const std::runtime_error& refusal) {
        require(*refusal.what() != '\0', "refused without a reason");
    }
    all.push_back(std::to_string(faults));
    return all;
}

void read(Bytes input)
{
    const Value list = kCodec.parse(input);
    const Value shown = list ? list : Snapshot::salvaged(input);
    if (shown)
        require(recovered(shown) == recovered(shown), "equal snapshots, read in another way");
}

} // namespace
} // namespace kestrum::fuzz

extern "C" int LLVMFuzzerTestOneInput(const std::uint8_t* data, std::size_t size)
{
    kestrum::fuzz::read(std::as_bytes(std::span(data, size)));
    return 0;
}
