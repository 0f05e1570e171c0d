// Compiled once per case, which must fail, and once without any case.
#include "support/Format.h"
#include "support/Reading.h"
#include "support/Record.h"
#include "support/Value.h"

using namespace kestrum;

const int number = -1;
const std::string text = formatted("%d %s %lu %+.2f %c %p %@ 100%%", number, "text", 1ul, 0.5, 'c', &number, "object")
#if defined TEXT_FOR_A_NUMBER
                         + formatted("%d", "12")
#elif defined NUMBER_FOR_A_TEXT
                         + formatted("%s", 12)
#elif defined SIGNED_FOR_UNSIGNED
                         + formatted("%u", -1)
#elif defined UNSIGNED_FOR_SIGNED
                         + formatted("%d", 1u)
#elif defined LONG_WITHOUT_L
                         + formatted("%d", 1l)
#elif defined INTEGER_FOR_A_REAL
                         + formatted("%f", 1)
#elif defined REAL_FOR_AN_INTEGER
                         + formatted("%d", 1.0)
#elif defined BOOLEAN_FOR_A_NUMBER
                         + formatted("%d", true)
#elif defined CHARACTER_FOR_A_NUMBER
                         + formatted("%d", 'c')
#elif defined PRECISION_FOR_AN_INTEGER
                         + formatted("%.2d", 1)
#elif defined UNKNOWN_CONVERSION
                         + formatted("%q", 1)
#elif defined UNFINISHED_CONVERSION
                         + formatted("100 %", 1)
#elif defined TOO_FEW_ARGUMENTS
                         + formatted("%d %d", 1)
#elif defined TOO_MANY_ARGUMENTS
                         + formatted("%d", 1, 2)
#endif
    ;

constexpr Field fields[] = {
    u32(21).bits(15, 21),
    u8(13).bit(7),
#if defined BITS_BEYOND_THE_WORD
    u16(19).bits(9, 16),
#elif defined BITS_IN_REVERSE
    u16(19).bits(8, 0),
#elif defined BIT_BEYOND_THE_WORD
    u8(13).bit(8),
#endif
};

constexpr Quantity level{[](Quantity::Raw raw) { return formatted("%lu dBm", raw); }};

// A line of a layout.
struct Line {
    Field field;
    QuantityRef quantity;
};

#if defined LOCAL_FOR_A_QUANTITY
Reading local()
{
    constexpr Quantity mine{[](Quantity::Raw) { return std::string(); }};
    return Reading(mine, 7);
}
#endif

constexpr Line lines[] = {
    {u8(0), level},
#if defined TEMPORARY_FOR_A_QUANTITY
    {u8(1), Quantity{[](Quantity::Raw) { return std::string(); }}},
#endif
};

const Value value =
#if defined POINTER_FOR_A_VALUE
    &fields[0]; // the pointer would be converted to a boolean
#else
    true;
#endif
