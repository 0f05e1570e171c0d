// A user's file of thresholds. It is refused with a line and changes nothing, or its profiles are sound: each has a
// source, and a better number never has a worse grade.
#include "insight/Thresholds.h"
#include "Require.h"

#include <algorithm>
#include <cstdint>
#include <string_view>

namespace kestrum::fuzz {
namespace {

void checkLimits(const Limits& limits)
{
    const bool lessIsBetter = limits.excellent < limits.poor;
    Grade previous = lessIsBetter ? Grade::Excellent : Grade::NoService;
    for (int number = -200; number < 200; ++number) {
        const auto grade = limits.grade(number);
        require(grade.has_value(), "a number without a grade");
        require(lessIsBetter ? *grade <= previous : *grade >= previous, "a better number has a worse grade");
        previous = *grade;
    }
}

void read(std::string_view text)
{
    Thresholds thresholds;
    const std::size_t before = thresholds.profiles().size();
    if (const auto problem = thresholds.read(text)) {
        require(!problem->text.empty() && problem->text.size() < 200, "a problem without a text, or with a long one");
        require(std::ranges::all_of(problem->text, [](char c) { return c >= ' ' && c <= '~'; }),
                "a problem that a terminal cannot show");
        require(thresholds.profiles().size() == before && thresholds.used().name == "drive-test",
                "a bad file has an effect");
    }
    for (const auto& profile : thresholds.profiles()) {
        require(!profile.name.empty() && !profile.source.empty(), "a profile without a name or a source");
        std::ranges::for_each(profile.limits, checkLimits);
    }
}

} // namespace
} // namespace kestrum::fuzz

extern "C" int LLVMFuzzerTestOneInput(const std::uint8_t* data, std::size_t size)
{
    kestrum::fuzz::read({reinterpret_cast<const char*>(data), size});
    return 0;
}
