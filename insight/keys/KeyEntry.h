#pragma once

#include "insight/keys/DerivedValues.h"
#include "insight/keys/Measure.h"

#include <cstdint>
#include <optional>
#include <span>
#include <string_view>
#include <vector>

namespace kestrum {

/// What kind of value a key has. Over time, numbers are a curve, identities are marks, and states are a strip.
enum class Kind : std::uint8_t { Level, Ratio, Time, Percentage, Counter, Number, Identity, State, Text };

/// "level", "ratio", ...
std::string_view word(Kind kind);

/// The ends of a plot's axis. Fixed for each key, so that two plots can be compared.
struct Scale {
    double least, greatest;

    friend bool operator==(const Scale&, const Scale&) = default;
};

/// How the numbers of a key are measured.
struct Dimension {
    std::string_view unit = {};                      ///< of the readings: "dBm", "dB", "%"; empty for a plain number
    std::optional<Scale> scale = {};                 ///< nothing for a number without natural limits
    Measure measure = Measure::None;                 ///< how a value is graded
    std::optional<std::string_view> secondUnit = {}; ///< where a second source of the key has another unit
};

/// What a key does in the rows of a list.
enum class InRow : std::uint8_t {
    Value,
    Identity, ///< all identities of a row together tell it from the others, whatever its index
    Level,    ///< a level by which the rows are sorted
};

/// What a key of the display means. Constant.
struct KeyEntry {
    std::string_view key;     ///< as a pane shows it: without the "n;" of the order
    std::string_view heading; ///< of a column: at most 12 characters
    Kind kind;
    Dimension in;
    std::string_view standard; ///< "3GPP TS 36.214, 5.1.1"; empty where no public standard defines it
    std::string_view meaning;  ///< one to three sentences
    Derive* derive = nullptr;  ///< the values that follow from a reading
    InRow inRow = InRow::Value;
};

/// The key of an entry for all rows that have a number as their key: the pilots of CDMA.
inline constexpr std::string_view kAnyNumber = "#";

/// A key of another section.
struct KeyPlace {
    std::string_view section, key;
};

/// The keys of a dictionary, or of the rows of a list.
struct SectionEntry {
    std::string_view name;                ///< with its parent's name where the name alone is not unique: "1x/Radio"
    std::string_view meaning;             ///< one sentence
    std::span<const KeyEntry> keys;       ///< the most telling ones first; empty where nothing fills the section
    std::string_view serving = {};        ///< of a list of cells: the section of the serving cell
    std::optional<KeyPlace> channel = {}; ///< of such a list: the key with the channel of all its rows

    /// Null when the section has no such key. "n;Name" is "Name".
    const KeyEntry* entry(std::string_view key) const;
    /// The entry by which a list is sorted; null when there is none.
    const KeyEntry* level() const
    {
        const auto all = levels();
        return all.empty() ? nullptr : all.front();
    }
    /// The same where rows have different technologies: each row is sorted by the first level that it has.
    std::vector<const KeyEntry*> levels() const { return with(InRow::Level); }
    /// The entries that together identify a row, as far as it has them; empty when only its index does.
    std::vector<const KeyEntry*> identity() const { return with(InRow::Identity); }

private:
    std::vector<const KeyEntry*> with(InRow role) const;
};

/// The sections of a technology (an identifier of platform/TelephonyService.h), in the order of its template; empty for
/// an unknown technology.
std::span<const SectionEntry> sectionEntries(std::string_view technology);

/// The section with the name, or at the path ("/Idle Mode/Neighbor Cells List", rows included: ".../3"). Null when
/// there is none.
const SectionEntry* sectionEntry(std::string_view technology, std::string_view nameOrPath);

/// What a key means. `section` is a name or a path, as for `sectionEntry`. Null for an unknown key. An IFX modem
/// chooses its own sections: there, a key of a cell means the same in every section.
const KeyEntry* keyEntry(std::string_view technology, std::string_view section, std::string_view key);

/// The same for the path of a leaf: "/Idle Mode/Neighbor Cells List/3/Measured RSRP".
const KeyEntry* keyEntryAt(std::string_view technology, std::string_view path);

/// The key of the serving cell with which a column of a list of cells is compared: "Serving Filtered RSRP" for
/// "Filtered RSRP". Null when there is none.
const KeyEntry* servingCounterpart(std::string_view technology, const SectionEntry& list, const KeyEntry& column);

} // namespace kestrum
