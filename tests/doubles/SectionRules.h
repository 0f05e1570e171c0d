#pragma once

#include "LogGenerator/ZPH_GSM/SimInfo.h"
#include "doubles/RecordBuilder.h"
#include "doubles/TechnologyRun.h"

#include <gtest/gtest.h>
#include <rapidcheck.h>

#include <algorithm>
#include <cstdint>
#include <ostream>
#include <span>
#include <string>
#include <vector>

namespace kestrum {

/// The rules for every decoder of records: records of `code` are valid from `minimumLength` bytes on.
struct SectionRule {
    const char* name;
    std::string_view section;
    LogCode code;
    std::size_t minimumLength;

    friend void PrintTo(const SectionRule& shown, std::ostream* out) { *out << shown.name; }
};

/// A node of that shape with known contents: a dictionary without keys, or a list with one old row.
inline Value oldNode(Value::Kind kind)
{
    return kind == Value::Kind::Array ? Value(makeArray({makeDictionary({{"Old", "row"}})})) : Value(makeDictionary());
}

inline bool holdsOnlyKeysOf(const SectionShape& shape, const Value& node)
{
    const auto known = [&shape](const Value& dictionary) {
        return std::ranges::includes(shape.keys, keysOf(dictionary));
    };
    if (node.kind() != shape.kind)
        return false;
    return node.array() ? std::ranges::all_of(*node.array(), known) : known(node);
}

/// One section of a technology's index, with its own node.
template <typename Index>
class SectionOfIndex : public testing::TestWithParam<SectionRule> {
protected:
    explicit SectionOfIndex(std::span<const SectionShape> shapes)
        : shape(*std::ranges::find(shapes, GetParam().section, &SectionShape::name))
    {
        section().updateSectionRef(node);
        doubles.log.lines.clear();
    }

    Base& section() { return *index.getClass(GetParam().section); }
    void receive(const RecordBuilder& built, LogCode code) { section().updateWithData(Record(built.bytes()), code); }
    void receive(const RecordBuilder& built) { receive(built, GetParam().code); }

    void expectNoChangeOneByteShort()
    {
        receive(record(GetParam().code, GetParam().minimumLength - 1).fill(13, 0xFF));
        EXPECT_EQ(node, before);
        EXPECT_EQ(doubles.log.lines.size(), 1u) << "the entry line alone";
    }
    void expectRecordsOfAtLeastTheMinimumToShow()
    {
        receive(record(GetParam().code, GetParam().minimumLength));
        EXPECT_NE(node, before);
        EXPECT_TRUE(holdsOnlyKeysOf(shape, node)) << node;
        // All counts are greater than the number of elements.
        receive(record(GetParam().code, GetParam().minimumLength + 37).fill(13, 0xFF));
        EXPECT_TRUE(holdsOnlyKeysOf(shape, node)) << node;
    }
    /// `reported`: whether the section logs that it does not know the code.
    void expectNoChangeByForeignCodes(bool reported)
    {
        const auto own = section().getLogCodeArray();
        for (const LogCode foreign : {0xB0C1u, 0xB0C2u, 0xB179u, 0xB17Fu, 0xB180u, 0xB186u, 0xD00Au, 0xD00Cu, 0xD00Eu,
                                      0xD0E0u, 0xD0E2u, 0xFF0001u}) {
            if (std::ranges::find(own, foreign) != own.end())
                continue;
            doubles.log.lines.clear();
            receive(record(GetParam().code, 80).fill(13, 0x11), foreign);
            EXPECT_EQ(doubles.log.errors(),
                      reported ? std::vector{"Received an unknown log message: " + std::to_string(foreign)}
                               : std::vector<std::string>{});
        }
        EXPECT_EQ(node, before);
    }
    void expectNoHarmWithoutANodeOrOnOneOfTheOtherShape()
    {
        const Value other = oldNode(shape.kind == Value::Kind::Array ? Value::Kind::Dictionary : Value::Kind::Array);
        const Value otherBefore = deepCopy(other);
        for (const Value& wrong : {Value(), other}) {
            section().updateSectionRef(wrong);
            receive(record(GetParam().code, 80).fill(13, 0x11));
        }
        EXPECT_EQ(other, otherBefore);
    }

    const SectionShape& shape;
    DecodingDoubles doubles;
    Index index{doubles.roles};
    const Value node = oldNode(shape.kind);
    const Value before = deepCopy(node);
};

/// The shipped template has each of these sections, with its keys; the lists are empty. It also has the two sections
/// of the telephony service's records, which every technology has.
inline void expectTemplateToHold(std::string_view path, std::span<const SectionShape> shapes)
{
    const Value loaded = PropertyListCodec().load(std::string(path));
    for (const auto& shape : shapes) {
        const Value node = nodeNamed(shape.name, loaded);
        ASSERT_EQ(node.kind(), shape.kind) << shape.name;
        if (node.array())
            EXPECT_TRUE(node.array()->empty()) << shape.name;
        else
            EXPECT_EQ(keysOf(node), shape.keys) << shape.name;
    }
    EXPECT_EQ(keysOf(nodeNamed("SIM Info", loaded)),
              (std::set<std::string, std::less<>>{
                  "EF-ICCID", "EF-MSISDN", "EF-3GPP MAIL BOX DIALING NUMBER", "EF-HPPLMN SEARCH PERIOD", "EF-LOCI",
                  "EF-GPRS/PS-LOCI", "EF-ACCESS CONTROL CLASS", "EF-ADMINISTRATIVE DATA", "EF-FPLMN", "EF-ACTING HPLMN",
                  "EF-RAT MODE", "EF-PLMN NETWORK NAME", "EF-OPERATOR PLMN LIST", "EF-OPLMNAcT"}));
    EXPECT_EQ(nodeNamed("PDP Context Info", loaded), Value(makeArray()));
}

/// Record bytes that RapidCheck chooses, after a valid header.
inline RecordBuilder arbitraryRecord(LogCode code, std::size_t length)
{
    auto built = record(code, length);
    const auto payload = *rc::gen::container<std::vector<std::uint8_t>>(length - RecordBuilder::kHeaderSize,
                                                                        rc::gen::arbitrary<std::uint8_t>());
    for (std::size_t i = 0; i < payload.size(); ++i)
        built.u8(RecordBuilder::kHeaderSize + i, payload[i]);
    return built;
}

/// A cell-monitor record with cells of any type, with any of the service's numbers.
inline std::vector<std::byte> arbitraryCellMonitor(PropertyListCodec& codec)
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
    auto built = record(0xFF0001, RecordBuilder::kHeaderSize);
    std::vector<std::byte> bytes(built.bytes().begin(), built.bytes().end());
    const auto list = codec.toXml(cells);
    bytes.insert(bytes.end(), list->bytes().begin(), list->bytes().end());
    return bytes;
}

/// The rules for a technology's generator with its shipped template, for any bytes that arrive.
template <typename Generator>
struct HostileRecords {
    const char* resource;
    std::span<const SectionShape> shapes;
    std::span<const SectionRule> rules;
    std::size_t longest; ///< bytes of a record

    const SectionRule& anyRule() const { return rules[*rc::gen::inRange<std::size_t>(0, rules.size())]; }

    void neverPublishUnderANameThatTheSectionLacks() const
    {
        TechnologyRun<Generator> run(resource);
        for (int i = 0; i < 4; ++i) {
            const LogCode codes[] = {anyRule().code, anyRule().code, 0xFF0001, 0xFF0002};
            run.receive(arbitraryRecord(codes[*rc::gen::inRange<std::size_t>(0, std::size(codes))],
                                        *rc::gen::inRange<std::size_t>(13, longest))
                            .bytes());
        }
        run.receive(arbitraryCellMonitor(run.codec));
        for (const auto& shape : shapes)
            RC_ASSERT(holdsOnlyKeysOf(shape, run.section(shape.name)));
    }

    void changeNothingWhenTheyAreShort() const
    {
        TechnologyRun<Generator> run(resource);
        run.receive(arbitraryRecord(anyRule().code, longest).bytes());
        const Value before = deepCopy(run.display());
        const auto& rule = anyRule();
        run.receive(arbitraryRecord(rule.code, *rc::gen::inRange<std::size_t>(13, rule.minimumLength)).bytes());
        RC_ASSERT(run.display() == before);
    }

    void areHarmlessWhateverTheirBytes(const std::vector<std::uint8_t>& bytes) const
    {
        TechnologyRun<Generator> run(resource);
        try {
            run.receive(std::as_bytes(std::span(bytes)));
        } catch (const LogCode_0xFF0000::UnknownDataException&) {
            // The log lines of a SIM record without a dictionary.
        }
        RC_ASSERT(!run.display().isNull());
    }
};

} // namespace kestrum
