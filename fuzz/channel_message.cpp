// Channel messages of every technology, through its real generator, template and property lists. The first byte
// chooses the technology. Messages follow, each after its length (16 bits, little-endian); a length of 0 is a
// refresh.
//
// Equal bytes give equal displays and logs. A display has only keys of its template and of its sections' rows. The
// interval's raw messages are kept unchanged. The history keeps at most five entries.
#include "FuzzedRoles.h"
#include "LogGenerator/Failures.h"
#include "LogGenerator/LogGenerator.h"
#include "LogGenerator/ZPH_GSM/SimInfo.h"
#include "Require.h"
#include "core/KestrumModelNode.h"
#include "harness/Places.h"
#include "platform/TelephonyService.h"
#include "platform/propertylist/PropertyListCodec.h"
#include "support/Record.h"

#include <algorithm>
#include <cctype>
#include <cstdint>
#include <optional>
#include <set>
#include <string>
#include <vector>

namespace kestrum::fuzz {
namespace {

struct Technology {
    std::string_view identifier;
    std::string_view templateName;                       ///< empty: its messages carry the whole display
    bool keepsAll = false;                               ///< every message is added to the interval's raw bytes
    std::set<std::string, std::less<>> rowKeys = {};     ///< of the rows of list sections
    bool (*isListedKey)(std::string_view key) = nullptr; ///< for keys that a decoder lists at a fixed place
};

/// "_sorted", or an index and an offset as in "0;PN".
bool isPilotKey(std::string_view key)
{
    const auto semicolon = key.find(';');
    const auto isNumber = [](std::string_view text) { return !text.empty() && std::ranges::all_of(text, ::isdigit); };
    return key == "_sorted" || (semicolon != std::string_view::npos && isNumber(key.substr(0, semicolon)) &&
                                isNumber(key.substr(semicolon + 1)));
}

// clang-format off
const Technology kTechnologies[] = {
    {kVoxLogChannelTechnology_IFX, ""},
    {kVoxLogChannelTechnology_Zephra_GSM, "ZPH_GSM", true,
     {"ARFCN", "BSIC", "RSSI", "C1 Value", "Scrambling Code", "RSCP", "Energy Per Chip", "Ranking Value",
      "Downlink Frequency", "Rank Cell RSCP", "UARFCN", "Mobile Country Code", "Mobile Network Code",
      "Transport Channel ID", "CRC Received", "CRC Received in Error", "Process ID", "No Rx Bits", "New Tx",
      "Block Errors"}},
    {kVoxLogChannelTechnology_Zephra_CDMA, "C2KTemplate", false, {}, isPilotKey},
    {kVoxLogChannelTechnology_Zephra_LTE, "LTE", true,
     {"Physical Cell ID", "Filtered RSRP", "Filtered RSRQ", "Measured RSSI", "Measured RSRP", "Average RSRP",
      "Measured RSRQ", "Average RSRQ", "Srxlev", "Frequency Offset", "Ant 0 Frame Offset", "Ant 0 Sample Offset",
      "Ant 1 Frame Offset", "Ant 1 Sample Offset", "Candidate Priority", "Candidate RAT Type", "E ARFCN", "Cell ID",
      "U ARFCN", "PSC", "ARFCN", "Band", "BSIC ID", "Channel", "Pilot"}},
    {kVoxLogChannelTechnology_Zephra_UTRAN2, "UTRAN", true,
     {"UARFCN", "Cell ID", "Filter RSCP", "Status", "inJDCS", "TRCH ID", "TRCH BLER Measurement", "CCTRCH ID", "TSNUM",
      "SIR"}},
};
// clang-format on

std::string pathOf(std::string_view templateName)
{
    return inCheckout("resources/").append(templateName).append(".plist");
}

PropertyListCodec kCodec;

/// One generator from its start.
class Run : public FuzzedRoles {
public:
    Run(const Technology& technology, const Value& loadedTemplate) : _technology(technology)
    {
        bundle.paths = {pathOf(technology.templateName)};
        if (loadedTemplate)
            state.set("Template", loadedTemplate); // loaded before: this target does not test the loading of templates
        _generator = LogGenerator::generatorFromTechnology(Value(technology.identifier), roles);
        require(_generator != nullptr, "no generator for the technology");
    }

    void receive(Bytes message)
    {
        // The only exceptions that a decoder may throw.
        try {
            _generator->updateState(state, message);
        } catch (const LogCode_0xFF0000::UnknownDataException& failure) {
            log.lines.emplace_back(Priority::Error, failure.what());
        } catch (const AssertionFailure& failure) {
            log.lines.emplace_back(Priority::Error, failure.description());
        }
        _interval.insert(_interval.end(), message.begin(), message.end());
    }

    void refresh()
    {
        const Value display = _generator->generateLogUsingState(state);
        require(display.isNull() || display == state.at("Display"), "a refresh shows something else");
        checkHistory();
        if (_technology.keepsAll)
            require(state.at("DisplayState").data() != nullptr &&
                        std::ranges::equal(state.at("DisplayState").data()->bytes(), _interval),
                    "the interval's raw messages are not as they came");
        _interval.clear();

        PathDictionary paths;
        const auto tree = KestrumModelNode::makeTreeFromObject(state.at("Display"), paths);
        require(tree != nullptr && paths.find(kRootPath) == tree, "no tree");
        const auto contents = _generator->getSaveContentsFromState(state);
        require(contents && contents->size() >= state.at("History").array()->size(), "the history cannot be saved");
    }

    State state;

private:
    void checkHistory() const
    {
        const auto history = state.at("History").array();
        require(history && !history->empty() && history->size() <= 5, "the history holds no entry, or more than five");
        for (const auto& entry : *history)
            require(entry.dictionary() != nullptr, "a history entry is no dictionary");
    }

    const Technology& _technology;
    std::unique_ptr<LogGenerator> _generator;
    std::vector<std::byte> _interval;
};

/// Whether the rows of a list have known keys, and hold only texts or lists of such rows.
bool isListing(const Technology& technology, const Value& value)
{
    if (const auto dictionary = value.dictionary())
        return std::ranges::all_of(*dictionary, [&](const Dictionary::Entry& entry) {
            const bool known = technology.rowKeys.contains(entry.key) ||
                               (technology.isListedKey != nullptr && technology.isListedKey(entry.key));
            return known && isListing(technology, entry.value);
        });
    if (const auto array = value.array())
        return std::ranges::all_of(*array, [&](const Value& each) { return isListing(technology, each); });
    return value.isText();
}

/// Whether the display has only keys of the template beside it and of the rows listed inside it.
bool hasShapeOf(const Technology& technology, const Value& templateNode, const Value& display)
{
    const auto expected = templateNode.dictionary(), shown = display.dictionary();
    if (!expected || !shown)
        return isListing(technology, display);
    return std::ranges::all_of(*shown, [&](const Dictionary::Entry& entry) {
        // The telephony service defines the keys of these rows.
        const bool isService = entry.key == "PDP Context Info" && entry.value.array();
        return expected->contains(entry.key) &&
               (isService || hasShapeOf(technology, expected->at(entry.key), entry.value));
    });
}

/// The template of each technology, loaded once.
Value loadedTemplate(std::size_t technology)
{
    static const auto templates = [] {
        std::vector<Value> all;
        for (const auto& each : kTechnologies) {
            all.push_back(each.templateName.empty() ? Value() : kCodec.load(pathOf(each.templateName)));
            require(each.templateName.empty() || all.back().dictionary(), "a template cannot be read");
        }
        return all;
    }();
    return templates[technology];
}

void decode(Bytes input)
{
    const Record record(input);
    const auto chosen = record.read(u8(0)).value_or(0) % std::size(kTechnologies);
    const Technology& technology = kTechnologies[chosen];
    const Value templateNode = loadedTemplate(chosen);
    const std::string templateBefore = describe(templateNode);

    Run once(technology, templateNode), again(technology, templateNode);
    constexpr int kMostRefreshes = 12; // twice the length of the history; inputs from a fuzzer contain many zeros
    int refreshes = 0;
    for (std::size_t at = 1; at < input.size();) {
        const auto length = record.from(at)->read(u16(0));
        at += 2;
        if (!length)
            break;
        if (*length == 0) {
            if (refreshes++ < kMostRefreshes) {
                once.refresh();
                again.refresh();
            }
            continue;
        }
        const Bytes message = input.subspan(at, std::min<std::size_t>(*length, input.size() - at));
        at += message.size();
        once.receive(message);
        again.receive(message);
    }
    once.refresh();
    again.refresh();

    require(describe(once.state.at("Display")) == describe(again.state.at("Display")), "equal bytes, other display");
    require(once.log.lines == again.log.lines, "equal bytes, other log");
    require(describe(templateNode) == templateBefore, "the template was changed");
    if (const Value display = once.state.at("Display"); templateNode && display)
        require(hasShapeOf(technology, templateNode, display), "a key that is not in the template");
}

} // namespace
} // namespace kestrum::fuzz

extern "C" int LLVMFuzzerTestOneInput(const std::uint8_t* data, std::size_t size)
{
    kestrum::fuzz::decode(std::as_bytes(std::span(data, size)));
    return 0;
}
