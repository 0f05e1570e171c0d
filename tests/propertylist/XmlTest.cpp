#include "Lists.h"

#include <gtest/gtest.h>

#include <cmath>
#include <limits>
#include <memory>
#include <utility>

namespace kestrum {
namespace {

using namespace std::chrono_literals;

Data data(std::string_view text)
{
    return Data(bytesOf(text));
}

const Date kSomeDate = std::chrono::sys_days(std::chrono::year{2026} / 11 / 16) + 6h + 5min + 42s;

// --- reading ---------------------------------------------------------------------------------------------------

class XmlRead : public testing::TestWithParam<NamedCase<Value>> {};

TEST_P(XmlRead, GivesTheValue)
{
    const auto read = parsed(xmlList(GetParam().input));
    EXPECT_EQ(read.reason, "");
    EXPECT_EQ(read.value, GetParam().expected);
}

INSTANTIATE_TEST_SUITE_P(
    PropertyList, XmlRead,
    testing::Values(
        NamedCase<Value>{"String", "<string>Cell info</string>", "Cell info"},
        NamedCase<Value>{"EmptyString", "<string/>", ""},
        NamedCase<Value>{"StringKeepsItsBlanks", "<string>  a\n\tb </string>", "  a\n\tb "},
        NamedCase<Value>{"CarriageReturnByReference", "<string>a&#13;b</string>", "a\rb"},
        NamedCase<Value>{"StandardEntities", "<string>&lt;&amp;&gt;&quot;&apos;</string>", "<&>\"'"},
        NamedCase<Value>{"CharacterReferences", "<string>&#xE9;&#x1F600;</string>", "\u00E9\U0001F600"},
        NamedCase<Value>{"CharacterData", "<string>a<![CDATA[<b>&c;]]>d</string>", "a<b>&c;d"},
        NamedCase<Value>{"CommentInsideAString", "<string>a<!-- b -->c</string>", "ac"},
        NamedCase<Value>{"Integer", "<integer>42</integer>", 42},
        NamedCase<Value>{"IntegerBetweenBlanks", "<integer>\n 42\t</integer>", 42},
        NamedCase<Value>{"PositiveSign", "<integer>+42</integer>", 42},
        NamedCase<Value>{"MinusOne", "<integer>-1</integer>", -1},
        NamedCase<Value>{"LowestInteger", "<integer>-9223372036854775808</integer>", INT64_MIN},
        NamedCase<Value>{"HighestSigned", "<integer>9223372036854775807</integer>", INT64_MAX},
        NamedCase<Value>{"LowestThatNeedsUnsigned", "<integer>9223372036854775808</integer>", std::uint64_t{1} << 63},
        NamedCase<Value>{"HighestUnsigned", "<integer>18446744073709551615</integer>", UINT64_MAX},
        NamedCase<Value>{"Hexadecimal", "<integer>0xFF0001</integer>", 0xFF0001},
        NamedCase<Value>{"MinusZero", "<integer>-0</integer>", 0},
        NamedCase<Value>{"Real", "<real>-140.25</real>", -140.25},
        NamedCase<Value>{"RealWithExponent", "<real>1e+16</real>", 1e16},
        NamedCase<Value>{"RealWithoutFraction", "<real>3</real>", 3.0},
        NamedCase<Value>{"SmallestReal", "<real>5e-324</real>", 5e-324},
        NamedCase<Value>{"LargestReal", "<real>1.7976931348623157e+308</real>", 1.7976931348623157e308},
        NamedCase<Value>{"RealZeroWithExponent", "<real>0e5</real>", 0.0},
        NamedCase<Value>{"Infinity", "<real>inf</real>", std::numeric_limits<double>::infinity()},
        NamedCase<Value>{"PlusInfinity", "<real>+infinity</real>", std::numeric_limits<double>::infinity()},
        NamedCase<Value>{"MinusInfinity", "<real>-inf</real>", -std::numeric_limits<double>::infinity()},
        NamedCase<Value>{"True", "<true/>", true}, NamedCase<Value>{"False", "<false></false>", false},
        NamedCase<Value>{"Date", "<date>2026-11-16T06:05:42Z</date>", kSomeDate},
        NamedCase<Value>{"Data", "<data>\n\tS2Vz\n\tdHJ1\tbQ==\n</data>", data("Kestrum")},
        NamedCase<Value>{"EmptyData", "<data></data>", Data()}, NamedCase<Value>{"EmptyArray", "<array/>", makeArray()},
        NamedCase<Value>{"EmptyDictionary", "<dict></dict>", makeDictionary()},
        NamedCase<Value>{"EmptyKey", "<dict><key/><true/></dict>", makeDictionary({{"", true}})},
        NamedCase<Value>{"Nested", "<array><dict><key>k</key><array><string>v</string></array></dict></array>",
                         makeArray({makeDictionary({{"k", makeArray({"v"})}})})}),
    caseName);

TEST(XmlRead, SkipsADoctype)
{
    EXPECT_EQ(parsed("<?xml version=\"1.0\"?><!DOCTYPE plist PUBLIC \"-//X//DTD PLIST 1.0//EN\" "
                     "\"http://example.invalid/PropertyList-1.0.dtd\"><plist version=\"1.0\"><true/></plist>")
                  .value,
              Value(true));
}

TEST(XmlRead, TakesTheEncodingsThatXmlParsersMustKnow)
{
    EXPECT_EQ(parsed("\xEF\xBB\xBF<plist><string>\xC3\xA9</string></plist>").value, Value("\u00E9"));
    EXPECT_EQ(parsed("<?xml version=\"1.0\" encoding=\"ISO-8859-1\"?><plist><string>\xE9</string></plist>").value,
              Value("\u00E9"));
    std::string utf16 = "\xFE\xFF";
    for (const char c : std::string("<plist><true/></plist>"))
        utf16 += {'\0', c};
    EXPECT_EQ(parsed(utf16).value, Value(true));
}

TEST(XmlRead, NotANumberStaysNotANumber)
{
    const auto real = parsed(xmlList("<real>nan</real>")).value.real();
    ASSERT_TRUE(real);
    EXPECT_TRUE(std::isnan(*real));
}

TEST(XmlRead, KeepsTheOrderOfKeys)
{
    const auto read = parsed(xmlList("<dict><key>b</key><true/><key>a</key><true/><key>c</key><true/></dict>"));
    std::string order;
    for (const auto dictionary = read.value.dictionary(); const auto& entry : *dictionary)
        order += entry.key;
    EXPECT_EQ(order, "bac");
}

TEST(XmlRead, AKeyThatComesTwiceKeepsItsFirstPlaceAndItsLastValue)
{
    const auto read = parsed(xmlList("<dict><key>a</key><integer>1</integer><key>b</key><integer>2</integer>"
                                     "<key>a</key><integer>3</integer></dict>"));
    EXPECT_EQ(describe(read.value), R"({"a": 3, "b": 2})");
}

TEST(XmlRead, ReusesTheContainersOfAnOldList)
{
    PropertyListCodec codec;
    const std::string two = xmlList("<array><dict><key>a</key><integer>1</integer></dict>"
                                    "<dict><key>a</key><integer>2</integer></dict></array>");
    const std::string one = xmlList("<array><dict><key>a</key><integer>3</integer></dict></array>");
    Value spent = codec.parse(bytesOf(two));
    const Array* list = spent.array().get();
    const Dictionary* first = (*list)[0].borrowedDictionary();
    const std::weak_ptr second = (*list)[1].dictionary();

    const Value read = codec.parseOver(bytesOf(one), std::exchange(spent, {}));
    EXPECT_EQ(describe(read), R"([{"a": 3}])");
    EXPECT_EQ(read.array().get(), list);
    EXPECT_EQ((*list)[0].borrowedDictionary(), first);
    EXPECT_TRUE(second.expired()) << "containers that the list cannot reuse are released";
}

TEST(XmlRead, KeepsContainersWithAnotherOwner)
{
    PropertyListCodec codec;
    Value spent = codec.parse(bytesOf(xmlList("<array><dict><key>a</key><integer>1</integer></dict></array>")));
    const auto held = (*spent.array())[0].dictionary();
    const Value read = codec.parseOver(bytesOf(xmlList("<array><dict><key>a</key><integer>2</integer></dict></array>")),
                                       std::exchange(spent, {}));
    EXPECT_EQ(describe(read), R"([{"a": 2}])");
    EXPECT_EQ(describe(held), R"({"a": 1})");
}

TEST(XmlRead, ARefusedListShowsNothingOfAnOldOne)
{
    PropertyListCodec codec;
    EXPECT_TRUE(codec.parseOver(bytesOf(xmlList("")), makeArray({"a"})).isNull());
    EXPECT_TRUE(codec.parseOver(bytesOf(xmlList("<array><x/></array>")), makeArray({"a"})).isNull());
    EXPECT_EQ(codec.parseOver(bytesOf(xmlList("<integer>5</integer>")), makeArray({"a"})), Value(5));
}

// --- refusing --------------------------------------------------------------------------------------------------

class XmlRefused : public testing::TestWithParam<NamedCase<const char*>> {};

TEST_P(XmlRefused, SaysWhy)
{
    const auto read = parsed(GetParam().input);
    EXPECT_TRUE(read.value.isNull());
    EXPECT_FALSE(read);
    EXPECT_EQ(read.reason, GetParam().expected);
    EXPECT_LE(read.offset, GetParam().input.size());
    EXPECT_TRUE(PropertyListCodec().parse(bytesOf(GetParam().input)).isNull());
}

NamedCase<const char*> refused(const char* name, const std::string& inside, const char* reason)
{
    return {name, xmlList(inside), reason};
}

constexpr auto kInteger = "not an integer of 64 bits", kReal = "not a real number of 64 bits", kDate = "not a date",
               kBase64 = "not base64", kMalformed = "not well-formed (invalid token)",
               kEntity = "entities other than the standard ones are not supported",
               kDeclarations = "a DOCTYPE with declarations", kTooDeep = "nested too deeply";

INSTANTIATE_TEST_SUITE_P(
    PropertyList, XmlRefused,
    testing::Values(
        NamedCase<const char*>{"NoBytes", "", "no element found"},
        NamedCase<const char*>{"PlainText", "GetTechnology", "syntax error"},
        NamedCase<const char*>{"Zeros", std::string(64, '\0'), kMalformed},
        NamedCase<const char*>{"OtherXml", "<html></html>", "unknown element <html>"},
        NamedCase<const char*>{"ValueWithoutPlist", "<dict></dict>", "<dict> is not allowed here"},
        NamedCase<const char*>{"CutOff", "<plist><dict><key>a</key>", "no element found"},
        NamedCase<const char*>{"BytesBehindTheEnd", "<plist><true/></plist>x", "junk after document element"},
        NamedCase<const char*>{"UnknownEncoding", "<?xml version=\"1.0\" encoding=\"EBCDIC\"?><plist><true/></plist>",
                               "unknown encoding"},
        refused("EmptyPlist", "", "no value inside <plist>"),
        refused("TwoValues", "<true/><true/>", "<true> is not allowed here"),
        refused("PlistInsidePlist", "<plist><true/></plist>", "<plist> is not allowed here"),
        refused("UnknownElement", "<set/>", "unknown element <set>"),
        refused("MismatchedTag", "<array></dict>", "mismatched tag"),
        refused("ElementInsideAString", "<string><true/></string>", "<true> is not allowed here"),
        refused("KeyInsideAnArray", "<array><key>a</key></array>", "<key> is not allowed here"),
        refused("KeyAtTheTop", "<key>a</key>", "<key> is not allowed here"),
        refused("TextInsideADictionary", "<dict>a</dict>", "text is not allowed here"),
        refused("TextInsideABoolean", "<true>yes</true>", "text inside a boolean"),
        refused("ValueWithoutKey", "<dict><true/></dict>", "<true> is not allowed here"),
        refused("KeyWithoutValue", "<dict><key>a</key></dict>", "a key without a value"),
        refused("TwoKeys", "<dict><key>a</key><key>b</key></dict>", "<key> is not allowed here"),
        refused("EmptyInteger", "<integer/>", kInteger),
        refused("IntegerBelowTheLowest", "<integer>-9223372036854775809</integer>", kInteger),
        refused("IntegerAboveTheHighest", "<integer>18446744073709551616</integer>", kInteger),
        refused("IntegerOfAMillionDigits", "<integer>" + std::string(1000000, '9') + "</integer>", kInteger),
        refused("IntegerWithFraction", "<integer>1.5</integer>", kInteger),
        refused("IntegerWithLetters", "<integer>12ab</integer>", kInteger),
        refused("IntegerWithTwoSigns", "<integer>+-1</integer>", kInteger),
        refused("HexadecimalTooLong", "<integer>0x10000000000000000</integer>", kInteger),
        refused("HexadecimalWithoutDigits", "<integer>0x</integer>", kInteger), refused("EmptyReal", "<real/>", kReal),
        refused("RealTooLarge", "<real>1e309</real>", kReal), refused("RealTooSmall", "<real>1e-400</real>", kReal),
        refused("RealWithLetters", "<real>1.5dBm</real>", kReal), refused("RealWithComma", "<real>1,5</real>", kReal),
        refused("RealInHexadecimal", "<real>0x1p4</real>", kReal),
        refused("NotANumberWithPayload", "<real>nan(1)</real>", kReal),
        refused("DateInWords", "<date>today</date>", kDate),
        refused("DateOfNoMonth", "<date>2026-13-01T00:00:00Z</date>", kDate),
        refused("DateOfNoDay", "<date>2026-02-29T00:00:00Z</date>", kDate),
        refused("DateOfNoHour", "<date>2026-02-01T24:00:00Z</date>", kDate),
        refused("DateWithoutZone", "<date>2026-02-01T00:00:00</date>", kDate),
        refused("DateWithSigns", "<date>2026--2-01T00:00:00Z</date>", kDate),
        refused("Base64WithForeignCharacter", "<data>S2V*</data>", kBase64),
        refused("Base64WithoutPadding", "<data>bQ</data>", kBase64),
        refused("Base64WithTooMuchPadding", "<data>bQ===</data>", kBase64),
        refused("Base64PaddedInTheMiddle", "<data>bQ==S2Vz</data>", kBase64),
        refused("Base64WithBitsLeftOver", "<data>bR==</data>", kBase64),
        refused("NulInsideAString", std::string("<string>a\0b</string>", 20), kMalformed),
        refused("ReferenceToNul", "<string>&#0;</string>", "reference to invalid character number"),
        refused("ReferenceToASurrogate", "<string>&#xD800;</string>", "reference to invalid character number"),
        refused("InvalidUtf8", "<string>\xC3(</string>", kMalformed),
        refused("OverlongUtf8", "<string>\xC0\xAF</string>", kMalformed),
        refused("SurrogateInUtf8", "<string>\xED\xA0\x80</string>", kMalformed),
        refused("AboveTheLastCharacter", "<string>\xF4\x90\x80\x80</string>", kMalformed),
        refused("UnknownEntity", "<string>&eacute;</string>", "undefined entity"),
        NamedCase<const char*>{"UnknownEntityUnderADoctype",
                               "<!DOCTYPE plist SYSTEM \"x.dtd\"><plist><string>&eacute;</string></plist>", kEntity},
        NamedCase<const char*>{
            "DeclaredEntity", "<!DOCTYPE plist [<!ENTITY a \"b\">]><plist><string>&a;</string></plist>", kDeclarations},
        NamedCase<const char*>{
            "DeclaredAttributes",
            "<!DOCTYPE plist [<!ATTLIST array a1 CDATA \"x\" a2 CDATA \"x\">]><plist><array/></plist>", kDeclarations},
        NamedCase<const char*>{"EntityFromAFile",
                               "<!DOCTYPE plist [<!ENTITY a SYSTEM \"file:///etc/passwd\">]><plist><string>&a;</string>"
                               "</plist>",
                               kDeclarations},
        NamedCase<const char*>{
            "ParameterEntity",
            "<!DOCTYPE plist [<!ENTITY % a SYSTEM \"file:///etc/passwd\"> %a;]><plist><true/></plist>", kDeclarations},
        NamedCase<const char*>{"BillionLaughs",
                               "<!DOCTYPE plist [<!ENTITY a \"ha\"><!ENTITY b \"&a;&a;&a;&a;&a;&a;&a;&a;\">"
                               "<!ENTITY c \"&b;&b;&b;&b;&b;&b;&b;&b;\">]><plist><string>&c;</string></plist>",
                               kDeclarations},
        NamedCase<const char*>{"AHundredThousandLevels", "<plist>" + repeated("<array>", 100000), kTooDeep},
        NamedCase<const char*>{"AHundredThousandLevelsClosedAgain",
                               xmlList(repeated("<array>", 100000) + repeated("</array>", 100000)), kTooDeep},
        NamedCase<const char*>{"AHundredThousandDictionaries", "<plist>" + repeated("<dict><key>a</key>", 100000),
                               kTooDeep},
        NamedCase<const char*>{"OneLevelTooMany", xmlList(repeated("<array>", 513) + repeated("</array>", 513)),
                               kTooDeep},
        NamedCase<const char*>{"OneValueTooMany", xmlList("<array>" + repeated("<true/>", 1 << 20) + "</array>"),
                               "too many values"}),
    caseName);

TEST(XmlRefused, ReportsThePlace)
{
    EXPECT_EQ(parsed("<plist><array><set/></array></plist>").offset, 14u);
}

TEST(XmlRead, TheDeepestListThatIsTaken)
{
    Value value = parsed(xmlList(repeated("<array>", 512) + repeated("</array>", 512))).value;
    int depth = 0;
    while (value) {
        const auto array = value.array();
        value = array->empty() ? Value() : (*array)[0];
        ++depth;
    }
    EXPECT_EQ(depth, 512);
}

TEST(XmlRead, TheLargestListsThatAreTaken)
{
    const auto many = parsed(xmlList("<array>" + repeated("<true/>", (1 << 20) - 1) + "</array>")).value.array();
    ASSERT_TRUE(many);
    EXPECT_EQ(many->size(), (1u << 20) - 1);

    const auto lines = parsed(xmlList("<string>" + repeated("a &amp; b\n", 1000000) + "</string>"));
    ASSERT_TRUE(lines.value.isText());
    EXPECT_EQ(lines.value.text()->size(), 6000000u);

    std::string entries;
    for (int i = 0; i < 200000; ++i)
        entries += "<key>" + std::to_string(i) + "</key><true/>";
    const auto keys = parsed(xmlList("<dict>" + entries + "</dict>")).value.dictionary();
    ASSERT_TRUE(keys);
    EXPECT_EQ(keys->size(), 200000u);
    EXPECT_EQ(keys->at("199999"), Value(true));
}

// --- writing ---------------------------------------------------------------------------------------------------

TEST(XmlWritten, LooksLikeThis)
{
    const Value value = makeDictionary({{"Text", "R&D <1>"},
                                        {"Numbers", makeArray({-1, UINT64_MAX, 0.1, true, false})},
                                        {"Date", kSomeDate},
                                        {"Data", data("Kestrum")},
                                        {"Empty", makeDictionary({{"a", makeArray()}, {"d", makeDictionary()}})}});
    EXPECT_EQ(xmlOf(value), R"(<?xml version="1.0" encoding="UTF-8"?>
<plist version="1.0">
<dict>
	<key>Text</key>
	<string>R&amp;D &lt;1&gt;</string>
	<key>Numbers</key>
	<array>
		<integer>-1</integer>
		<integer>18446744073709551615</integer>
		<real>0.1</real>
		<true/>
		<false/>
	</array>
	<key>Date</key>
	<date>2026-11-16T06:05:42Z</date>
	<key>Data</key>
	<data>
	S2VzdHJ1bQ==
	</data>
	<key>Empty</key>
	<dict>
		<key>a</key>
		<array/>
		<key>d</key>
		<dict/>
	</dict>
</dict>
</plist>
)");
}

TEST(XmlWritten, LeavesNullsOut)
{
    EXPECT_EQ(parsed(xmlOf(makeDictionary({{"a", Value()}, {"b", makeArray({1, Value(), 2})}}))).value,
              Value(makeDictionary({{"b", makeArray({1, 2})}})));
    EXPECT_FALSE(PropertyListCodec().toXml(Value()));
}

class CharacterWritten : public testing::TestWithParam<NamedCase<const char*>> {};

TEST_P(CharacterWritten, AsXmlAllowsIt)
{
    EXPECT_EQ(parsed(xmlOf(makeDictionary({{"a" + GetParam().input, "b" + GetParam().input + "c"}}))).value,
              Value(makeDictionary(
                  {{std::string("a") + GetParam().expected, std::string("b") + GetParam().expected + "c"}})));
}

INSTANTIATE_TEST_SUITE_P(PropertyList, CharacterWritten,
                         testing::Values(NamedCase<const char*>{"Tab", "\t", "\t"},
                                         NamedCase<const char*>{"LineFeed", "\n", "\n"},
                                         NamedCase<const char*>{"CarriageReturn", "\r", "\r"},
                                         NamedCase<const char*>{"CarriageReturnAndLineFeed", "\r\n", "\r\n"},
                                         NamedCase<const char*>{"EndOfCharacterData", "]]>", "]]>"},
                                         NamedCase<const char*>{"Delete", "\x7F", "\x7F"},
                                         NamedCase<const char*>{"TwoBytes", "\u00E9", "\u00E9"},
                                         NamedCase<const char*>{"ThreeBytes", "\u20AC", "\u20AC"},
                                         NamedCase<const char*>{"FourBytes", "\U0001F600", "\U0001F600"},
                                         NamedCase<const char*>{"LastCharacter", "\U0010FFFF", "\U0010FFFF"},
                                         NamedCase<const char*>{"Nul", std::string(1, '\0'), "\uFFFD"},
                                         NamedCase<const char*>{"Escape", "\x1B", "\uFFFD"},
                                         NamedCase<const char*>{"NoCharacterFFFE", "\xEF\xBF\xBE", "\uFFFD"},
                                         NamedCase<const char*>{"NoCharacterFFFF", "\xEF\xBF\xBF", "\uFFFD"},
                                         NamedCase<const char*>{"LoneContinuation", "\x80", "\uFFFD"},
                                         NamedCase<const char*>{"CutOffSequence", "\xE2\x82", "\uFFFD\uFFFD"},
                                         NamedCase<const char*>{"Surrogate", "\xED\xA0\x80", "\uFFFD\uFFFD\uFFFD"}),
                         caseName);

TEST(XmlWritten, RealsReadBackExactly)
{
    for (const double real : {0.1, 1.0 / 3, -140.25, 1e16, 1e22, 5e-324, 1.7976931348623157e308, 2.0, -0.0})
        EXPECT_EQ(parsed(xmlOf(real)).value, Value(real)) << real;
    EXPECT_TRUE(std::signbit(*parsed(xmlOf(-0.0)).value.real()));
    EXPECT_TRUE(std::isnan(*parsed(xmlOf(-std::numeric_limits<double>::quiet_NaN())).value.real()));
    EXPECT_EQ(parsed(xmlOf(-std::numeric_limits<double>::infinity())).value,
              Value(-std::numeric_limits<double>::infinity()));
}

TEST(XmlWritten, CutsTheFractionOfASecondOff)
{
    EXPECT_EQ(parsed(xmlOf(kSomeDate + 999999us)).value, Value(kSomeDate));
}

TEST(XmlWritten, NoDateWithoutAFourDigitYear)
{
    EXPECT_EQ(xmlOf(Date(std::chrono::sys_days(std::chrono::year{10000} / 1 / 1))), "");
    EXPECT_EQ(xmlOf(Date(std::chrono::sys_days(std::chrono::year{-1} / 12 / 31))), "");
    EXPECT_NE(xmlOf(Date(std::chrono::sys_days(std::chrono::year{0} / 1 / 1))), "");
}

Value nested(int levels)
{
    Value value = makeArray();
    while (--levels > 0)
        value = makeArray({value});
    return value;
}

TEST(XmlWritten, NothingThatIsNestedTooDeeply)
{
    EXPECT_FALSE(PropertyListCodec().toXml(nested(513)));
    EXPECT_EQ(parsed(xmlOf(nested(512))).value, nested(512));
}

TEST(XmlWritten, NothingThatContainsItself)
{
    const auto array = makeArray();
    array->append(array);
    EXPECT_FALSE(PropertyListCodec().toXml(array));
    array->append(array);
    EXPECT_FALSE(PropertyListCodec().toXml(array));
    array->clear(); // breaks the reference cycle
}

TEST(XmlWritten, NothingThatSharingMakesTooLarge)
{
    Value value = "ha";
    for (int i = 0; i < 30; ++i)
        value = makeArray({value, value});
    EXPECT_FALSE(PropertyListCodec().toXml(value));
}

TEST(XmlWritten, ASharedContainerIsWrittenEachTime)
{
    const Value cell = makeDictionary({{"MCC", 262}});
    const auto read = parsed(xmlOf(makeArray({cell, cell}))).value.array();
    ASSERT_EQ(read->size(), 2u);
    EXPECT_EQ((*read)[0], (*read)[1]);
    EXPECT_NE((*read)[0].dictionary(), (*read)[1].dictionary());
}

} // namespace
} // namespace kestrum
