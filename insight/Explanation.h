#pragma once

#include "insight/Thresholds.h"
#include "insight/keys/KeyEntry.h"

#include <optional>
#include <string>
#include <string_view>
#include <vector>

namespace kestrum {

/// The number of a value in the unit of its key's entry, for plots and sorting: of a reading, or of a text such as
/// "-53 dBm". RXLEV becomes dBm where the entry has dBm. Nothing for "Not Present", for names and for other units.
std::optional<double> numberOf(const KeyEntry& entry, const Value& value);

/// The same for a number that has been measured already.
std::optional<double> numberOf(const KeyEntry& entry, double number, std::string_view unit);

/// How good a value is. `beside` is the dictionary that holds it, or null. Nothing for a key that is not graded, and for
/// a value without a number.
std::optional<Verdict> verdictOf(const KeyEntry& entry, const Value& value, const Dictionary* beside,
                                 const Thresholds& thresholds);

/// The numbers from `least` on, in the unit of `numberOf`, up to the next band's.
struct GradeBand {
    double least;
    Grade grade;
};
/// All bands, from minus infinity on; none for a key that is not graded.
std::vector<GradeBand> bandsOf(const KeyEntry& entry, const Dictionary* beside, const Thresholds& thresholds);

/// What a key means, what follows from its value, and how good the value is.
struct Explanation {
    std::string_view title;    ///< the key
    std::string_view meaning;  ///< one to three sentences
    std::string_view standard; ///< empty where no public standard defines the key
    DerivedValues derived;
    std::optional<Verdict> verdict;
};

Explanation explain(const KeyEntry& entry, const Value& value, const Dictionary* beside, const Thresholds& thresholds);

/// The explanation as lines, without the title: meaning, derived values, verdict, standard.
std::vector<std::string> linesOf(const Explanation& explanation);

} // namespace kestrum
