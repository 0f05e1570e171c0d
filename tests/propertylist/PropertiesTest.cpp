// Properties of all values and all bytes.
#include "Lists.h"

#include "support/Utf8.h"

#include <gtest/gtest.h>
#include <rapidcheck.h>

#include <rapidcheck/gtest.h> // needs gtest.h before it

#include <bit>
#include <cmath>

namespace kestrum {
namespace {

namespace gen = rc::gen;

/// Texts with all characters that XML allows.
rc::Gen<std::string> texts()
{
    const auto character = gen::weightedOneOf<char32_t>({{8, gen::inRange<char32_t>(0x20, 0x80)},
                                                         {2, gen::element<char32_t>('\t', '\n', '\r', '&', '<', '>')},
                                                         {1, gen::inRange<char32_t>(0x80, 0xD800)},
                                                         {1, gen::inRange<char32_t>(0xE000, 0xFFFE)},
                                                         {1, gen::inRange<char32_t>(0x10000, 0x110000)}});
    return gen::map(gen::container<std::vector<char32_t>>(character), [](const std::vector<char32_t>& characters) {
        std::string text;
        for (const char32_t each : characters)
            appendUtf8(text, each);
        return text;
    });
}

template <typename T>
rc::Gen<Value> valuesOf(rc::Gen<T> generator)
{
    return gen::map(std::move(generator), [](const T& each) { return Value(each); });
}

rc::Gen<Value> scalars()
{
    return gen::oneOf(
        valuesOf(texts()), valuesOf(gen::arbitrary<std::int64_t>()), valuesOf(gen::arbitrary<bool>()),
        gen::map(gen::arbitrary<std::uint64_t>(), [](std::uint64_t bits) { return Value(~bits); }),
        gen::map(gen::arbitrary<std::uint64_t>(),
                 [](std::uint64_t bits) {
                     const auto real = std::bit_cast<double>(bits * 0x9E3779B97F4A7C15u);
                     return Value(std::isnan(real) ? 0.5 : real); // not-a-number is not equal to itself
                 }),
        gen::map(gen::inRange<std::int64_t>(-62135596800, 253402300800), // the years 1 to 9999
                 [](std::int64_t seconds) { return Value(Date(std::chrono::seconds(seconds))); }),
        gen::map(gen::arbitrary<std::string>(), [](const std::string& bytes) { return Value(Data(bytesOf(bytes))); }));
}

rc::Gen<Value> values(int depth)
{
    if (depth == 0)
        return scalars();
    const auto child = gen::scale(0.3, values(depth - 1)); // larger values only take longer
    return gen::oneOf(scalars(),
                      gen::map(gen::container<std::vector<Value>>(child),
                               [](const std::vector<Value>& elements) { return Value(makeArray(elements)); }),
                      gen::map(gen::container<std::vector<std::pair<std::string, Value>>>(gen::pair(texts(), child)),
                               [](const std::vector<std::pair<std::string, Value>>& entries) {
                                   const auto dictionary = makeDictionary();
                                   for (const auto& [key, value] : entries)
                                       dictionary->set(key, value);
                                   return Value(dictionary);
                               }));
}

RC_GTEST_PROP(AnyValue, ComesBackFromXml, ())
{
    const Value value = *values(3);
    const auto read = parsed(xmlOf(value));
    RC_ASSERT(read.reason == "");
    RC_ASSERT(read.value == value);
    RC_ASSERT(describe(read.value) == describe(value)); // in the same order
}

RC_GTEST_PROP(AnyValue, ComesBackFromXmlWhateverIsSpent, ())
{
    const Value value = *values(2), spent = *values(2);
    const Value held = deepCopy(spent);
    const std::string xml = xmlOf(value);
    const auto over = [&xml](Value given) { return PropertyListCodec().parseOver(bytesOf(xml), std::move(given)); };
    RC_ASSERT(describe(over(deepCopy(spent))) == describe(value));
    // Parses over the same list again, unchanged and extended by another.
    RC_ASSERT(describe(over(over({}))) == describe(value));
    RC_ASSERT(describe(over(over(makeArray({deepCopy(spent), deepCopy(value)})))) == describe(value));
    // A value with another owner stays unchanged.
    RC_ASSERT(describe(over(spent)) == describe(value));
    RC_ASSERT(spent == held);
}

TEST(AnyValue, ComesBackFromPeerInBothForms)
{
    if (!peerIsThere())
        GTEST_SKIP() << "python3 is not installed";
    std::vector<Value> many;
    ASSERT_TRUE(rc::check("collect", [&] { many.push_back(*values(3)); }));
    const Value value = makeArray(many);
    EXPECT_EQ(parsed(peer("convert BINARY", xmlOf(value))).value, value);
    // plistlib does not escape a carriage return in XML, so it becomes a line feed.
    EXPECT_EQ(peer("repr", xmlOf(value)), peer("repr", peer("convert BINARY", xmlOf(value))));
}

/// Reading gives a value or a reason. The value can be written, and then reads the same.
void checkReading(const std::string& bytes)
{
    const auto read = parsed(bytes);
    RC_ASSERT(read.value.isNull() == !read.reason.empty());
    RC_ASSERT(read.offset <= bytes.size());
    if (!read)
        return;
    const std::string once = xmlOf(read.value);
    const std::string twice = xmlOf(parsed(once).value);
    RC_ASSERT(!twice.empty());
    RC_ASSERT(xmlOf(parsed(twice).value) == twice);
}

RC_GTEST_PROP(AnyBytes, AreReadOrRefused, ())
{
    const auto start = *gen::element<std::string>("", "bplist00", "<plist>", "<plist><dict>");
    checkReading(start + *gen::arbitrary<std::string>());
}

/// `good` with a few bytes changed.
void checkDamaged(std::string good)
{
    using Change = std::pair<std::size_t, char>;
    for (const auto& [place, byte] : *gen::container<std::vector<Change>>(
             gen::pair(gen::inRange<std::size_t>(0, good.size()), gen::arbitrary<char>())))
        good[place] = byte;
    checkReading(good);
}

RC_GTEST_PROP(DamagedXml, IsReadOrRefused, ())
{
    checkDamaged(xmlList("<dict><key>a</key><array><integer>12</integer><real>1.5</real><true/><data>S2Vz</data>"
                         "<date>2026-11-16T06:05:42Z</date></array><key>b</key><string>&lt;</string></dict>"));
}

RC_GTEST_PROP(DamagedBinary, IsReadOrRefused, ())
{
    checkDamaged(BinaryList{{hex("d20102") + hex("0304"), hex("5161"), hex("5163"), hex("a6050608090a0b"), hex("d0"),
                             hex("6200e9d83d"), hex("1001"), hex("09"), hex("13ffffffffffffffff"),
                             hex("330000000000000000"), hex("430001ff"), hex("233ff8000000000000")}}
                     .bytes());
}

} // namespace
} // namespace kestrum
