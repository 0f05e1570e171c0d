#include "support/Format.h"

#include <gtest/gtest.h>

#include <cmath>
#include <cstdarg>
#include <cstdint>
#include <cstdio>
#include <limits>

namespace kestrum {
namespace {

/// The C library's result for the same format.
[[gnu::format(printf, 1, 2)]] std::string printed(const char* format, ...)
{
    std::va_list arguments;
    va_start(arguments, format);
    char text[1024];
    const int length = std::vsnprintf(text, sizeof text, format, arguments);
    va_end(arguments);
    return {text, static_cast<std::size_t>(length)};
}

// One text for both: a comparison of different formats would prove nothing.
#define EXPECT_AS_PRINTF(...) EXPECT_EQ(formatted(__VA_ARGS__), printed(__VA_ARGS__))

TEST(Format, SignedIntegersAsPrintf)
{
    for (const int number : {0, 1, -1, 9, 10, 42, -140, 65535, 1234567, INT32_MAX, INT32_MIN}) {
        EXPECT_AS_PRINTF("%d", number);
        EXPECT_AS_PRINTF("%+d", number);
        EXPECT_AS_PRINTF("%04d", number);
        EXPECT_AS_PRINTF("%+04d", number);
        EXPECT_AS_PRINTF("%6d|", number);
        EXPECT_AS_PRINTF("a %d b %d c", number, -42);
    }
    for (const long number : {0L, -1L, INT64_MAX, INT64_MIN}) {
        EXPECT_AS_PRINTF("%ld", number);
        EXPECT_AS_PRINTF("%+ld", number);
        EXPECT_AS_PRINTF("%025ld", number);
    }
    EXPECT_AS_PRINTF("%d", std::int16_t{-3});
    EXPECT_AS_PRINTF("%d", std::uint16_t{65535});
    EXPECT_AS_PRINTF("%d", std::int8_t{-128});
}

TEST(Format, UnsignedIntegersAsPrintf)
{
    for (const unsigned number : {0u, 1u, 10u, 0xABCDEFu, UINT32_MAX}) {
        EXPECT_AS_PRINTF("%u", number);
        EXPECT_AS_PRINTF("%02u", number);
        EXPECT_AS_PRINTF("%x", number);
        EXPECT_AS_PRINTF("0x%06x", number);
        EXPECT_AS_PRINTF("%12x|", number);
    }
    EXPECT_AS_PRINTF("%lu %lx", UINT64_MAX, UINT64_MAX);
    EXPECT_AS_PRINTF("%u %x", std::uint8_t{255}, std::uint8_t{255});
}

TEST(Format, OnlySignedConversionsShowAPlus)
{
    EXPECT_EQ(formatted("%+u %+x", 5u, 5u), "5 5");
}

TEST(Format, RealsAsPrintf)
{
    for (const double number :
         {0.0,    -0.0,   0.5,     1.5,     2.5,     -2.5, 0.125,       0.375, 0.005, 0.015, 1.005,
          2.675,  99.995, 999.999, -140.25, -31.875, 1e-7, 123456789.0, 1e15,  1e22,  1e100, 1.7976931348623157e308,
          5e-324, -1e-300}) {
        EXPECT_AS_PRINTF("%f", number);
        EXPECT_AS_PRINTF("%lf", number);
        EXPECT_AS_PRINTF("%.2f", number);
        EXPECT_AS_PRINTF("%4.2f", number);
        EXPECT_AS_PRINTF("%4.2lf dBm", number);
        EXPECT_AS_PRINTF("%.02f", number);
        EXPECT_AS_PRINTF("%+.2f", number);
        EXPECT_AS_PRINTF("%.0f", number);
        EXPECT_AS_PRINTF("%10.1f|", number);
        EXPECT_AS_PRINTF("%010.1f", number);
        EXPECT_AS_PRINTF("%+010.1f", number);
        EXPECT_AS_PRINTF("%.60f", number);
    }
    for (int raw = -2000; raw <= 2000; ++raw) // every step of the scales in use
        for (const double step : {1.0 / 2, 1.0 / 8, 1.0 / 16, 1.0 / 256, 0.01, 0.1})
            EXPECT_AS_PRINTF("%4.2f", raw * step);
    EXPECT_AS_PRINTF("%.3f", static_cast<double>(0.1f));
    EXPECT_EQ(formatted("%.9f", 0.1f), "0.100000001");
}

TEST(Format, BinaryFractionsRoundHalfToEvenAsPrintf)
{
    // Up to 20 binary places and just beyond, for numbers below and above 2^20.
    for (const double whole : {0.0, 1.0, 2.0, 63.0, 140.0, 1048574.0, 1048575.0, 1048576.0, 1e9})
        for (int places = 1; places <= 23; ++places)
            for (const int eighth : {1, 3, 4, 5, 7}) {
                const double fraction = eighth * std::ldexp(1.0, -places) / 8;
                for (const double number : {whole + fraction, -whole - fraction, whole + 1 - fraction}) {
                    EXPECT_AS_PRINTF("%.0f", number);
                    EXPECT_AS_PRINTF("%.1f", number);
                    EXPECT_AS_PRINTF("%+.2f", number);
                    EXPECT_AS_PRINTF("%.3f", number);
                    EXPECT_AS_PRINTF("%f", number);
                    EXPECT_AS_PRINTF("%.7f", number);
                }
            }
}

TEST(Format, InfinityAsPrintf)
{
    for (const double number : {HUGE_VAL, -HUGE_VAL}) {
        EXPECT_AS_PRINTF("%f", number);
        EXPECT_AS_PRINTF("%+.2f dB", number);
        EXPECT_AS_PRINTF("%6.2f", number);
        EXPECT_AS_PRINTF("%06.2f", number);
    }
}

TEST(Format, NotANumberNeverHasASign)
{
    constexpr double nan = std::numeric_limits<double>::quiet_NaN();
    EXPECT_EQ(formatted("%f", nan), "nan");
    EXPECT_EQ(formatted("%f", -nan), "nan");
    EXPECT_EQ(formatted("%4.2lf dBm", nan), " nan dBm");
    EXPECT_EQ(formatted("%4.2lf dBm", -nan), " nan dBm");
    EXPECT_EQ(formatted("%+.2f dB", nan), "nan dB");
    EXPECT_EQ(formatted("%06.2f", nan), "   nan");
}

TEST(Format, TextsAsPrintf)
{
    EXPECT_AS_PRINTF("%s", "");
    EXPECT_AS_PRINTF("<%s> <%6s> <%2s>", "LTE", "LTE", "LTE");
    EXPECT_AS_PRINTF("<%.2s> <%5.1s> <%.9s> <%.0s>", "LTE", "LTE", "LTE", "LTE");
    EXPECT_AS_PRINTF("%c%c", 'A', '\x7F');
    EXPECT_AS_PRINTF("100%% of %s%%", "it");
    EXPECT_EQ(formatted("%@ and %s", std::string("a string"), std::string_view("a view")), "a string and a view");
    const char* const none = nullptr;
    EXPECT_EQ(formatted("%s", none), "(null)");
}

TEST(Format, PercentsInArgumentsStayAsTheyAre)
{
    EXPECT_EQ(formatted("%s", "%d %s %n"), "%d %s %n");
}

TEST(Format, NulInsideATextStays)
{
    EXPECT_EQ(formatted("%s!", std::string("a\0b", 3)), std::string("a\0b!", 4));
}

TEST(Format, LongTextsStayWhole)
{
    for (const std::size_t length : {127u, 128u, 129u, 1000u, 100000u}) {
        const std::string text(length, 'x');
        EXPECT_EQ(formatted("%s", text), text);
        EXPECT_EQ(formatted("%s%d", text, 12), text + "12");
        EXPECT_EQ(formatted("%d%s%s", 12, text, text), "12" + text + text);
    }
    EXPECT_EQ(formatted("%300d", 1), std::string(299, ' ') + "1");
}

TEST(Format, Addresses)
{
    EXPECT_EQ(formatted("%p", static_cast<const void*>(nullptr)), "0x0");
    const int here = 0;
    EXPECT_AS_PRINTF("%p", static_cast<const void*>(&here));
    EXPECT_EQ(formatted("%20p", static_cast<const void*>(nullptr)), std::string(17, ' ') + "0x0");
}

TEST(Format, WithoutArguments)
{
    EXPECT_EQ(formatted(" Could not generate PLIST"), " Could not generate PLIST");
    EXPECT_EQ(formatted(""), "");
}

} // namespace
} // namespace kestrum
