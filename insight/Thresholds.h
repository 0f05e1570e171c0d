#pragma once

#include "insight/keys/Measure.h"
#include "support/Problem.h"

#include <cstdint>
#include <optional>
#include <span>
#include <string>
#include <string_view>
#include <vector>

namespace kestrum {

/// How good a value is. Ordered: a greater grade is a better one.
enum class Grade : std::uint8_t { NoService, Poor, Fair, Good, Excellent };

/// "excellent", "good", "fair", "poor", "no service".
std::string_view word(Grade grade);

/// The worst value that still has each grade, in the measure's unit; a value worse than `poor` is "no service". They
/// fall from `excellent` to `poor`, or rise where less is better.
struct Limits {
    Measure measure;
    double excellent, good, fair, poor;

    /// Nothing for not-a-number.
    std::optional<Grade> grade(double number) const;

    friend bool operator==(const Limits&, const Limits&) = default;
};

/// Limits of one origin. Sources disagree on what is good, so each profile names its source.
struct ThresholdProfile {
    std::string name;
    std::string source;
    std::vector<Limits> limits; ///< at most one for each measure
};

/// A grade, and the profile that gave it.
struct Verdict {
    Grade grade;
    std::string_view profile, source; ///< valid as long as the thresholds
};

/// The profiles of the program and of the user, one of them in use.
class Thresholds {
public:
    /// The program's profiles. "drive-test" is in use.
    Thresholds();

    /// Adds the profiles of a user's file (docs/thresholds.md), and uses the one that it names. A bad line gives a
    /// problem with its number, "line 3: ...", and changes nothing.
    std::optional<Problem> read(std::string_view text);

    std::span<const ThresholdProfile> profiles() const { return _profiles; }
    const ThresholdProfile& used() const { return _profiles[_used]; }
    /// False, without effect, when there is no such profile.
    bool use(std::string_view name);

    /// Of the used profile, or of "drive-test" where it leaves the measure out; null for a measure that is not graded.
    const Limits* limitsOf(Measure measure) const;
    /// `number` is in the measure's unit. Measures that the used profile leaves out have the limits of "drive-test".
    /// Nothing for a measure that is not graded, and for not-a-number.
    std::optional<Verdict> grade(Measure measure, double number) const;

private:
    const ThresholdProfile* profileOf(Measure measure) const;

    std::vector<ThresholdProfile> _profiles; ///< the first is "drive-test"
    std::size_t _used = 0;
};

/// The name of the user's file below the folder of the program's configuration: $XDG_CONFIG_HOME/kestrum.
inline constexpr std::string_view kThresholdsFile = "thresholds";

} // namespace kestrum
