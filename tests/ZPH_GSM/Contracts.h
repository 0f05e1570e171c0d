#pragma once

#include "LogGenerator/ZPH_GSM/ZPH_GSMClassIndex.h"
#include "doubles/DecodingDoubles.h"
#include "doubles/RecordBuilder.h"

#include <algorithm>
#include <ostream>
#include <stdexcept>
#include <string>
#include <vector>

namespace kestrum {

/// A code of a section and the minimum length of its record; 0 where a property list follows the header.
struct CodeContract {
    LogCode code;
    std::size_t minimumLength;
};

/// The external behaviour of a section.
struct SectionContract {
    const char* className; ///< for the test's name
    const char* name;
    bool isList;
    const char* traceWord;
    std::vector<CodeContract> codes;
    std::vector<std::string> keys; ///< of the dictionary, and of all rows
    bool reportsForeign = true;

    friend void PrintTo(const SectionContract& contract, std::ostream* out) { *out << contract.className; }
};

inline const std::vector<std::string> kSimKeys = {
    "EF-ICCID",
    "EF-MSISDN",
    "EF-3GPP MAIL BOX DIALING NUMBER",
    "EF-HPPLMN SEARCH PERIOD",
    "EF-LOCI",
    "EF-GPRS/PS-LOCI",
    "EF-ACCESS CONTROL CLASS",
    "EF-ADMINISTRATIVE DATA",
    "EF-FPLMN",
    "EF-ACTING HPLMN",
    "EF-RAT MODE",
    "EF-PLMN NETWORK NAME",
    "EF-OPERATOR PLMN LIST",
    "EF-OPLMNAcT",
};

// In the order in which the sections are created.
// clang-format off
inline const std::vector<SectionContract> kContracts = {
    {"ActiveSet", "Active Set", true, "ActiveSet", {{0x417A, 16}}, {"Scrambling Code", "RSCP", "Energy Per Chip"}},
    {"CodingScheme", "Coding Scheme", false, "CellChangeCounters", {}, {}, false},
    {"GPRSInformation", "GPRS Information", false, "GPRSInformation",
     {{0x51F5, 18}, {0x7135, 32}, {0x51F6, 24}, {0x51FB, 34}, {0x51FD, 35}, {0x51F4, 15}, {0x5137, 29}},
     {"SI13 Position", "Network Control Order", "PFC Supported", "Priority Access Threshold", "T3192",
      "Access Burst Type", "DRX Timer Max", "PBCCH Present", "Ext Measurement Order", "Packet PSI Status",
      "Packet SI Status", "Count LR", "Count HR", "Network Operating Mode", "Cell Reselect Hysteresis"}},
    {"GSMServingCell", "GSM Serving Cell", false, "GSMServingCell",
     {{0x5134, 26}, {0x5137, 29}, {0x5076, 17}, {0xFF0001, 0}},
     {"Cell ID", "ARFCN", "BSIC", "RSSI", "C1 Value", "C2 Value", "MA Dedicated ARFCN"}},
    {"MobileAllocation", "Mobile Allocation", false, "MobileAllocation", {{0x51F8, 15}}, {"HSN", "ARFCNs"}},
    {"NeighboringCells", "Neighboring Cells", true, "NeighboringCells",
     {{0x5137, 29}, {0x51FF, 15}, {0xFF0001, 0}}, {"ARFCN", "RSSI", "C1 Value", "BSIC"}},
    {"PDPContextList", "PDP Context Info", true, "PDPContextList", {{0xFF0002, 0}}, {}, false},
    {"ProcessPS", "Process PS", false, "ProcessPS", {{0x7130, 16}, {0x7132, 16}},
     {"MM State", "MM Sub State", "Attach Reject Cause", "MM Service State"}},
    {"UMTSRRMeasurement", "UMTS RR Measurement", false, "UMTSRRMeasurement", {}, {}, false},
    {"CellChangeCounters", "Cell Change Counters", false, "CellChangeCounters", {}, {}, false},
    {"DetectedSet", "Detected Set", true, "DetectedSet", {{0x417A, 16}}, {}},
    {"GSMSet", "GSM Set", true, "GSMSet", {{0x4005, 15}}, {"ARFCN", "BSIC", "RSSI", "Ranking Value"}},
    {"NonRankedGSMSet", "Non-Ranked GSM Set", true, "NonRankedGSMSet", {}, {}, false},
    {"ProcessCO", "Process CO", false, "ProcessCS", {{0x7131, 16}, {0x7132, 16}}, {"MM State", "MM Service State"}},
    {"ServingPLMN", "Serving PLMN", false, "Serving PLMN", {{0x7135, 32}, {0x7132, 16}, {0xFF0001, 0}},
     {"PLMN Sel Mod", "Mobile Country Code", "Mobile Network Code", "Location Area Code", "Routing Area Code",
      "Service Type"}},
    {"UMTSSet", "UMTS Set", true, "UMTSSet", {{0x4005, 15}, {0xFF0001, 0}},
     {"Scrambling Code", "RSCP", "Energy Per Chip", "Downlink Frequency", "Ranking Value", "Rank Cell RSCP",
      "UARFCN"}},
    {"EquivalentPLMNList", "Equivalent PLMN List", true, "Equivalent PLMN List", {{0x7150, 17}},
     {"Mobile Country Code", "Mobile Network Code"}},
    {"GSMRRInfo", "GSM RR Info", false, "GSMRRInfo", {{0x512C, 17}, {0x5137, 29}, {0x5072, 20}, {0x51F6, 24}},
     {"RR State", "RR Sub State", "RR Status", "RR Mode", "Serving Rx Level", "Rx Quality Full", "Rx Quality Sub",
      "DTX Used", "DRX Used"}},
    {"MonitoredSet", "Monitored Set", true, "MonitoredSet", {{0x417A, 16}}, {}},
    {"NonRankedUMTSSet", "Non-Ranked UMTS Set", true, "NonRankedUMTSSet", {}, {}, false},
    {"ProcessCS", "Process CS", false, "ProcessCS", {{0x7131, 16}, {0x7132, 16}},
     {"MM State", "MM Sub State", "LU Reject Cause", "MM Service State"}},
    {"UMTSRRInfo", "UMTS RR Info", false, "UMTSRRInfo",
     {{0x4125, 14}, {0x4031, 16}, {0x4127, 29}, {0x4157, 19}, {0xFF0001, 0}},
     {"RRC State", "Transmit Power", "Cell ID", "Downlink Frequency", "Uplink Frequency", "URA ID", "Ciphering",
      "UARFCN", "Scrambling Code"}},
    {"BLER", "BLER", false, "BLER", {{0x4116, 16}},
     {"Window Size", "Transport Channels", "Transport Channel ID", "CRC Received", "CRC Received in Error"}},
    {"VirtualActiveSet", "Virtual Active Set", true, "VirtualActiveSet", {{0x417A, 16}}, {}},
    {"SimInfo", "SIM Info", false, "SimInfo", {{0xFF0000, 0}}, kSimKeys, false},
    {"HSDPAInformation", "HSDPA Info", false, "HSDPA Info", {{0x4221, 18}},
     {"Version", "Sub Frames", "Carrier Info", "Primary HARQ Process", "Secondary HARQ Process", "Process ID",
      "No Rx Bits", "New Tx", "Block Errors"},
     false},
};
// clang-format on

/// A section of the index at its node, which already holds a value.
class SectionAtWork {
public:
    static constexpr const char* kLeftOver = "left over";

    explicit SectionAtWork(const SectionContract& contract) : node(nodeOf(contract)), _index(doubles.roles)
    {
        section = _index.getClass(contract.name);
        if (section == nullptr)
            throw std::logic_error(std::string("no such section: ") + contract.name);
        section->updateSectionRef(node);
        doubles.log.lines.clear();
    }

    void receive(const RecordBuilder& record) { receive(record.bytes(), record.code()); }
    void receive(Bytes bytes, LogCode code) { section->updateWithData(Record(bytes), code); }

    std::string text() const { return describe(node); }
    bool isUntouched() const
    {
        const auto list = node.array();
        return list ? list->size() == 1 && (*list)[0] == Value(kLeftOver)
                    : node.dictionary()->size() == 1 && node.dictionary()->at(kLeftOver) == Value(kLeftOver);
    }

    DecodingDoubles doubles;
    Value node;
    Base* section = nullptr;

private:
    static Value nodeOf(const SectionContract& contract)
    {
        if (contract.isList)
            return makeArray({Value(kLeftOver)});
        return makeDictionary({{kLeftOver, kLeftOver}});
    }

    ZPH_GSMClassIndex _index;
};

/// Whether a node and all rows inside it have only these keys and the key that was there before.
inline bool hasOnlyKeys(const Value& value, const std::vector<std::string>& keys)
{
    if (const auto list = value.array())
        return std::ranges::all_of(*list, [&](const Value& each) { return hasOnlyKeys(each, keys); });
    if (const auto dictionary = value.dictionary())
        return std::ranges::all_of(*dictionary, [&](const Dictionary::Entry& entry) {
            return (entry.key == SectionAtWork::kLeftOver || std::ranges::count(keys, entry.key) == 1) &&
                   hasOnlyKeys(entry.value, keys);
        });
    return true;
}

} // namespace kestrum
