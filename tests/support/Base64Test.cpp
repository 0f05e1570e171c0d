#include "support/Base64.h"

#include <gtest/gtest.h>

namespace kestrum {
namespace {

// RFC 4648, section 10.
constexpr std::pair<const char*, const char*> kExamples[] = {{"", ""},
                                                             {"f", "Zg=="},
                                                             {"fo", "Zm8="},
                                                             {"foo", "Zm9v"},
                                                             {"foob", "Zm9vYg=="},
                                                             {"fooba", "Zm9vYmE="},
                                                             {"foobar", "Zm9vYmFy"}};

TEST(Base64, WritesTheExamplesOfTheStandard)
{
    for (const auto& [plain, encoded] : kExamples)
        EXPECT_EQ(base64(bytesOf(plain)), encoded);
}

TEST(Base64, ReadsTheExamplesOfTheStandard)
{
    for (const auto& [plain, encoded] : kExamples) {
        const auto bytes = bytesFromBase64(encoded);
        ASSERT_TRUE(bytes) << encoded;
        EXPECT_EQ(textOf(*bytes), plain);
    }
}

TEST(Base64, UsesTheWholeAlphabet)
{
    EXPECT_EQ(base64(bytesOf("\xFB\xEF\xBE\xFF\xFF\xFF")), "++++////");
}

TEST(Base64, BlanksDoNotCount)
{
    EXPECT_EQ(textOf(bytesFromBase64(" Z\tm9\r\nv Y g = = ").value()), "foob");
}

TEST(Base64, RefusesWhatNoEncoderWrites)
{
    for (const char* text : {"Z", "Zg", "Zg=", "Zg===", "Zm8", "Zm8==", "=", "====", "Zg==Zg==", "Zh==", "Zm9=", "Zm9-",
                             "Zm9v=", "\xC3\xA9=="})
        EXPECT_FALSE(bytesFromBase64(text)) << text;
}

} // namespace
} // namespace kestrum
