#include "sections/SectionContracts.h"

#include "LogGenerator/ZPH_GSM/SimInfo.h"

#include <gtest/gtest.h>
#include <rapidcheck/gtest.h>

namespace kestrum {
namespace {

class EverySection : public testing::TestWithParam<SectionContract> {};
class DecodingSection : public testing::TestWithParam<SectionContract> {};

std::vector<CodeContract> decodedCodes(const SectionContract& contract)
{
    auto codes = contract.codes;
    std::erase_if(codes, [](const CodeContract& each) { return each.minimumLength == 0; });
    return codes;
}

std::vector<SectionContract> decodingSections()
{
    auto sections = technology().sections;
    std::erase_if(sections, [](const SectionContract& each) { return decodedCodes(each).empty(); });
    return sections;
}

std::string unknown(LogCode code)
{
    return "Received an unknown log message: " + std::to_string(code);
}

TEST_P(EverySection, HasItsNameAndItsCodesInOrder)
{
    SectionAtWork run(GetParam());
    EXPECT_EQ(run.section->getSectionName(), GetParam().name);
    std::vector<LogCode> codes;
    for (const auto& each : GetParam().codes)
        codes.push_back(each.code);
    EXPECT_EQ(run.section->getLogCodeArray(), codes);
}

TEST_P(EverySection, LogsItsLineFirstWhateverTheRecord)
{
    // The section's codes, short and long, and a foreign code.
    std::vector<RecordBuilder> records = {record(0x1234, 64)};
    for (const auto& each : decodedCodes(GetParam())) {
        records.push_back(record(each.code, each.minimumLength - 1));
        records.push_back(record(each.code, each.minimumLength));
    }
    for (const auto& each : records) {
        SectionAtWork run(GetParam());
        run.receive(each);
        ASSERT_FALSE(run.doubles.log.lines.empty());
        EXPECT_EQ(run.doubles.log.lines.front(), RecordingLog::Line(GetParam().tracePriority, GetParam().traceLine));
        EXPECT_TRUE(GetParam().logsContents || run.doubles.log.texts(GetParam().tracePriority).size() == 1);
    }
}

TEST_P(EverySection, IsNotChangedByAForeignCode)
{
    const auto& own = GetParam().codes;
    for (const LogCode foreign : {0x1234u, 0x417Au, 0x5137u, 0xB0C1u, 0xB0C2u, 0xB179u, 0xB17Fu, 0xB180u, 0xB186u,
                                  0xD00Au, 0xD00Cu, 0xD00Eu, 0xD0E0u, 0xD0E2u, 0xFF0001u}) {
        if (std::ranges::count(own, foreign, &CodeContract::code) != 0)
            continue;
        SectionAtWork run(GetParam());
        run.receive(record(foreign, 300).fill(13, 1));
        run.receive(record(foreign, 80).fill(13, 0x11));
        EXPECT_TRUE(run.isUntouched()) << foreign << ": " << run.text();
        EXPECT_EQ(run.doubles.log.errors(),
                  std::vector<std::string>(GetParam().reportsForeign ? 2 : 0, unknown(foreign)));
    }
}

TEST_P(EverySection, IsHarmlessWithoutANodeAndOnOneOfTheOtherShape)
{
    const auto otherKind = GetParam().isList() ? Value::Kind::Dictionary : Value::Kind::Array;
    for (const auto& each : decodedCodes(GetParam())) {
        SectionAtWork run(GetParam());
        const Value other = SectionAtWork::nodeOf(otherKind);
        for (const Value& wrong : {Value(), other}) {
            run.section->updateSectionRef(wrong);
            run.receive(record(each.code, each.minimumLength + 300).fill(13, 1));
            run.receive(record(each.code, 80).fill(13, 0x11));
        }
        EXPECT_EQ(other, SectionAtWork::nodeOf(otherKind)) << each.code;
        EXPECT_TRUE(run.isUntouched()) << each.code;
    }
}

TEST_P(DecodingSection, IsNotChangedByAShortRecord)
{
    for (const auto& each : decodedCodes(GetParam())) {
        for (const std::size_t length : {std::size_t{11}, std::size_t{13}, each.minimumLength - 1}) {
            for (const unsigned filler : {1u, 0xFFu}) {
                SectionAtWork run(GetParam());
                run.receive(record(each.code, each.minimumLength).fill(13, filler).length(length));
                EXPECT_TRUE(run.isUntouched()) << each.code << " of " << length << " bytes: " << run.text();
                EXPECT_EQ(run.doubles.log.lines.size(), 1u) << "the trace line alone";
            }
        }
    }
}

TEST_P(DecodingSection, ShowsARecordOfMinimumLength)
{
    for (const auto& each : decodedCodes(GetParam())) {
        SectionAtWork run(GetParam());
        run.receive(record(each.code, each.minimumLength));
        EXPECT_EQ(run.isUntouched(), !each.shows) << each.code;
        EXPECT_TRUE(keepsTo(GetParam(), run.node)) << run.text();
        EXPECT_EQ(run.doubles.log.errors(), std::vector<std::string>(each.reported ? 1 : 0, unknown(each.code)));
    }
}

TEST_P(DecodingSection, DoesNotLookAtWhatFollows)
{
    for (const auto& each : decodedCodes(GetParam())) {
        if (each.countsFromOne)
            continue;
        SectionAtWork least(GetParam()), longer(GetParam());
        least.receive(record(each.code, each.minimumLength));
        longer.receive(record(each.code, each.minimumLength + 500).fill(each.minimumLength, 0x5A));
        EXPECT_EQ(longer.text(), least.text()) << each.code;
    }
}

TEST_P(DecodingSection, ShowsNoMoreThanTheRecordHolds)
{
    // All counts are 255, whatever the record's length.
    for (const auto& each : decodedCodes(GetParam())) {
        for (std::size_t length = each.minimumLength; length < each.minimumLength + 120; ++length) {
            SectionAtWork run(GetParam());
            run.receive(record(each.code, each.minimumLength));
            run.receive(record(each.code, length).fill(13, 0xFF));
            EXPECT_TRUE(keepsTo(GetParam(), run.node)) << run.text();
            const auto list = run.node.array();
            EXPECT_LE(list ? list->size() : 0, 1 + length / GetParam().bytesOfRow);
        }
    }
}

constexpr auto kNamed = [](const auto& each) { return std::string(each.param.className); };
INSTANTIATE_TEST_SUITE_P(Technology, EverySection, testing::ValuesIn(technology().sections), kNamed);
INSTANTIATE_TEST_SUITE_P(Technology, DecodingSection, testing::ValuesIn(decodingSections()), kNamed);

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
    return technology().sections[*rc::gen::inRange(std::size_t{0}, technology().sections.size())];
}

RC_GTEST_PROP(HostileRecords, NeverHarmASectionAndNeverPublishAnotherKey, ())
{
    const auto& contract = anySection();
    SectionAtWork run(contract);
    for (const auto& each : contract.codes) {
        const auto bytes = anyBytes(0, 400);
        try {
            run.receive(bytes, each.code);
        } catch (const LogCode_0xFF0000::UnknownDataException&) {
            RC_ASSERT(each.code == 0xFF0000u);
        }
        RC_ASSERT(keepsTo(contract, run.node));
    }
}

RC_GTEST_PROP(HostileRecords, OfEqualBytesShowTheSame, ())
{
    const auto& contract = anySection();
    for (const auto& each : decodedCodes(contract)) {
        const auto bytes = anyBytes(each.minimumLength, each.minimumLength + 300);
        SectionAtWork once(contract), again(contract);
        once.receive(bytes, each.code);
        again.receive(bytes, each.code);
        again.receive(bytes, each.code);
        RC_ASSERT(once.text() == again.text());
    }
}

RC_GTEST_PROP(ShortRecords, NeverChangeTheDisplay, ())
{
    const auto& contract = anySection();
    for (const auto& each : decodedCodes(contract)) {
        SectionAtWork run(contract);
        run.receive(anyBytes(each.minimumLength, each.minimumLength + 300), each.code);
        const auto before = run.text();
        run.receive(anyBytes(0, each.minimumLength), each.code);
        RC_ASSERT(run.text() == before);
    }
}

RC_GTEST_PROP(ForeignRecords, NeverChangeTheDisplay, ())
{
    const auto& contract = anySection();
    const LogCode code = *rc::gen::inRange<LogCode>(0, 0x10000);
    if (std::ranges::count(contract.codes, code, &CodeContract::code) != 0)
        return;
    SectionAtWork run(contract);
    run.receive(anyBytes(0, 400), code);
    RC_ASSERT(run.isUntouched());
}

} // namespace
} // namespace kestrum
