#include "ZPH_GSM/Contracts.h"

#include "LogGenerator/ZPH_GSM/SimInfo.h"

#include <gtest/gtest.h>
#include <rapidcheck.h>

namespace kestrum {
namespace {

std::vector<std::byte> anyBytes(std::size_t from, std::size_t below)
{
    const auto length = *rc::gen::inRange(from, below);
    const auto raw = *rc::gen::container<std::vector<std::uint8_t>>(length, rc::gen::arbitrary<std::uint8_t>());
    std::vector<std::byte> bytes(raw.size());
    std::ranges::transform(raw, bytes.begin(), [](std::uint8_t each) { return std::byte{each}; });
    return bytes;
}

const SectionContract& anySection()
{
    return kContracts[*rc::gen::inRange(std::size_t{0}, kContracts.size())];
}

TEST(HostileRecords, NeverHarmASectionAndNeverPublishAnotherKey)
{
    EXPECT_TRUE(rc::check([] {
        const auto& contract = anySection();
        SectionAtWork run(contract);
        for (const auto& each : contract.codes) {
            const auto bytes = anyBytes(0, 400);
            try {
                run.receive(bytes, each.code);
            } catch (const LogCode_0xFF0000::UnknownDataException&) {
                RC_ASSERT(each.code == 0xFF0000u);
            }
            RC_ASSERT(hasOnlyKeys(run.node, contract.keys));
        }
    }));
}

TEST(HostileRecords, OfEqualBytesShowTheSame)
{
    EXPECT_TRUE(rc::check([] {
        const auto& contract = anySection();
        for (const auto& each : contract.codes) {
            if (each.minimumLength == 0)
                continue;
            const auto bytes = anyBytes(each.minimumLength, each.minimumLength + 300);
            SectionAtWork once(contract), again(contract);
            once.receive(bytes, each.code);
            again.receive(bytes, each.code);
            again.receive(bytes, each.code);
            RC_ASSERT(once.text() == again.text());
        }
    }));
}

TEST(ShortRecords, NeverChangeTheDisplay)
{
    EXPECT_TRUE(rc::check([] {
        const auto& contract = anySection();
        for (const auto& each : contract.codes) {
            if (each.minimumLength == 0)
                continue;
            SectionAtWork run(contract);
            run.receive(anyBytes(each.minimumLength, each.minimumLength + 300), each.code);
            const auto before = run.text();
            run.receive(anyBytes(0, each.minimumLength), each.code);
            RC_ASSERT(run.text() == before);
        }
    }));
}

TEST(ForeignRecords, NeverChangeTheDisplay)
{
    EXPECT_TRUE(rc::check([] {
        const auto& contract = anySection();
        const LogCode code = *rc::gen::inRange<LogCode>(0, 0x10000);
        if (std::ranges::count(contract.codes, code, &CodeContract::code) != 0)
            return;
        SectionAtWork run(contract);
        run.receive(anyBytes(0, 400), code);
        RC_ASSERT(run.isUntouched());
    }));
}

} // namespace
} // namespace kestrum
