#include "insight/keys/KeyEntry.h"
#include "platform/TelephonyService.h"
#include "sections/Measured.h"

#include <gtest/gtest.h>

#include <algorithm>

namespace kestrum {
namespace {

using Entries = std::set<const KeyEntry*>;

/// All that a technology publishes: on records of all kinds, and in its sample capture.
template <typename Generator>
Measured published(const char* templateName, const char* capture, const std::vector<RecordBuilder>& others = {})
{
    Measured measured = measuredBy<Generator>(templateName, others);
    TechnologyRun<Generator> run(templateName);
    readCapture(capture, run, measured);
    return measured;
}

/// The units of an entry, as Measured has them.
Measured::Units unitsOf(const KeyEntry& entry)
{
    const auto named = [](std::string_view unit) { return unit.empty() ? "a number" : std::string(unit); };
    Measured::Units units{named(entry.in.unit)};
    if (entry.in.secondUnit)
        units.insert(named(*entry.in.secondUnit));
    return units;
}

/// Checks each published key against its entry, and that each entry has a key.
void checkKeys(std::string_view technology, const Measured& measured)
{
    Entries used;
    for (const auto& [path, units] : measured.byPath()) {
        const KeyEntry* entry = keyEntryAt(technology, path);
        if (entry == nullptr && units.empty() && sectionEntry(technology, path) != nullptr)
            continue; // a list of CDMA is a text while it is empty
        ASSERT_NE(entry, nullptr) << path << " has no entry";
        used.insert(entry);
        const bool isWord = entry->kind == Kind::State || entry->kind == Kind::Text;
        if (units == Measured::Units{"a text"}) {
            EXPECT_TRUE(isWord || entry->kind == Kind::Identity) << path << " is a " << word(entry->kind);
        } else if (!units.empty()) {
            EXPECT_EQ(units, unitsOf(*entry)) << path;
            EXPECT_FALSE(isWord) << path;
        }
    }
    for (const auto& section : sectionEntries(technology))
        for (const auto& entry : section.keys)
            EXPECT_TRUE(used.contains(&entry)) << section.name << '/' << entry.key << ": no such key";
}

/// The paths of the lists, and of the dictionaries that hold keys or nothing.
void collectSections(const Value& node, const std::string& path, std::set<std::string>& sections)
{
    if (node.array()) {
        sections.insert(path);
        return;
    }
    bool holdsKeys = node.dictionary()->empty();
    for (const auto& entry : *node.dictionary()) {
        if (entry.key == kSortedKey)
            continue;
        if (entry.value.isText())
            holdsKeys = true;
        else
            collectSections(entry.value, path + '/' + entry.key.substr(entry.key.find(';') + 1), sections);
    }
    if (holdsKeys)
        sections.insert(path);
}

void checkSections(std::string_view technology, const char* templateName)
{
    const Value tree = PropertyListCodec().load(TechnologyRun<LTELogGenerator>::resource(templateName));
    std::set<std::string> sections;
    collectSections(tree, "", sections);
    std::set<const SectionEntry*> used;
    for (const auto& path : sections) {
        const auto* section = sectionEntry(technology, path);
        EXPECT_TRUE(section != nullptr || keyEntryAt(technology, path) != nullptr) << path << " has no entry";
        used.insert(section);
    }
    for (const auto& section : sectionEntries(technology))
        EXPECT_TRUE(used.contains(&section)) << section.name << ": no such section";
}

// What the LTE template and records hold: each key has an entry, each entry a key, and the units agree.
TEST(Keys, OfLteAreComplete)
{
    checkKeys(kVoxLogChannelTechnology_Zephra_LTE, published<LTELogGenerator>("LTE", "lte", candidates()));
    checkSections(kVoxLogChannelTechnology_Zephra_LTE, "LTE");
}

TEST(Keys, OfUtranAreComplete)
{
    checkKeys(kVoxLogChannelTechnology_Zephra_UTRAN2, published<UTRANLogGenerator>("UTRAN", "utran"));
    checkSections(kVoxLogChannelTechnology_Zephra_UTRAN2, "UTRAN");
}

TEST(Keys, OfGsmAndUmtsAreComplete)
{
    checkKeys(kVoxLogChannelTechnology_Zephra_GSM, published<ZPH_GSMLogGenerator>("ZPH_GSM", "gsm"));
    checkSections(kVoxLogChannelTechnology_Zephra_GSM, "ZPH_GSM");
}

TEST(Keys, OfCdmaAreComplete)
{
    checkKeys(kVoxLogChannelTechnology_Zephra_CDMA, measuredInTheCdmaCapture());
}

constexpr std::string_view kTechnologies[] = {
    kVoxLogChannelTechnology_Zephra_LTE,  kVoxLogChannelTechnology_Zephra_UTRAN2, kVoxLogChannelTechnology_Zephra_GSM,
    kVoxLogChannelTechnology_Zephra_CDMA, kVoxLogChannelTechnology_IFX,
};

std::size_t sentencesIn(std::string_view text)
{
    std::size_t count = 0;
    for (std::size_t at = 0; at < text.size(); ++at)
        count += text[at] == '.' && (at + 1 == text.size() || text[at + 1] == ' ');
    return count;
}

TEST(Keys, AreExplainedInShort)
{
    for (const auto technology : kTechnologies)
        for (const auto& section : sectionEntries(technology)) {
            EXPECT_EQ(sentencesIn(section.meaning), 1u) << section.name;
            for (const auto& entry : section.keys) {
                const std::string place = std::string(section.name) + '/' + std::string(entry.key);
                EXPECT_FALSE(entry.heading.empty() || entry.heading.size() > 12) << place;
                EXPECT_GE(sentencesIn(entry.meaning), 1u) << place;
                EXPECT_LE(sentencesIn(entry.meaning), 3u) << place;
                EXPECT_TRUE(entry.meaning.ends_with('.')) << place;
                EXPECT_EQ(entry.meaning.find("  "), std::string_view::npos) << place;
                EXPECT_TRUE(!entry.in.scale || entry.in.scale->least < entry.in.scale->greatest) << place;
            }
        }
}

TEST(Keys, OfASectionHaveDifferentNamesAndHeadings)
{
    for (const auto technology : kTechnologies)
        for (const auto& section : sectionEntries(technology)) {
            std::set<std::string_view> names, headings;
            for (const auto& entry : section.keys) {
                EXPECT_TRUE(names.insert(entry.key).second) << section.name << '/' << entry.key;
                EXPECT_TRUE(headings.insert(entry.heading).second) << section.name << '/' << entry.key;
            }
        }
}

// Levels have dBm or no unit, times have seconds, and so on: the kind is not a matter of taste.
TEST(Keys, HaveTheKindOfTheirUnit)
{
    const std::map<std::string_view, std::set<Kind>> kinds{
        {"dBm", {Kind::Level, Kind::Ratio}}, // Srxlev and a threshold are ratios, shown in dBm
        {"dB", {Kind::Ratio, Kind::Level}},  // RSCP is a level, shown in dB
        {"%", {Kind::Percentage}},
        {"ms", {Kind::Time}},
        {"sec", {Kind::Time}},
        {"kbps", {Kind::Number}},
        {"MHz", {Kind::Number}},
        {"m/s", {Kind::Number}},
        {"× 64chips", {Kind::Identity}},
    };
    for (const auto technology : kTechnologies)
        for (const auto& section : sectionEntries(technology))
            for (const auto& entry : section.keys) {
                if (entry.in.unit.empty()) {
                    EXPECT_NE(entry.kind, Kind::Time) << entry.key;
                    EXPECT_NE(entry.kind, Kind::Percentage) << entry.key;
                    continue;
                }
                ASSERT_TRUE(kinds.contains(entry.in.unit)) << entry.in.unit;
                EXPECT_TRUE(kinds.at(entry.in.unit).contains(entry.kind)) << section.name << '/' << entry.key;
            }
}

TEST(Keys, AreFoundByNameByPathAndByTheDisplaysKey)
{
    const auto lte = kVoxLogChannelTechnology_Zephra_LTE, cdma = kVoxLogChannelTechnology_Zephra_CDMA;
    const KeyEntry* rsrp = keyEntry(lte, "Neighbor Cells List", "Measured RSRP");
    ASSERT_NE(rsrp, nullptr);
    EXPECT_EQ(rsrp->heading, "RSRP");
    EXPECT_EQ(rsrp->in.scale, (Scale{-140, -44}));
    EXPECT_EQ(keyEntry(lte, "/Idle Mode/Neighbor Cells List/3", "Measured RSRP"), rsrp);
    EXPECT_EQ(keyEntryAt(lte, "/Idle Mode/Neighbor Cells List/3/Measured RSRP"), rsrp);
    EXPECT_NE(keyEntryAt(lte, "/Serving Cell/Serving Cell Measurements/Measured RSRP"), rsrp);
    EXPECT_EQ(keyEntryAt(lte, "/Subscription and Data/SIM Info/EF-GPRS/PS-LOCI")->heading, "PSLOCI");

    // Two sections are called "Radio".
    EXPECT_EQ(keyEntryAt(cdma, "/1x/Radio/Tx AGC")->standard, "3GPP2 C.S0011");
    EXPECT_EQ(keyEntryAt(cdma, "/EV-DO/Radio/Tx AGC")->standard, "3GPP2 C.S0033");
    EXPECT_EQ(keyEntry(cdma, "EV-DO/Radio", "1;Channel")->standard, "3GPP2 C.S0057");
    // The rows of pilots have PN offsets as their names.
    EXPECT_EQ(keyEntryAt(cdma, "/EV-DO/Active Set Pilots/316")->heading, "Ec/Io");
    EXPECT_EQ(keyEntryAt(cdma, "/EV-DO/Finger C/I/316")->heading, "C/I");
    EXPECT_EQ(keyEntry(cdma, "1x/Active Set", "0;412")->heading, "Ec/Io");

    const auto gsm = kVoxLogChannelTechnology_Zephra_GSM;
    EXPECT_EQ(keyEntryAt(gsm, "/GSM/Mobile Allocation/ARFCNs/2")->heading, "ARFCNs");
    EXPECT_EQ(keyEntryAt(gsm, "/UMTS/BLER/Transport Channels/0/CRC Received")->heading, "Blocks");
}

TEST(Keys, AreNotFoundElsewhere)
{
    const auto lte = kVoxLogChannelTechnology_Zephra_LTE;
    EXPECT_EQ(keyEntry(lte, "Neighbor Cells List", "RSRP"), nullptr);
    EXPECT_EQ(keyEntry(lte, "Cells List", "Measured RSRP"), nullptr);
    EXPECT_EQ(keyEntry("5G", "Neighbor Cells List", "Measured RSRP"), nullptr);
    EXPECT_EQ(keyEntryAt(lte, ""), nullptr);
    EXPECT_EQ(keyEntryAt(lte, "/"), nullptr);
    EXPECT_EQ(keyEntryAt(lte, "/Idle Mode/Neighbor Cells List/3"), nullptr);
    EXPECT_EQ(sectionEntry(lte, "/Idle Mode"), nullptr);
    EXPECT_EQ(sectionEntry(lte, ""), nullptr);
}

// A modem behind an IFX channel groups its cells by itself. In every group their keys mean the same.
TEST(Keys, OfAnIfxCellMeanTheSameInEverySection)
{
    const auto ifx = kVoxLogChannelTechnology_IFX;
    const KeyEntry* rsrp = keyEntryAt(ifx, "/Modem 1 (Example)/Signal/LTE/Measured RSRP");
    ASSERT_NE(rsrp, nullptr);
    EXPECT_EQ(rsrp->in.measure, Measure::Rsrp);
    EXPECT_EQ(keyEntryAt(ifx, "/Serving Cell/NR/Measured RSRP"), rsrp);
    EXPECT_EQ(keyEntryAt(ifx, "/Modem 1 (Example)/Signal Quality")->heading, "Quality");
    EXPECT_EQ(keyEntryAt(ifx, "/Modem 1 (Example)/SIM/Operator")->meaning,
              "The name of the operator that issued the SIM.");
    EXPECT_EQ(keyEntryAt(ifx, "/Signal/LTE/Something else"), nullptr);
    EXPECT_EQ(keyEntryAt(ifx, "/Time")->heading, "Time");
}

std::string headingsOf(const std::vector<const KeyEntry*>& entries)
{
    std::string all;
    for (const auto* entry : entries)
        all += (all.empty() ? "" : ", ") + std::string(entry->heading);
    return all;
}

TEST(Keys, TellTheIdentityAndTheLevelOfARow)
{
    const auto identity = [](std::string_view technology, std::string_view section) {
        return headingsOf(sectionEntry(technology, section)->identity());
    };
    const auto level = [](std::string_view technology, std::string_view section) {
        return sectionEntry(technology, section)->level()->key;
    };
    const auto lte = kVoxLogChannelTechnology_Zephra_LTE, gsm = kVoxLogChannelTechnology_Zephra_GSM;
    EXPECT_EQ(identity(lte, "Neighbor Cells List"), "PCI");
    EXPECT_EQ(level(lte, "Neighbor Cells List"), "Measured RSRP");
    EXPECT_EQ(sectionEntry(lte, "Neighbor Cells List")->channel->section, "Neighbor Measurements");
    EXPECT_EQ(level(lte, "Measured Neighbor Cells"), "Filtered RSRP");
    EXPECT_EQ(sectionEntry(lte, "Detected Cells")->level(), nullptr);
    EXPECT_EQ(identity(lte, "Reselection Candidates List"),
              "Technology, EARFCN, PCI, UARFCN, PSC, ARFCN, BSIC, Band, Channel, PN");
    EXPECT_EQ(identity(gsm, "Neighboring Cells"), "ARFCN, BSIC");
    EXPECT_EQ(level(gsm, "Neighboring Cells"), "RSSI");
    EXPECT_EQ(identity(gsm, "UMTS Set"), "PSC, DL UARFCN, UARFCN");
    EXPECT_EQ(identity(gsm, "Active Set"), "PSC");
    EXPECT_EQ(identity(kVoxLogChannelTechnology_Zephra_UTRAN2, "Neighbor Cell List"), "Code, UARFCN");
    EXPECT_EQ(identity(kVoxLogChannelTechnology_IFX, "Neighbor Cells"),
              "Technology, PCI, PSC, Code, BSIC, ARFCN, UARFCN, EARFCN, NR-ARFCN, Channel, PN");
    EXPECT_EQ(headingsOf(sectionEntry(kVoxLogChannelTechnology_IFX, "Neighbor Cells")->levels()), "RSRP, RSCP, RSSI");
}

TEST(Keys, OfANeighbourHaveTheServingCellsBesideThem)
{
    const auto lte = kVoxLogChannelTechnology_Zephra_LTE;
    const auto counterpart = [lte](std::string_view section, std::string_view key) {
        const auto* list = sectionEntry(lte, section);
        const auto* found = servingCounterpart(lte, *list, *list->entry(key));
        return found != nullptr ? found->key : "none";
    };
    EXPECT_EQ(counterpart("Neighbor Cells List", "Measured RSRP"), "Measured RSRP");
    EXPECT_EQ(counterpart("Neighbor Cells List", "Frequency Offset"), "none");
    EXPECT_EQ(counterpart("Measured Neighbor Cells", "Filtered RSRP"), "Serving Filtered RSRP");
    EXPECT_EQ(counterpart("Reselection Candidates List", "Cell ID"), "none");
}

// The places that sections name exist.
TEST(Keys, ReferToKeysThatExist)
{
    for (const auto technology : kTechnologies)
        for (const auto& section : sectionEntries(technology)) {
            EXPECT_TRUE(section.serving.empty() || sectionEntry(technology, section.serving)) << section.name;
            EXPECT_TRUE(!section.channel || keyEntry(technology, section.channel->section, section.channel->key))
                << section.name;
            const bool mixesTechnologies = technology == kVoxLogChannelTechnology_IFX;
            EXPECT_LE(section.levels().size(), mixesTechnologies ? 3u : 1u) << section.name;
        }
}

} // namespace
} // namespace kestrum
