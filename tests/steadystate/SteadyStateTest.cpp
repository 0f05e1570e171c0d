#include "C2K/C2KRun.h"
#include "LogGenerator/C2K/Decoders.h"
#include "LogGenerator/LTE/LTEClassIndex.h"
#include "LogGenerator/UTRAN/UTRANClassIndex.h"
#include "LogGenerator/ZPH_GSM/ZPH_GSMClassIndex.h"
#include "doubles/DecodingDoubles.h"
#include "sections/RecordBuilder.h"

#include <gtest/gtest.h>

#include <atomic>
#include <cctype>
#include <cstdlib>
#include <new>
#include <string>
#include <string_view>
#include <vector>

namespace {

std::atomic<long> allocations{0};

} // namespace

// Counts this program's heap allocations. Not inlined: GCC 12 would report the malloc of one and the free of the
// other as a mismatch.
[[gnu::noinline]] void* operator new(std::size_t size)
{
    ++allocations;
    if (void* memory = std::malloc(size != 0 ? size : 1))
        return memory;
    throw std::bad_alloc();
}

[[gnu::noinline]] void operator delete(void* memory) noexcept
{
    std::free(memory);
}

[[gnu::noinline]] void operator delete(void* memory, std::size_t) noexcept
{
    std::free(memory);
}

namespace kestrum {
namespace {

class SilentLog final : public SystemLog {
public:
    void write(Priority, std::string_view) override {}
};

class UnwatchedConsole final : public Console {
public:
    void printLine(std::string_view) override {}
    void debug(std::string_view) override {}
    bool isDebugWatched() const override { return false; }
};

struct Subscription {
    std::string_view section;
    LogCode code;

    friend void PrintTo(const Subscription& shown, std::ostream* out)
    {
        *out << shown.section << " " << std::hex << shown.code;
    }
};

// A modem sends several of these per second for days.
template <typename Decode>
void expectNoAllocation(const std::vector<RecordBuilder>& records, Decode decode)
{
    const auto decodeAll = [&] {
        for (const auto& each : records)
            decode(Record(each.bytes()));
    };
    decodeAll();
    const long before = allocations;
    decodeAll();
    EXPECT_EQ(allocations - before, 0);
}

template <typename Index>
void expectNoAllocation(const Subscription& subscription, const Value& node, const std::vector<RecordBuilder>& records)
{
    DecodingDoubles doubles;
    SilentLog log;
    UnwatchedConsole console;
    DecodingRoles roles{log, console, doubles.clock, doubles.bundle, doubles.propertyLists};
    const Index index(roles);
    Base& section = *index.getClass(subscription.section);
    section.updateSectionRef(node);
    expectNoAllocation(records, [&](Record each) { section.updateWithData(each, subscription.code); });
}

template <typename Index>
void expectNoAllocation(const Subscription& subscription, const Value& node)
{
    expectNoAllocation<Index>(subscription, node,
                              {record(subscription.code, 256), record(subscription.code, 256).fill(13, 0xFF)});
}

std::string nameOf(const testing::TestParamInfo<Subscription>& each)
{
    std::string name;
    for (const char c : each.param.section)
        if (std::isalnum(static_cast<unsigned char>(c)) != 0)
            name += c;
    return name + "_" + formatted("%x", each.param.code);
}

/// For a dictionary section, which must show at least one value.
template <typename Index>
void expectNoAllocation(const Subscription& subscription)
{
    const auto node = makeDictionary();
    expectNoAllocation<Index>(subscription, node);
    EXPECT_FALSE(node->empty());
}

/// For a list section. The record of ones has as many rows as fit.
template <typename Index>
void expectNoAllocationInList(const Subscription& subscription)
{
    const auto node = makeArray();
    expectNoAllocation<Index>(subscription, node);
    EXPECT_FALSE(node->empty());
}

class GsmDictionarySection : public testing::TestWithParam<Subscription> {};

TEST_P(GsmDictionarySection, AllocatesNothingInTheSteadyState)
{
    expectNoAllocation<ZPH_GSMClassIndex>(GetParam());
}

INSTANTIATE_TEST_SUITE_P(
    ZPH_GSM, GsmDictionarySection,
    testing::Values(Subscription{"GPRS Information", 0x51F5}, Subscription{"GPRS Information", 0x7135},
                    Subscription{"GPRS Information", 0x51F6}, Subscription{"GPRS Information", 0x51FB},
                    Subscription{"GPRS Information", 0x51FD}, Subscription{"GPRS Information", 0x51F4},
                    Subscription{"GPRS Information", 0x5137}, Subscription{"GSM Serving Cell", 0x5134},
                    Subscription{"GSM Serving Cell", 0x5137}, Subscription{"GSM Serving Cell", 0x5076},
                    Subscription{"Process PS", 0x7130}, Subscription{"Process PS", 0x7132},
                    Subscription{"Process CO", 0x7131}, Subscription{"Process CO", 0x7132},
                    Subscription{"Process CS", 0x7131}, Subscription{"Process CS", 0x7132},
                    Subscription{"Serving PLMN", 0x7135}, Subscription{"Serving PLMN", 0x7132},
                    Subscription{"GSM RR Info", 0x512C}, Subscription{"GSM RR Info", 0x5137},
                    Subscription{"GSM RR Info", 0x5072}, Subscription{"GSM RR Info", 0x51F6},
                    Subscription{"UMTS RR Info", 0x4125}, Subscription{"UMTS RR Info", 0x4031},
                    Subscription{"UMTS RR Info", 0x4127}, Subscription{"UMTS RR Info", 0x4157}),
    nameOf);

class LteDictionarySection : public testing::TestWithParam<Subscription> {};

TEST_P(LteDictionarySection, AllocatesNothingInTheSteadyState)
{
    expectNoAllocation<LTEClassIndex>(GetParam());
}

INSTANTIATE_TEST_SUITE_P(LTE, LteDictionarySection,
                         testing::Values(Subscription{"Serving Cell Info", 0xB0C2},
                                         Subscription{"Serving Cell Measurements", 0xB17F},
                                         Subscription{"Connected mode LTE Intra-frequency Measurement", 0xB179},
                                         Subscription{"Neighbor Measurements", 0xB180},
                                         Subscription{"Reselection Candidates", 0xB186}),
                         nameOf);

class UtranDictionarySection : public testing::TestWithParam<Subscription> {};

TEST_P(UtranDictionarySection, AllocatesNothingInTheSteadyState)
{
    expectNoAllocation<UTRANClassIndex>(GetParam());
}

INSTANTIATE_TEST_SUITE_P(UTRAN, UtranDictionarySection,
                         testing::Values(Subscription{"Serving Cell Info", 0xD0E2}, Subscription{"RRC Info", 0xD0E0}),
                         nameOf);

class GsmListSection : public testing::TestWithParam<Subscription> {};

TEST_P(GsmListSection, AllocatesNothingInTheSteadyState)
{
    expectNoAllocationInList<ZPH_GSMClassIndex>(GetParam());
}

INSTANTIATE_TEST_SUITE_P(ZPH_GSM, GsmListSection,
                         testing::Values(Subscription{"Neighboring Cells", 0x5137}, Subscription{"UMTS Set", 0x4005},
                                         Subscription{"GSM Set", 0x4005}, Subscription{"Equivalent PLMN List", 0x7150}),
                         nameOf);

class GsmListInSection : public testing::TestWithParam<Subscription> {};

TEST_P(GsmListInSection, AllocatesNothingInTheSteadyState)
{
    expectNoAllocation<ZPH_GSMClassIndex>(GetParam());
}

INSTANTIATE_TEST_SUITE_P(ZPH_GSM, GsmListInSection,
                         testing::Values(Subscription{"Mobile Allocation", 0x51F8}, Subscription{"BLER", 0x4116},
                                         Subscription{"HSDPA Info", 0x4221}),
                         nameOf);

class LteListSection : public testing::TestWithParam<Subscription> {};

TEST_P(LteListSection, AllocatesNothingInTheSteadyState)
{
    expectNoAllocationInList<LTEClassIndex>(GetParam());
}

INSTANTIATE_TEST_SUITE_P(LTE, LteListSection,
                         testing::Values(Subscription{"Measured Neighbor Cells", 0xB179},
                                         Subscription{"Neighbor Cells List", 0xB180},
                                         Subscription{"Reselection Candidates List", 0xB186}),
                         nameOf);

TEST(GsmList, AllocatesNothingForColourCodes)
{
    expectNoAllocation<ZPH_GSMClassIndex>(
        {"Neighboring Cells", 0x51FF}, makeArray(),
        {record(0x51FF, 27).u8(14, 3).u16(15, 62).u16(19, 63), record(0x51FF, 23).u8(14, 2).u16(15, 871)});
}

// As the cells of a property list do: serving cells and neighbours have other numbers.
TEST(Rows, AllocateNothingWhenTheyTakeTurnsWithOtherKeys)
{
    Dictionary row;
    const auto fill = [&row](std::initializer_list<std::string_view> keys) {
        row.startOver();
        for (const auto key : keys)
            row.setText(key, "text");
    };
    const auto both = [&fill] {
        fill({"kVoxCell_Technology", "kVoxCell_PhysicalCellId", "kVoxCell_UARFCN"});
        fill({"kVoxCell_Technology", "kVoxCell_ScramblingCode"});
    };
    both();
    const long before = allocations;
    both();
    EXPECT_EQ(allocations - before, 0);
}

class UtranListSection : public testing::TestWithParam<Subscription> {};

TEST_P(UtranListSection, AllocatesNothingInTheSteadyState)
{
    expectNoAllocationInList<UTRANClassIndex>(GetParam());
}

INSTANTIATE_TEST_SUITE_P(UTRAN, UtranListSection,
                         testing::Values(Subscription{"Neighbor Cell List", 0xD00A}, Subscription{"TRCH BLER", 0xD00C}),
                         nameOf);

/// Two pilots in a status of 1x; see OneXStatusTest.
RecordBuilder oneXStatus(unsigned firstPilot)
{
    return record(0x119C, 115)
        .u8(14, 4)
        .bytes(17, {1, 0, 6})
        .bytes(23, {2, 0, 14})
        .bytes(37, {3, 0, 70, 0, 1, 0, 1, 1, 2, 1})
        .u16(49, firstPilot)
        .u16(69, 5)
        .bytes(107, {4, 0, 8});
}

struct CdmaRecords {
    std::string_view name;
    std::vector<RecordBuilder> records;
    void (*decode)(Record record, C2KContext& context);

    friend void PrintTo(const CdmaRecords& shown, std::ostream* out) { *out << shown.name; }
};

class CdmaDecoder : public testing::TestWithParam<CdmaRecords> {};

TEST_P(CdmaDecoder, AllocatesNothingInTheSteadyState)
{
    C2KRun run;
    run.generator->getDisplayFromState(run.state);
    SilentLog log;
    UnwatchedConsole console;
    DecodingRoles roles{log, console, run.doubles.clock, run.doubles.bundle, run.doubles.propertyLists};
    C2KContext context(run.state, run.state.at("Lookup").dictionary(), roles);
    expectNoAllocation(GetParam().records, [&](Record each) { GetParam().decode(each, context); });
}

INSTANTIATE_TEST_SUITE_P(
    C2K, CdmaDecoder,
    testing::Values(
        CdmaRecords{"EvdoStatus", {record(0x1183, 50), record(0x1183, 50).fill(13, 1)}, decodeEvdoStatus},
        CdmaRecords{"SystemIdentity",
                    {record(0x134F, 186).u8(13, 2).u32(46, 2),
                     record(0x134F, 186).u8(13, 2).u32(46, 2).u16(50, 0xFFFF).u16(184, 0xFFFF)},
                    decodeSystemIdentity},
        CdmaRecords{
            "TrafficDemodulation", {record(0x119D, 17), record(0x119D, 17).fill(13, 0xFF)}, decodeTrafficDemodulation},
        CdmaRecords{
            "ForwardLinkRate", {record(0x1192, 241), record(0x1192, 241).fill(13, 0xFF)}, decodeForwardLinkRate},
        CdmaRecords{
            "ReverseLinkRate", {record(0x127E, 1750), record(0x127E, 1750).fill(13, 0xFF)}, decodeReverseLinkRate},
        CdmaRecords{"ActiveSetPilots",
                    {record(0x12B6, 61).u8(15, 3).u16(37, 12), record(0x12B6, 49).u8(15, 2).u16(37, 300)},
                    decodeActiveSetPilots},
        CdmaRecords{"Fingers",
                    {record(0x108A, 65).u8(22, 3).u16(37, 12), record(0x108A, 51).u8(22, 2).u16(37, 300)},
                    decodeFingers},
        CdmaRecords{"OneXStatus", {oneXStatus(12), oneXStatus(300)}, decodeOneXStatus}),
    [](const auto& each) { return std::string(each.param.name); });

// The way to the decoder: header, display, lookup, raw records.
TEST(CdmaGenerator, AllocatesNothingInTheSteadyState)
{
    C2KRun run;
    SilentLog log;
    UnwatchedConsole console;
    DecodingRoles roles{log, console, run.doubles.clock, run.doubles.bundle, run.doubles.propertyLists};
    run.generator = C2KLogGenerator::generator(roles);
    run.receive(oneXStatus(12)).receive(oneXStatus(300)).receive(oneXStatus(12));
    run.generator->generateLogUsingState(run.state); // the next interval may be as long as this one
    expectNoAllocation({oneXStatus(12)}, [&](Record each) { run.generator->updateState(run.state, each.bytes()); });
}

} // namespace
} // namespace kestrum
