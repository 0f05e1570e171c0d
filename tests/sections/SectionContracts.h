#pragma once

#include "LogGenerator/ClassIndex.h"
#include "LogGenerator/ZPHLogGenerator2.h"
#include "doubles/DecodingDoubles.h"
#include "sections/RecordBuilder.h"

#include <algorithm>
#include <memory>
#include <ostream>
#include <set>
#include <stdexcept>
#include <string>
#include <vector>

namespace kestrum {

using Keys = std::set<std::string, std::less<>>;

/// A code of a section and the minimum length of its record, in bytes.
struct CodeContract {
    LogCode code;
    std::size_t minimumLength = 0; ///< 0: any length, or a property list follows the header
    bool shows = true;             ///< false where the record is only stored for later records
    bool reported = false;         ///< reported as unknown although it is shown
    bool countsFromOne = false;    ///< a count of 0 in the record means one element
};

/// The external behaviour of a section.
struct SectionContract {
    const char* className; ///< for the test's name
    const char* name;
    Value::Kind kind; ///< of its node: Dictionary or Array
    const char* traceLine;
    std::vector<CodeContract> codes;
    Keys keys = {};        ///< of the dictionary, or of the list's rows
    Keys elementKeys = {}; ///< of the rows of lists inside the dictionary
    bool reportsForeign = true;
    Priority tracePriority = Priority::Warning;
    bool logsContents = false;  ///< more lines of that priority than the trace line
    std::size_t bytesOfRow = 3; ///< of a list: a row takes at least as many in a record

    bool isList() const { return kind == Value::Kind::Array; }

    friend void PrintTo(const SectionContract& contract, std::ostream* out) { *out << contract.className; }
};

/// A technology: its sections in the order in which they are created, and the functions that create it.
struct TechnologyContract {
    const char* resource; ///< the name of its template
    std::unique_ptr<ClassIndex> (*makeIndex)(DecodingRoles&);
    std::unique_ptr<ZPHLogGenerator2> (*makeGenerator)(DecodingRoles&);
    std::size_t longestRecord; ///< of hostile records, in bytes
    std::vector<SectionContract> sections;

    template <typename Index, typename Generator>
    static TechnologyContract of(const char* resource, std::size_t longestRecord, std::vector<SectionContract> sections)
    {
        return {resource,
                [](DecodingRoles& roles) -> std::unique_ptr<ClassIndex> { return std::make_unique<Index>(roles); },
                [](DecodingRoles& roles) -> std::unique_ptr<ZPHLogGenerator2> { return Generator::generator(roles); },
                longestRecord, std::move(sections)};
    }
};

/// The technology under test. Each test program defines it.
const TechnologyContract& technology();

// The sections of the telephony service's records, which every technology has.
inline const SectionContract kSimInfo{
    .className = "SimInfo",
    .name = "SIM Info",
    .kind = Value::Kind::Dictionary,
    .traceLine = "SimInfo",
    .codes = {{0xFF0000}},
    .keys = {"EF-ICCID", "EF-MSISDN", "EF-3GPP MAIL BOX DIALING NUMBER", "EF-HPPLMN SEARCH PERIOD", "EF-LOCI",
             "EF-GPRS/PS-LOCI", "EF-ACCESS CONTROL CLASS", "EF-ADMINISTRATIVE DATA", "EF-FPLMN", "EF-ACTING HPLMN",
             "EF-RAT MODE", "EF-PLMN NETWORK NAME", "EF-OPERATOR PLMN LIST", "EF-OPLMNAcT"},
    .reportsForeign = false,
};
inline const SectionContract kPdpContextList{
    .className = "PDPContextList",
    .name = "PDP Context Info",
    .kind = Value::Kind::Array,
    .traceLine = "PDPContextList",
    .codes = {{0xFF0002}},
    .reportsForeign = false,
};

/// A section of the technology at its node, which already holds a value.
class SectionAtWork {
public:
    static constexpr const char* kLeftOver = "left over";

    explicit SectionAtWork(const SectionContract& contract)
        : node(nodeOf(contract.kind)), _index(technology().makeIndex(doubles.roles))
    {
        section = _index->getClass(contract.name);
        if (section == nullptr)
            throw std::logic_error(std::string("no such section: ") + contract.name);
        section->updateSectionRef(node);
        doubles.log.lines.clear();
    }

    /// A dictionary with an entry, or a list with such a row.
    static Value nodeOf(Value::Kind kind)
    {
        const Value row = makeDictionary({{kLeftOver, kLeftOver}});
        return kind == Value::Kind::Array ? Value(makeArray({row})) : row;
    }

    void receive(const RecordBuilder& record) { receive(record.bytes(), record.code()); }
    void receive(Bytes bytes, LogCode code) { section->updateWithData(Record(bytes), code); }

    std::string text() const { return describe(node); }
    bool isUntouched() const { return node == nodeOf(node.kind()); }

    DecodingDoubles doubles;
    Value node;
    Base* section = nullptr;

private:
    std::unique_ptr<ClassIndex> _index;
};

/// Whether a node has the section's shape, and only the section's keys and the key that was there before.
inline bool keepsTo(const SectionContract& contract, const Value& node)
{
    const auto isRow = [](const Value& row, const Keys& keys) {
        return row.dictionary() && std::ranges::all_of(*row.dictionary(), [&](const Dictionary::Entry& entry) {
                   return entry.key == SectionAtWork::kLeftOver || keys.contains(entry.key);
               });
    };
    if (node.kind() != contract.kind)
        return false;
    if (const auto list = node.array())
        return std::ranges::all_of(*list, [&](const Value& row) { return isRow(row, contract.keys); });
    return isRow(node, contract.keys) && std::ranges::all_of(*node.dictionary(), [&](const Dictionary::Entry& entry) {
               const auto list = entry.value.array();
               return !entry.value.dictionary() && (!list || std::ranges::all_of(*list, [&](const Value& element) {
                   return element.isText() || isRow(element, contract.elementKeys);
               }));
           });
}

} // namespace kestrum
