#include "C2K/C2KRun.h"

#include "platform/ChannelMessage.h"

#include <rapidcheck/gtest.h>

#include <set>

namespace kestrum {
namespace {

constexpr LogCode kCodes[] = {0x108A, 0x1183, 0x1192, 0x12B6, 0x119C, 0x119D, 0x127E, 0x134F};

std::set<std::string> keysOf(const Value& dictionary)
{
    std::set<std::string> keys;
    for (const auto held = dictionary.dictionary(); const auto& entry : *held)
        keys.insert(entry.key);
    return keys;
}

/// A record of a random code with a length near those that the decoders check.
RecordBuilder anyRecord(const std::vector<std::uint8_t>& payload)
{
    const auto code = kCodes[*rc::gen::inRange<std::size_t>(0, std::size(kCodes))];
    auto built = record(code, ChannelMessage::kHeaderSize + payload.size());
    for (std::size_t i = 0; i < payload.size(); ++i)
        built.u8(ChannelMessage::kHeaderSize + i, payload[i]);
    return built;
}

RC_GTEST_PROP(HostileC2KRecords, NeverPublishUnderANameThatTheTemplateLacks, ())
{
    C2KRun run;
    run.receive(record(0x1184, 13));
    const auto before = keysOf(run.display());
    const auto length = *rc::gen::element(0, 1, 4, 10, 12, 37, 38, 100, 158, 173, 228, 1737, 2000);
    for (int i = 0; i < 4; ++i)
        run.receive(anyRecord(*rc::gen::container<std::vector<std::uint8_t>>(static_cast<std::size_t>(length),
                                                                             rc::gen::arbitrary<std::uint8_t>())));
    RC_ASSERT(keysOf(run.display()) == before);
}

RC_GTEST_PROP(HostileC2KRecords, ThatAreCutShortChangeNothing, ())
{
    C2KRun run;
    run.receive(record(0x1184, 13));
    const Value before = deepCopy(run.display());
    // Shorter than every minimum.
    run.receive(anyRecord(*rc::gen::container<std::vector<std::uint8_t>>(*rc::gen::inRange<std::size_t>(0, 4),
                                                                         rc::gen::arbitrary<std::uint8_t>())));
    RC_ASSERT(run.display() == before);
}

RC_GTEST_PROP(HostileC2KRecords, OfAnyBytesAreHarmless, (const std::vector<std::uint8_t>& bytes))
{
    C2KRun run;
    run.generator->updateState(run.state, std::as_bytes(std::span(bytes)));
    RC_ASSERT(!run.display().isNull());
}

} // namespace
} // namespace kestrum
