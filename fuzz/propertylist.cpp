// Any bytes are a property list or are refused with a reason. A list that was read can be written, and then reads the
// same, whatever value its memory is reused from.
#include "platform/propertylist/PropertyListCodec.h"

#include <cstdint>
#include <cstdio>
#include <cstdlib>

namespace {

void require(bool condition, const char* what)
{
    if (condition)
        return;
    std::fprintf(stderr, "%s\n", what);
    std::abort();
}

} // namespace

extern "C" int LLVMFuzzerTestOneInput(const std::uint8_t* data, std::size_t size)
{
    kestrum::PropertyListCodec codec;
    const auto bytes = std::as_bytes(std::span(data, size));
    const auto read = codec.parseWithError(bytes);
    require(read.value.isNull() == !read.reason.empty(), "neither a value nor a reason");
    require(read.offset <= size, "an offset beyond the end");
    if (!read)
        return 0;
    // Replaced characters can make two keys equal, so only the second list has to stay the same.
    const auto first = codec.toXml(read.value);
    if (!first)
        return 0; // indented, a large list can exceed the limit
    for (const auto& spent : {codec.parse(bytes), kestrum::Value(kestrum::makeArray({"", codec.parse(bytes)}))}) {
        const auto over = codec.toXml(codec.parseOver(bytes, kestrum::deepCopy(spent)));
        require(over && kestrum::textOf(over->bytes()) == kestrum::textOf(first->bytes()), "it reads differently over");
    }
    const auto second = codec.toXml(codec.parse(first->bytes()));
    require(second.has_value(), "what was written is not read");
    const auto third = codec.toXml(codec.parse(second->bytes()));
    require(third && kestrum::textOf(third->bytes()) == kestrum::textOf(second->bytes()), "it reads differently");
    return 0;
}
