#include "ZPH_GSM/Contracts.h"

#include <gtest/gtest.h>

namespace kestrum {
namespace {

class EverySection : public testing::TestWithParam<SectionContract> {};
class DecodingSection : public testing::TestWithParam<SectionContract> {};

TEST_P(EverySection, HasItsNameAndItsCodesInOrder)
{
    SectionAtWork run(GetParam());
    EXPECT_EQ(run.section->getSectionName(), GetParam().name);
    std::vector<LogCode> codes;
    for (const auto& each : GetParam().codes)
        codes.push_back(each.code);
    EXPECT_EQ(run.section->getLogCodeArray(), codes);
}

TEST_P(EverySection, LogsItsWordFirstWhateverTheRecord)
{
    // The section's codes, short and long, and a foreign code.
    std::vector<RecordBuilder> records = {record(0x1234, 64)};
    for (const auto& each : GetParam().codes) {
        if (each.minimumLength == 0)
            continue;
        records.push_back(record(each.code, each.minimumLength - 1));
        records.push_back(record(each.code, each.minimumLength));
    }
    for (const auto& each : records) {
        SectionAtWork run(GetParam());
        run.receive(each);
        ASSERT_FALSE(run.doubles.log.lines.empty());
        EXPECT_EQ(run.doubles.log.lines.front(), RecordingLog::Line(Priority::Warning, GetParam().traceWord));
        EXPECT_EQ(run.doubles.log.texts(Priority::Warning).size(), 1u);
    }
}

TEST_P(EverySection, IsNotChangedByAForeignCode)
{
    SectionAtWork run(GetParam());
    run.receive(record(0x1234, 300).fill(13, 1));
    EXPECT_TRUE(run.isUntouched()) << run.text();
    EXPECT_EQ(run.doubles.log.errors(), GetParam().reportsForeign
                                            ? std::vector<std::string>{"Received an unknown log message: 4660"}
                                            : std::vector<std::string>{});
}

TEST_P(EverySection, IsHarmlessWithoutANode)
{
    for (const auto& each : GetParam().codes) {
        if (each.minimumLength == 0)
            continue;
        SectionAtWork run(GetParam());
        run.section->updateSectionRef(Value());
        run.receive(record(each.code, each.minimumLength + 300).fill(13, 1));
        run.section->updateSectionRef(GetParam().isList ? Value(makeDictionary()) : Value(makeArray()));
        run.receive(record(each.code, each.minimumLength + 300).fill(13, 1));
        EXPECT_TRUE(run.isUntouched());
    }
}

TEST_P(DecodingSection, IsNotChangedByARecordOneByteShort)
{
    for (const auto& each : GetParam().codes) {
        if (each.minimumLength == 0)
            continue;
        for (const std::size_t length : {std::size_t{11}, std::size_t{13}, each.minimumLength - 1}) {
            SectionAtWork run(GetParam());
            run.receive(record(each.code, each.minimumLength).fill(13, 1).length(length));
            EXPECT_TRUE(run.isUntouched()) << each.code << " of " << length << " bytes: " << run.text();
            EXPECT_TRUE(run.doubles.log.errors().empty());
        }
    }
}

TEST_P(DecodingSection, DecodesARecordOfTheLeastLength)
{
    for (const auto& each : GetParam().codes) {
        // The list of colour codes is only stored for the next measurements.
        if (each.minimumLength == 0 || each.code == 0x51FF)
            continue;
        SectionAtWork run(GetParam());
        run.receive(record(each.code, each.minimumLength));
        EXPECT_FALSE(run.isUntouched()) << each.code;
        EXPECT_TRUE(run.doubles.log.errors().empty());
    }
}

TEST_P(DecodingSection, DoesNotLookAtWhatFollows)
{
    for (const auto& each : GetParam().codes) {
        if (each.minimumLength == 0)
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
    for (const auto& each : GetParam().codes) {
        if (each.minimumLength == 0)
            continue;
        for (std::size_t length = each.minimumLength; length < each.minimumLength + 120; ++length) {
            SectionAtWork run(GetParam());
            run.receive(record(each.code, length).fill(13, 0xFF));
            EXPECT_TRUE(hasOnlyKeys(run.node, GetParam().keys)) << run.text();
            const auto list = run.node.array();
            EXPECT_LE(list ? list->size() : 0, 1 + length / 3);
        }
    }
}

std::vector<SectionContract> decoding()
{
    auto found = kContracts;
    std::erase_if(found, [](const SectionContract& contract) {
        return std::ranges::none_of(contract.codes, [](const CodeContract& each) { return each.minimumLength != 0; });
    });
    return found;
}

constexpr auto kNamed = [](const auto& each) { return std::string(each.param.className); };
INSTANTIATE_TEST_SUITE_P(GsmAndUmts, EverySection, testing::ValuesIn(kContracts), kNamed);
INSTANTIATE_TEST_SUITE_P(GsmAndUmts, DecodingSection, testing::ValuesIn(decoding()), kNamed);

class CellMonitorSection : public testing::TestWithParam<const char*> {};

const SectionContract& contractOf(const char* className)
{
    return *std::ranges::find(kContracts, std::string_view(className), &SectionContract::className);
}

TEST_P(CellMonitorSection, LogsARecordThatHoldsNoArrayOfCells)
{
    for (const auto& broken : {record(0xFF0001, 13), record(0xFF0001, 40),
                               propertyListRecord(0xFF0001, makeDictionary({{"kVoxCell_MCC", 1}}))}) {
        SectionAtWork run(contractOf(GetParam()));
        run.doubles.propertyLists.parsed[describe(broken.propertyList())] = broken.propertyList();
        run.receive(broken);
        EXPECT_EQ(run.doubles.log.errors(), (std::vector<std::string>{"Cell Info Array data could not be constructed",
                                                                      "Failed to get Cell Array\n"}));
        EXPECT_TRUE(contractOf(GetParam()).isList ? run.text() == "[]" : run.isUntouched()) << run.text();
    }
}

TEST_P(CellMonitorSection, LogsNothingForAnArrayWithoutCells)
{
    SectionAtWork run(contractOf(GetParam()));
    const auto empty = cellMonitor({});
    run.doubles.propertyLists.parsed[describe(empty.propertyList())] = empty.propertyList();
    run.receive(empty);
    EXPECT_TRUE(run.doubles.log.errors().empty());
    EXPECT_TRUE(contractOf(GetParam()).isList ? run.text() == "[]" : run.isUntouched()) << run.text();
}

INSTANTIATE_TEST_SUITE_P(GsmAndUmts, CellMonitorSection,
                         testing::Values("GSMServingCell", "NeighboringCells", "ServingPLMN", "UMTSSet", "UMTSRRInfo"),
                         [](const auto& each) { return std::string(each.param); });

} // namespace
} // namespace kestrum
