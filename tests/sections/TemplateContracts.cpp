#include "LogGenerator/ZPH_GSM/SimInfo.h"
#include "sections/SectionContracts.h"
#include "sections/TechnologyRun.h"

#include <gtest/gtest.h>
#include <rapidcheck/gtest.h>

#include <cstdint>
#include <map>
#include <span>

namespace kestrum {
namespace {

/// A run of the technology with its shipped template.
struct ShippedRun : TechnologyRun<ZPHLogGenerator2> {
    ShippedRun() : TechnologyRun(technology().resource, technology().makeGenerator) {}

    using TechnologyRun::receive;
    void receive(const RecordBuilder& built) { receive(built.bytes()); }
    void receiveCells(const Value& cells)
    {
        const auto header = record(0xFF0001, RecordBuilder::kHeaderSize);
        std::vector<std::byte> message(header.bytes().begin(), header.bytes().end());
        const auto list = codec.toXml(cells);
        message.insert(message.end(), list->bytes().begin(), list->bytes().end());
        receive(message);
    }
};

class Template : public testing::TestWithParam<SectionContract> {};

TEST_P(Template, HoldsTheSectionInItsShapeWithItsKeysAndEmpty)
{
    const Value node = nodeNamed(
        GetParam().name, PropertyListCodec().load(TechnologyRun<ZPHLogGenerator2>::resource(technology().resource)));
    ASSERT_EQ(node.kind(), GetParam().kind);
    if (node.array()) {
        EXPECT_TRUE(node.array()->empty());
        return;
    }
    EXPECT_EQ(keysOf(node), GetParam().keys);
    for (const auto& [key, value] : *node.dictionary())
        EXPECT_TRUE(value == Value("") || (value.array() && value.array()->empty())) << key << " is not empty";
}

TEST_P(Template, HasEveryKeyThatARecordSets)
{
    ShippedRun run;
    run.receive(record(0x1234, 13));
    const auto before = keysOf(run.section(GetParam().name));
    EXPECT_EQ(before, GetParam().isList() ? Keys() : GetParam().keys);
    for (const auto& each : GetParam().codes)
        if (each.minimumLength != 0)
            run.receive(record(each.code, each.minimumLength + 4000).fill(13, 1));
    // Comes last: it sets the keys again that the modem's records remove.
    auto cells = makeArray();
    for (const char* served : {"GSM", "UMTS", "LTE", "UTRAN2"})
        cells->append(
            cell(served, "Serving",
                 {{"kVoxCell_MCC", 1}, {"kVoxCell_ARFCN", 1}, {"kVoxCell_UARFCN", 1}, {"kVoxCell_ScramblingCode", 1}}));
    run.receiveCells(cells);
    EXPECT_EQ(keysOf(run.section(GetParam().name)), before);
}

INSTANTIATE_TEST_SUITE_P(Technology, Template, testing::ValuesIn(technology().sections),
                         [](const auto& each) { return std::string(each.param.className); });

/// The codes with a minimum length: the smallest of all sections that decode the code.
std::vector<CodeContract> decodedCodes()
{
    std::map<LogCode, std::size_t> least;
    for (const auto& section : technology().sections)
        for (const auto& each : section.codes)
            if (each.minimumLength != 0)
                least[each.code] =
                    std::min(least.try_emplace(each.code, each.minimumLength).first->second, each.minimumLength);
    std::vector<CodeContract> codes;
    for (const auto& [code, length] : least)
        codes.push_back({code, length});
    return codes;
}

CodeContract anyDecoded()
{
    const auto codes = decodedCodes();
    return codes[*rc::gen::inRange<std::size_t>(0, codes.size())];
}

/// Record bytes that RapidCheck chooses, after a valid header.
RecordBuilder arbitraryRecord(LogCode code, std::size_t length)
{
    auto built = record(code, length);
    const auto payload = *rc::gen::container<std::vector<std::uint8_t>>(length - RecordBuilder::kHeaderSize,
                                                                        rc::gen::arbitrary<std::uint8_t>());
    for (std::size_t i = 0; i < payload.size(); ++i)
        built.u8(RecordBuilder::kHeaderSize + i, payload[i]);
    return built;
}

/// Cells of any type, with any of the service's numbers.
Value arbitraryCells()
{
    auto cells = makeArray();
    const auto count = *rc::gen::inRange(0, 6);
    for (int i = 0; i < count; ++i) {
        const auto made = cell(*rc::gen::element<std::string>("GSM", "UMTS", "LTE", "UTRAN2", "CDMA"),
                               *rc::gen::element<std::string>("Serving", "Neighbor"));
        for (const char* key : {"MCC", "MNC", "LAC", "TAC", "CellId", "PhysicalCellId", "BandInfo", "ARFCN", "UARFCN",
                                "ScramblingCode", "RSCP", "EcNo", "RSSI"})
            if (*rc::gen::arbitrary<bool>())
                made.dictionary()->set(std::string("kVoxCell_") + key,
                                       *rc::gen::element<Value>(1, -1, std::int64_t{1} << 40, 2.5, true, "text"));
        cells->append(made);
    }
    return cells;
}

RC_GTEST_PROP(HostileRecordsInTheTemplate, NeverPublishUnderANameThatTheSectionLacks, ())
{
    ShippedRun run;
    for (int i = 0; i < 4; ++i) {
        const LogCode codes[] = {anyDecoded().code, anyDecoded().code, 0xFF0001, 0xFF0002};
        run.receive(arbitraryRecord(codes[*rc::gen::inRange<std::size_t>(0, std::size(codes))],
                                    *rc::gen::inRange<std::size_t>(13, technology().longestRecord)));
    }
    run.receiveCells(arbitraryCells());
    for (const auto& each : technology().sections)
        RC_ASSERT(keepsTo(each, run.section(each.name)));
}

RC_GTEST_PROP(HostileRecordsInTheTemplate, ThatAreShortChangeNothing, ())
{
    ShippedRun run;
    run.receive(arbitraryRecord(anyDecoded().code, technology().longestRecord));
    const Value before = deepCopy(run.display());
    const auto decoded = anyDecoded();
    run.receive(arbitraryRecord(decoded.code, *rc::gen::inRange<std::size_t>(13, decoded.minimumLength)));
    RC_ASSERT(run.display() == before);
}

RC_GTEST_PROP(HostileRecordsInTheTemplate, OfAnyBytesAreHarmless, (const std::vector<std::uint8_t>& bytes))
{
    ShippedRun run;
    try {
        run.receive(std::as_bytes(std::span(bytes)));
    } catch (const LogCode_0xFF0000::UnknownDataException&) {
        // Thrown for a SIM record without a dictionary.
    }
    RC_ASSERT(!run.display().isNull());
}

} // namespace
} // namespace kestrum
