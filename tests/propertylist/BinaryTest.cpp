#include "Lists.h"

#include <gtest/gtest.h>

#include <cmath>
#include <limits>

namespace kestrum {
namespace {

using namespace std::chrono_literals;

// --- reading ---------------------------------------------------------------------------------------------------

class BinaryObject : public testing::TestWithParam<NamedCase<Value>> {};

TEST_P(BinaryObject, GivesTheValue)
{
    const auto read = parsed(BinaryList{{hex(GetParam().input)}}.bytes());
    EXPECT_EQ(read.reason, "");
    EXPECT_EQ(read.value, GetParam().expected);
}

INSTANTIATE_TEST_SUITE_P(
    PropertyList, BinaryObject,
    testing::Values(
        NamedCase<Value>{"False", "08", false}, NamedCase<Value>{"True", "09", true},
        NamedCase<Value>{"OneByteIsUnsigned", "10ff", 255}, NamedCase<Value>{"TwoBytesAreUnsigned", "11ffff", 65535},
        NamedCase<Value>{"FourBytesAreUnsigned", "12ffffffff", 4294967295},
        NamedCase<Value>{"EightBytesAreSigned", "13ffffffffffffffff", -1},
        NamedCase<Value>{"LowestInteger", "138000000000000000", INT64_MIN},
        NamedCase<Value>{"SixteenBytesForTheUnsigned", "140000000000000000ffffffffffffffff", UINT64_MAX},
        NamedCase<Value>{"SixteenBytesFor2To63", "1400000000000000008000000000000000", std::uint64_t{1} << 63},
        NamedCase<Value>{"SixteenBytesForMinusOne", "14ffffffffffffffffffffffffffffffff", -1},
        NamedCase<Value>{"SingleReal", "22c0a00000", -5.0}, NamedCase<Value>{"DoubleReal", "233ff8000000000000", 1.5},
        NamedCase<Value>{"Infinity", "237ff0000000000000", std::numeric_limits<double>::infinity()},
        NamedCase<Value>{"FirstDayOf2001", "330000000000000000",
                         Date(std::chrono::sys_days(std::chrono::year{2001} / 1 / 1))},
        NamedCase<Value>{"HalfASecondBefore2001", "33bfe0000000000000",
                         Date(std::chrono::sys_days(std::chrono::year{2001} / 1 / 1)) - 500ms},
        NamedCase<Value>{"Data", "430001ff", Data(bytesOf({"\0\1\xFF", 3}))},
        NamedCase<Value>{"EmptyData", "40", Data()}, NamedCase<Value>{"Ascii", "534c5445", "LTE"},
        NamedCase<Value>{"AsciiWithNul", "53410042", std::string("A\0B", 3)}, NamedCase<Value>{"EmptyAscii", "50", ""},
        NamedCase<Value>{"LengthInOneByte", "5f10034c5445", "LTE"},
        NamedCase<Value>{"LengthInEightBytes", "5f1300000000000000034c5445", "LTE"},
        NamedCase<Value>{"Utf16", "6300e920ac0041", "\u00E9\u20ACA"},
        NamedCase<Value>{"Utf16SurrogatePair", "62d83dde00", "\U0001F600"},
        NamedCase<Value>{"EmptyArray", "a0", makeArray()}, NamedCase<Value>{"EmptyDictionary", "d0", makeDictionary()}),
    caseName);

TEST(BinaryList, OfAllItsParts)
{
    // {"a": ["b", 1], "c": {}}
    const BinaryList list{
        {hex("d20102") + hex("0304"), hex("5161"), hex("5163"), hex("a20506"), hex("d0"), hex("5162"), hex("1001")}};
    EXPECT_EQ(describe(parsed(list.bytes()).value), R"({"a": ["b", 1], "c": {}})");
}

TEST(BinaryList, TheRootMayBeAnyObject)
{
    EXPECT_EQ(parsed(BinaryList{{hex("09"), hex("1007")}, 1}.bytes()).value, Value(7));
}

TEST(BinaryList, AKeyThatComesTwiceKeepsItsFirstPlaceAndItsLastValue)
{
    const BinaryList list{{hex("d3010201030405"), hex("5161"), hex("5162"), hex("1001"), hex("1002"), hex("1003")}};
    EXPECT_EQ(describe(parsed(list.bytes()).value), R"({"a": 3, "b": 2})");
}

TEST(BinaryList, SharedContainersAreFreshValues)
{
    const auto array = parsed(BinaryList{{hex("a20101"), hex("a102"), hex("09")}}.bytes()).value.array();
    ASSERT_EQ(array->size(), 2u);
    EXPECT_EQ((*array)[0], (*array)[1]);
    EXPECT_NE((*array)[0].array(), (*array)[1].array());
}

TEST(BinaryList, NotANumberStaysNotANumber)
{
    EXPECT_TRUE(std::isnan(parsed(BinaryList{{hex("237ff8000000000000")}}.bytes()).value.real().value_or(0)));
}

/// Arrays nested `levels` deep.
std::string nested(unsigned levels)
{
    BinaryList list;
    list.tableWidth = list.offsetWidth = list.referenceWidth = 4;
    for (unsigned i = 1; i < levels; ++i)
        list.objects.push_back("\xA1" + bigEndian(i, 4));
    list.objects.push_back("\xA0");
    return list.bytes();
}

TEST(BinaryList, TheDeepestThatIsTaken)
{
    EXPECT_TRUE(parsed(nested(512)).value.array());
}

// --- refusing --------------------------------------------------------------------------------------------------

class BinaryRefused : public testing::TestWithParam<NamedCase<const char*>> {};

TEST_P(BinaryRefused, SaysWhy)
{
    const auto read = parsed(GetParam().input);
    EXPECT_TRUE(read.value.isNull());
    EXPECT_EQ(read.reason, GetParam().expected);
    EXPECT_LE(read.offset, GetParam().input.size());
}

NamedCase<const char*> refused(const char* name, const BinaryList& list, const char* reason)
{
    return {name, list.bytes(), reason};
}

/// Each of `levels` arrays holds the next one `width` times.
BinaryList laughs(unsigned levels, unsigned width)
{
    BinaryList list;
    for (unsigned i = 1; i <= levels; ++i)
        list.objects.push_back(hex("af10") + bigEndian(width, 1) + std::string(width, static_cast<char>(i)));
    list.objects.push_back("\xA0");
    return list;
}

constexpr auto kOverEnd = "an object that extends into the offset table",
               kTable = "the offset table does not lie inside the file", kInteger = "not an integer of 64 bits",
               kWidth = "a width that is not 1 to 8 bytes", kItself = "a container inside itself",
               kDate = "a date outside the years 0 to 9999", kSurrogate = "half of a surrogate pair",
               kCount = "a count that is not an integer",
               kReference = "a reference to an object that is not in the file";

const BinaryList kTrue{{hex("09")}};

BinaryList changed(auto change)
{
    BinaryList list = kTrue;
    change(list);
    return list;
}

INSTANTIATE_TEST_SUITE_P(
    PropertyList, BinaryRefused,
    testing::Values(
        NamedCase<const char*>{"HeaderAlone", "bplist00", "too short for a binary property list"},
        NamedCase<const char*>{"OtherVersion", "bplist15" + kTrue.bytes().substr(8), "syntax error"},
        NamedCase<const char*>{"CutOff", kTrue.bytes().substr(0, 41), kWidth},
        NamedCase<const char*>{"TrailerOfZeros", "bplist00" + std::string(32, '\0'), kWidth},
        refused("NoObjects", BinaryList{}, "the root is not an object of the file"),
        refused("RootBeyondTheObjects", BinaryList{{hex("09")}, 1}, "the root is not an object of the file"),
        refused("MoreObjectsThanOffsets", changed([](auto& list) { list.moreObjects = 1; }), kTable),
        refused("ObjectsWithoutNumber", changed([](auto& list) { list.moreObjects = -2; }), kTable),
        refused("TableBehindTheFile", changed([](auto& list) { list.moreTableOffset = 1000; }), kTable),
        refused("TableInsideTheHeader", changed([](auto& list) { list.moreTableOffset = -2; }), kTable),
        refused("OffsetsWithoutWidth", changed([](auto& list) { list.offsetWidth = 0; }), kWidth),
        refused("OffsetsTooWide", changed([](auto& list) { list.offsetWidth = 9; }), kWidth),
        refused("ReferencesWithoutWidth", changed([](auto& list) { list.referenceWidth = 0; }), kWidth),
        refused("ReferencesTooWide", changed([](auto& list) { list.referenceWidth = 255; }), kWidth),
        refused("ObjectInTheTable", changed([](auto& list) {
                    list.moreTableOffset = -1;
                    list.offsetWidth = 1;
                }),
                "an object outside the file"),
        refused("Null", BinaryList{{hex("00")}}, "an object of unknown kind 0x00"),
        refused("Fill", BinaryList{{hex("0f")}}, "an object of unknown kind 0x0f"),
        refused("Uid", BinaryList{{hex("8001")}}, "an object of unknown kind 0x80"),
        refused("Set", BinaryList{{hex("c0")}}, "an object of unknown kind 0xc0"),
        refused("UnknownMarker", BinaryList{{hex("ff")}}, "an object of unknown kind 0xff"),
        refused("HalfReal", BinaryList{{hex("210000")}}, "an object of unknown kind 0x21"),
        refused("IntegerOf128Bits", BinaryList{{hex("1400000000000000010000000000000000")}}, kInteger),
        refused("IntegerBelowTheLowest", BinaryList{{hex("14ffffffffffffffff7fffffffffffffff")}}, kInteger),
        refused("IntegerOf256Bits", BinaryList{{"\x15" + std::string(32, '\0')}}, kInteger),
        refused("IntegerCutOff", BinaryList{{hex("13ffff")}}, kOverEnd),
        refused("DateNotANumber", BinaryList{{hex("337ff8000000000000")}}, kDate),
        refused("DateInfinite", BinaryList{{hex("33fff0000000000000")}}, kDate),
        refused("DateInTheYear10000", BinaryList{{hex("33") + hex("424d63e8d5c00000")}}, kDate),
        refused("AsciiThatIsNone", BinaryList{{hex("51e9")}}, "a string that is not ASCII"),
        refused("Utf16LoneHigh", BinaryList{{hex("61d83d")}}, kSurrogate),
        refused("Utf16LoneLow", BinaryList{{hex("61de00")}}, kSurrogate),
        refused("Utf16HighBeforeLetter", BinaryList{{hex("62d83d0041")}}, kSurrogate),
        refused("StringCutOff", BinaryList{{hex("5f10ff41")}}, kOverEnd),
        refused("StringOfAllMemory", BinaryList{{hex("5f137fffffffffffffff41")}}, kOverEnd),
        refused("Utf16OfAllMemory", BinaryList{{hex("6f138000000000000001") + "AB"}}, kOverEnd),
        refused("NegativeCount", BinaryList{{hex("4f13ffffffffffffffff41")}}, kOverEnd),
        refused("CountThatIsAString", BinaryList{{hex("4f5141")}}, kCount),
        refused("CountOf128Bits", BinaryList{{hex("4f14") + std::string(16, '\0')}}, kCount),
        refused("ArrayOfAllMemory", BinaryList{{hex("af137fffffffffffffff")}}, kOverEnd),
        refused("DictionaryOfAllMemory", BinaryList{{hex("df138000000000000000")}}, kOverEnd),
        refused("DictionaryWithoutValues", BinaryList{{hex("d101")}}, kOverEnd),
        refused("ReferenceBeyondTheObjects", BinaryList{{hex("a101")}}, kReference),
        refused("KeyThatIsANumber", BinaryList{{hex("d10102"), hex("1001"), hex("09")}}, "a key that is not a string"),
        refused("KeyThatIsTheDictionary", BinaryList{{hex("d10001"), hex("09")}}, "a key that is not a string"),
        refused("ArrayInsideItself", BinaryList{{hex("a100")}}, kItself),
        refused("ArrayInsideItselfManyTimes", BinaryList{{hex("af10ff") + std::string(255, '\0')}}, kItself),
        refused("ArraysInsideEachOther", BinaryList{{hex("a101"), hex("a100")}}, kItself),
        refused("DictionaryInsideItself", BinaryList{{hex("d10100"), hex("5161")}}, kItself),
        refused("BillionLaughs", laughs(26, 17), "too many values"),
        refused("LaughsInPairs", laughs(100, 2), "too many values"),
        NamedCase<const char*>{"OneLevelTooMany", nested(513), "nested too deeply"},
        NamedCase<const char*>{"AHundredThousandLevels", nested(100000), "nested too deeply"}),
    caseName);

TEST(BinaryRefused, ALongTextSharedManyTimes)
{
    // 10,000 references to a text of 10,000 characters: 100 MB out of 20 kB.
    const BinaryList list{{hex("af112710") + std::string(10000, '\1'), hex("5f112710") + std::string(10000, 'A')}};
    const auto read = parsed(list.bytes());
    EXPECT_EQ(read.reason, "too many bytes");
}

TEST(BinaryRefused, ASmallBillionLaughsFile)
{
    EXPECT_LE(laughs(26, 17).bytes().size(), 620u);
}

TEST(BinaryRefused, EveryPrefixOfAGoodList)
{
    const std::string good = BinaryList{
        {hex("d20102") + hex("0304"), hex("5161"), hex("5163"), hex("a20506"), hex("d0"), hex("5162"),
         hex("1001")}}.bytes();
    ASSERT_TRUE(parsed(good));
    for (std::size_t length = 0; length < good.size(); ++length)
        EXPECT_FALSE(parsed(good.substr(0, length))) << length << " bytes";
}

} // namespace
} // namespace kestrum
