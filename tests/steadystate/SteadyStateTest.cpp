#include "LogGenerator/LTE/LTEClassIndex.h"
#include "LogGenerator/UTRAN/UTRANClassIndex.h"
#include "LogGenerator/ZPH_GSM/ZPH_GSMClassIndex.h"
#include "doubles/DecodingDoubles.h"
#include "doubles/RecordBuilder.h"

#include <gtest/gtest.h>

#include <atomic>
#include <cctype>
#include <cstdlib>
#include <new>
#include <string>

namespace {

std::atomic<long> allocations{0};

} // namespace

// Counts what this test program takes from the heap. Not inlined: GCC 12 would take one's malloc and the other's free
// for a mismatch.
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

// A modem sends several of these a second for days.
template <typename Index>
void expectNoAllocation(const Subscription& subscription)
{
    DecodingDoubles doubles;
    SilentLog log;
    UnwatchedConsole console;
    DecodingRoles roles{log, console, doubles.clock, doubles.bundle, doubles.propertyLists};
    const Index index(roles);
    Base& section = *index.getClass(subscription.section);
    const Value node = makeDictionary();
    section.updateSectionRef(node);
    const auto zeros = record(subscription.code, 256), ones = record(subscription.code, 256).fill(13, 0xFF);
    const auto decodeBoth = [&] {
        for (const auto* each : {&zeros, &ones})
            section.updateWithData(Record(each->bytes()), subscription.code);
    };
    decodeBoth();
    ASSERT_FALSE(node.dictionary()->empty());

    const long before = allocations;
    decodeBoth();
    EXPECT_EQ(allocations - before, 0);
}

std::string nameOf(const testing::TestParamInfo<Subscription>& each)
{
    std::string name;
    for (const char c : each.param.section)
        if (std::isalnum(static_cast<unsigned char>(c)) != 0)
            name += c;
    return name + "_" + format("%x", each.param.code);
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

} // namespace
} // namespace kestrum
