#include "insight/keys/KeyEntry.h"

#include "insight/keys/KeyTables.h"
#include "platform/TelephonyService.h"

#include <algorithm>
#include <string>

namespace kestrum {
namespace {

bool isNumber(std::string_view text)
{
    return !text.empty() && std::ranges::all_of(text, [](char c) { return c >= '0' && c <= '9'; });
}

/// The path without its last name, if that is the index of a row.
std::string_view withoutIndex(std::string_view path)
{
    const auto slash = path.rfind('/');
    return slash != std::string_view::npos && isNumber(path.substr(slash + 1)) ? path.substr(0, slash) : path;
}

/// Whether the path ends with the name: "/EV-DO/Radio" with "Radio", and not with "dio".
bool endsWithName(std::string_view path, std::string_view name)
{
    if (name.empty())
        return path.empty() || path == "/";
    if (!path.ends_with(name))
        return false;
    path.remove_suffix(name.size());
    return path.empty() || path.ends_with('/');
}

/// The entry of a key; null when there is none.
const KeyEntry* entryIn(std::span<const KeyEntry> entries, std::string_view key)
{
    key = shownName(key);
    for (const auto& each : entries)
        if (each.key == key || (each.key == kAnyNumber && isNumber(key)))
            return &each;
    return nullptr;
}

} // namespace

std::string_view word(Kind kind)
{
    constexpr std::string_view kWords[] = {"level",  "ratio",    "time",  "percentage", "counter",
                                           "number", "identity", "state", "text"};
    return kWords[static_cast<std::size_t>(kind)];
}

const KeyEntry* SectionEntry::entry(std::string_view key) const
{
    return entryIn(keys, key);
}

std::vector<const KeyEntry*> SectionEntry::with(InRow role) const
{
    std::vector<const KeyEntry*> found;
    for (const auto& each : keys)
        if (each.inRow == role)
            found.push_back(&each);
    return found;
}

std::span<const SectionEntry> sectionEntries(std::string_view technology)
{
    const struct {
        std::string_view technology;
        std::span<const SectionEntry> sections;
    } kTables[] = {
        {kVoxLogChannelTechnology_Zephra_LTE, keys::kLte}, {kVoxLogChannelTechnology_Zephra_UTRAN2, keys::kUtran},
        {kVoxLogChannelTechnology_Zephra_GSM, keys::kGsm}, {kVoxLogChannelTechnology_Zephra_CDMA, keys::kCdma},
        {kVoxLogChannelTechnology_IFX, keys::kIfx},
    };
    for (const auto& table : kTables)
        if (table.technology == technology)
            return table.sections;
    return {};
}

const SectionEntry* sectionEntry(std::string_view technology, std::string_view nameOrPath)
{
    const SectionEntry* found = nullptr;
    for (const auto& section : sectionEntries(technology))
        if ((endsWithName(nameOrPath, section.name) || endsWithName(withoutIndex(nameOrPath), section.name)) &&
            (found == nullptr || section.name.size() > found->name.size()))
            found = &section;
    return found;
}

const KeyEntry* keyEntry(std::string_view technology, std::string_view section, std::string_view key)
{
    const auto* place = sectionEntry(technology, section);
    const auto* entry = place != nullptr ? place->entry(key) : nullptr;
    if (entry != nullptr || technology != kVoxLogChannelTechnology_IFX)
        return entry;
    entry = entryIn(keys::kIfxCell, key);
    return entry != nullptr ? entry : entryIn(keys::kIfxModem, key);
}

const KeyEntry* keyEntryAt(std::string_view technology, std::string_view path)
{
    // Names may have slashes in them ("EF-GPRS/PS-LOCI"), so every slash may be the one before the key.
    for (const auto& leaf : {path, withoutIndex(path)})
        for (auto slash = leaf.rfind('/'); slash != std::string_view::npos;
             slash = slash != 0 ? leaf.rfind('/', slash - 1) : std::string_view::npos)
            if (const auto* entry = keyEntry(technology, leaf.substr(0, slash), leaf.substr(slash + 1)))
                return entry;
    return nullptr;
}

const KeyEntry* servingCounterpart(std::string_view technology, const SectionEntry& list, const KeyEntry& column)
{
    const auto* serving = list.serving.empty() ? nullptr : sectionEntry(technology, list.serving);
    if (serving == nullptr)
        return nullptr;
    if (const auto* same = serving->entry(column.key))
        return same;
    return serving->entry("Serving " + std::string(column.key));
}

} // namespace kestrum
