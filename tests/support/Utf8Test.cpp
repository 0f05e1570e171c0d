#include "support/Utf8.h"

#include <gtest/gtest.h>

namespace kestrum {
namespace {

TEST(Utf8, EveryCharacterComesBack)
{
    for (char32_t character = 0; character <= 0x10FFFF; ++character) {
        if (character >= 0xD800 && character <= 0xDFFF)
            continue;
        std::string text;
        appendUtf8(text, character);
        std::size_t at = 0;
        ASSERT_EQ(nextCharacter(text, at), character);
        ASSERT_EQ(at, text.size());
    }
}

TEST(Utf8, TakesTheBytesOfTheStandard)
{
    std::string text;
    for (const char32_t character : {U'A', U'\u00E9', U'\u20AC', U'\U0001F600', U'\U0010FFFF'})
        appendUtf8(text, character);
    EXPECT_EQ(text, "A\xC3\xA9\xE2\x82\xAC\xF0\x9F\x98\x80\xF4\x8F\xBF\xBF");
}

TEST(Utf8, InvalidSequencesAreLeftByteByByte)
{
    for (const char* text : {"\x80", "\xBF", "\xC0\x80", "\xC1\xBF", "\xC3", "\xC3(", "\xE0\x80\x80", "\xE0\x9F\xBF",
                             "\xE2\x82", "\xED\xA0\x80", "\xED\xBF\xBF", "\xF0\x8F\xBF\xBF", "\xF0\x9F\x98",
                             "\xF4\x90\x80\x80", "\xF5\x80\x80\x80", "\xFE", "\xFF"}) {
        std::size_t at = 0;
        EXPECT_FALSE(nextCharacter(text, at));
        EXPECT_EQ(at, 1u);
    }
}

TEST(Utf8, BeginEndsBetweenCharacters)
{
    const std::string text = "a\xC3\xA9\xF0\x9F\x98\x80z"; // of 1, 2, 4 and 1 bytes
    const std::size_t kept[] = {0, 1, 1, 3, 3, 3, 3, 7, 8, 8};
    for (std::size_t most = 0; most < std::size(kept); ++most)
        EXPECT_EQ(beginOf(text, most), text.substr(0, kept[most])) << most;
    EXPECT_EQ(beginOf("\x80\x80\x80\x80\x80\x80", 5).size(), 5u) << "which is not UTF-8";
}

} // namespace
} // namespace kestrum
