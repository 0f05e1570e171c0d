#include "LogGenerator/C2K/BandClass.h"

#include "LogGenerator/Row.h"

namespace kestrum {

std::string bandClassName(std::uint32_t bandClass)
{
    constexpr std::string_view kNames[] = {
        "800 MHz cellular band [0]",
        "1.8 to 2.0GHz PCS band [1]",
        "872 to 960MHz TACS band [2]",
        "832 to 925MHz JTACS band [3]",
        "1.75 to 1.87GHz Korean PCS band [4]",
        "450MHz band [5]",
        "2GHz band [6]",
        "700MHz band [7]",
        "1800 MHz band [8]",
        "900 MHzband [9]",
        "Secondary 800 MHz band [10]",
        "400 MHz European PAMR band [11]",
        "800 MHz European PAMR band [12]",
    };
    if (bandClass < std::size(kNames))
        return std::string(kNames[bandClass]);
    return formatted("[Bad Value %d]", static_cast<std::int32_t>(bandClass));
}

} // namespace kestrum
