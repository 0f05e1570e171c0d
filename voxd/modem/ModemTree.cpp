#include "voxd/modem/ModemTree.h"

#include "support/Format.h"
#include "support/Utf8.h"

#include <algorithm>
#include <cmath>
#include <concepts>
#include <map>
#include <ranges>
#include <span>
#include <string_view>
#include <tuple>
#include <utility>

namespace kestrum {
namespace {

constexpr std::size_t kLongestText = 128; // characters
constexpr std::size_t kMostModems = 16;
constexpr std::size_t kMostNeighbors = 64;
constexpr std::size_t kMostServingCells = 16;
constexpr std::size_t kMostBearers = 16;
constexpr double kLevelLimit = 1000; // dBm or dB; ModemManager's libraries write -1.8e308 for "unknown"
constexpr std::string_view kHelp = "see voxd(1)";

// Texts. Each gives a null value for what is not known.

bool isShown(char32_t character)
{
    const auto isWithin = [character](char32_t first, char32_t last) {
        return character >= first && character <= last;
    };
    return character >= ' ' && !isWithin(0x7F, 0x9F)                                              // control characters
           && !isWithin(0x200E, 0x200F) && !isWithin(0x2028, 0x202E) && !isWithin(0x2066, 0x2069) // writing direction
           && !isWithin(0xFFFE, 0xFFFF);
}

/// One line of at most `kLongestText` characters, without blanks at its ends.
std::string cleaned(std::string_view text)
{
    constexpr std::string_view kBlanks = " \t\r\n";
    text.remove_prefix(std::min(text.find_first_not_of(kBlanks), text.size()));
    text = text.substr(0, text.find_last_not_of(kBlanks) + 1);
    std::string line;
    std::size_t count = 0;
    for (std::size_t at = 0; at < text.size();) {
        if (count++ == kLongestText)
            return line + "\u2026";
        if (kBlanks.find(text[at]) != std::string_view::npos) {
            line += ' ';
            ++at;
            continue;
        }
        const auto character = nextCharacter(text, at);
        appendUtf8(line, character && isShown(*character) ? *character : U'\uFFFD');
    }
    return line;
}

Value word(std::string text)
{
    return text.empty() ? Value() : Value(std::move(text));
}

Value line(std::string_view text)
{
    return word(cleaned(text));
}

bool isDigits(std::string_view text)
{
    return std::ranges::all_of(text, [](char c) { return c >= '0' && c <= '9'; });
}

/// An identity. Unless identities are shown, only the first `open` digits are: they name a network, an issuer or a
/// type of device, and all after them a person or a device.
Value identity(std::string_view text, std::size_t open, bool isFull)
{
    constexpr std::string_view kMask = "********"; // always eight: the length is hidden too
    if (isFull || text.empty())
        return line(text);
    const bool hasOpenPart = text.size() > open + 3 && isDigits(text.substr(0, open));
    return std::string(hasOpenPart ? text.substr(0, open) : std::string_view()).append(kMask);
}

template <std::unsigned_integral Number>
Value number(std::optional<Number> value)
{
    return value ? Value(std::to_string(*value)) : Value();
}

Value measured(std::optional<double> value, std::string_view unit)
{
    return value && std::fabs(*value) < kLevelLimit ? Value(formatted("%4.2f %s", *value, unit)) : Value();
}

Value dbm(std::optional<double> value)
{
    return measured(value, "dBm");
}

Value db(std::optional<double> value)
{
    return measured(value, "dB");
}

Value percent(std::optional<double> value)
{
    return value && *value >= 0 && *value <= 100 ? measured(value, "%") : Value();
}

/// The name of an enumeration's value; the number where a later version of the daemon has one more.
template <typename Enumeration>
std::string nameOf(Enumeration value, std::span<const std::string_view> names)
{
    const auto index = static_cast<std::uint32_t>(value);
    return index < names.size() ? std::string(names[index]) : formatted("unknown (%u)", index);
}

/// Rows in the order in which they are added; their keys are "nn;Name".
class Group {
public:
    /// A null value adds nothing.
    void add(std::string_view name, Value value)
    {
        if (value.isNull())
            return;
        std::string key = formatted("%02u;", _count++);
        for (const char c : name)
            key += c == ';' ? ',' : c; // a key with two semicolons would be shown with its number
        _rows->set(key, std::move(value));
    }
    void add(std::string_view name, const Group& group) { add(name, group.value()); }

    bool empty() const { return _count == 0; }
    /// Null without rows. "_sorted" also keeps a display from replacing a group of one row by that row.
    Value value() const { return empty() ? Value() : Value(_rows); }
    const DictionaryRef& rows() const { return _rows; }

private:
    DictionaryRef _rows = makeDictionary({{kSortedKey, kSortedKey}});
    unsigned _count = 0;
};

/// The first `most` of `all` as rows, and a row that says how many more there are.
template <typename Element, typename ToRow>
Value list(const std::vector<Element>& all, std::size_t most, std::string_view more, const ToRow& toRow)
{
    std::vector<Value> rows{Value(std::to_string(all.size()))}; // displays leave out the first element
    for (const auto& each : all | std::views::take(most)) {
        const Group row = toRow(each);
        rows.push_back(row.empty() ? Value("Nothing is known") : row.value());
    }
    if (all.size() > most)
        rows.push_back(Value(formatted("%lu more %s", all.size() - most, more)));
    return makeArray(std::move(rows));
}

// Words of states.

std::string lockName(ModemLock lock)
{
    static constexpr std::string_view kNames[] = {
        "Unknown",
        "None",
        "SIM PIN",
        "SIM PIN2",
        "SIM PUK",
        "SIM PUK2",
        "service provider PIN",
        "service provider PUK",
        "network PIN",
        "network PUK",
        "PIN of the phone for this SIM",
        "corporate PIN",
        "corporate PUK",
        "PIN of the phone for its first SIM",
        "PUK of the phone for its first SIM",
        "network subset PIN",
        "network subset PUK",
    };
    return nameOf(lock, kNames);
}

std::string failureName(ModemFailure failure)
{
    static constexpr std::string_view kNames[] = {
        "unknown reason", "unknown reason", "no SIM", "SIM error", "unknown capabilities", "eSIM without a profile",
    };
    return nameOf(failure, kNames);
}

std::string registrationName(ModemRegistration registration)
{
    static constexpr std::string_view kNames[] = {
        "Not registered, not searching",
        "Registered, home",
        "Searching",
        "Denied",
        "Unknown",
        "Registered, roaming",
        "Registered, home, SMS only",
        "Registered, roaming, SMS only",
        "Emergency calls only",
        "Registered, home, calls in LTE not preferred",
        "Registered, roaming, calls in LTE not preferred",
        "Attached to restricted local services",
    };
    return nameOf(registration, kNames);
}

std::string packetServiceName(PacketService service)
{
    static constexpr std::string_view kNames[] = {"Unknown", "Detached", "Attached"};
    return nameOf(service, kNames);
}

constexpr std::uint32_t kAnyTechnology = UINT32_MAX; // MM_MODEM_ACCESS_TECHNOLOGY_ANY: says nothing

constexpr std::uint32_t maskOf(std::initializer_list<AccessTechnology> technologies)
{
    std::uint32_t mask = 0;
    for (const auto each : technologies)
        mask |= static_cast<std::uint32_t>(each);
    return mask;
}

bool isNonStandalone(std::uint32_t technologies)
{
    constexpr std::uint32_t kBoth = maskOf({AccessTechnology::Lte, AccessTechnology::Nr});
    return technologies != kAnyTechnology && (technologies & kBoth) == kBoth;
}

/// Empty when unknown.
std::string accessName(std::uint32_t technologies)
{
    static constexpr std::string_view kNames[] = {
        "POTS",  "GSM",   "GSM Compact",  "GPRS",         "EDGE",         "UMTS", "HSDPA", "HSUPA",     "HSPA",
        "HSPA+", "1xRTT", "EV-DO Rev. 0", "EV-DO Rev. A", "EV-DO Rev. B", "LTE",  "5G NR", "LTE Cat M", "NB-IoT",
    };
    if (technologies == kAnyTechnology)
        return {};
    std::string names;
    const auto append = [&names](std::string_view name) { names.append(names.empty() ? "" : ", ").append(name); };
    if (isNonStandalone(technologies)) {
        append("5G NSA (LTE and NR)");
        technologies &= ~maskOf({AccessTechnology::Lte, AccessTechnology::Nr});
    }
    for (std::size_t bit = std::size(kNames); bit-- > 0;)
        if ((technologies >> bit & 1U) != 0)
            append(kNames[bit]);
    if (const std::uint32_t others = technologies >> std::size(kNames) << std::size(kNames); others != 0)
        append(formatted("unknown (0x%x)", others));
    return names;
}

std::string phaseName(const ModemState& modem)
{
    static constexpr std::string_view kNames[] = {
        "Unknown", "Starting",  "Locked",     "Disabled",      "Being disabled", "Being enabled",
        "Enabled", "Searching", "Registered", "Disconnecting", "Connecting",     "Connected",
    };
    return modem.phase == ModemPhase::Failed ? "Failed" : nameOf(modem.phase, kNames);
}

/// What the modem does, in one line, and what to do if that is in the way.
std::string statusOf(const ModemState& modem)
{
    switch (modem.phase) {
    case ModemPhase::Failed:
        return formatted("Failed: %s; %s", failureName(modem.failure), kHelp);
    case ModemPhase::Locked:
        if (modem.lock == ModemLock::Unknown || modem.lock == ModemLock::None)
            return formatted("Locked; %s", kHelp);
        return formatted("Locked: needs the %s; %s", lockName(modem.lock), kHelp);
    case ModemPhase::Disabled:
        return formatted("Disabled; %s", kHelp);
    case ModemPhase::Searching:
        return "Searching for a network";
    case ModemPhase::Enabled:
        return modem.registration == ModemRegistration::Denied ? "Enabled; the network denies registration"
                                                               : "Enabled, not registered";
    case ModemPhase::Registered:
    case ModemPhase::Disconnecting:
    case ModemPhase::Connecting:
    case ModemPhase::Connected: {
        const std::string access = accessName(modem.accessTechnologies);
        return phaseName(modem).append(access.empty() ? "" : ", ").append(access);
    }
    default:
        return phaseName(modem);
    }
}

/// The daemon's state, where it has no modem to show.
std::string statusOf(const ModemStates& states, const ModemTreeSetting& setting)
{
    switch (states.daemon) {
    case ModemDaemon::NoBus:
        return formatted("No system bus; %s", kHelp);
    case ModemDaemon::Absent:
        return formatted("ModemManager is not running; %s", kHelp);
    case ModemDaemon::Silent:
        return "Waiting for ModemManager";
    case ModemDaemon::NotPermitted:
        return formatted("ModemManager: not permitted; %s", kHelp);
    case ModemDaemon::Present:
        break;
    }
    if (setting.wanted.empty())
        return "No modem";
    const std::string missing = formatted("Modem %s is not there", cleaned(setting.wanted));
    return states.otherModems == 0 ? missing : formatted("%s; other modems: %u", missing, states.otherModems);
}

// Refusals.

std::string_view nameOf(ModemService service)
{
    switch (service) {
    case ModemService::Signal:
        return "Signal";
    case ModemService::Location:
        return "Location";
    case ModemService::CellInformation:
        return "Cell Info";
    case ModemService::Sim:
        return "SIM";
    case ModemService::Data:
        return "Data";
    }
    return "Service";
}

std::string reasonOf(const ModemRefusal& refusal)
{
    switch (refusal.reason) {
    case RefusalReason::NotPermitted:
        return formatted("not permitted; %s", kHelp);
    case RefusalReason::NotSupported:
        return formatted("not supported by this modem; %s", kHelp);
    case RefusalReason::NoAnswer:
        return formatted("no answer; %s", kHelp);
    case RefusalReason::Failed:
        break;
    }
    const std::string text = cleaned(refusal.text);
    return text.empty() ? formatted("failed; %s", kHelp) : formatted("failed: %s; %s", text, kHelp);
}

/// What a service gives, and its refusal. There can be both: another program may have set the service up.
void addService(Group& groups, const ModemState& modem, ModemService service, const Value& shown = {})
{
    const std::string name(nameOf(service));
    groups.add(name, shown);
    if (const auto refusal = std::ranges::find(modem.refusals, service, &ModemRefusal::service);
        refusal != modem.refusals.end())
        groups.add(shown ? name + " (refused)" : name, reasonOf(*refusal));
}

// Networks and cells.

/// MCC and MNC, from one text such as "00101" (3GPP TS 23.003); as it is when it is something else.
void addNetwork(Group& group, std::string_view code)
{
    constexpr std::size_t kCountryDigits = 3;
    if ((code.size() != kCountryDigits + 2 && code.size() != kCountryDigits + 3) || !isDigits(code))
        return group.add("Operator Code", line(code));
    group.add("Mobile Country Code", code.substr(0, kCountryDigits));
    group.add("Mobile Network Code", code.substr(kCountryDigits));
}

struct CellNames {
    std::string_view technology, channel, identity, rssi;
};

const CellNames& namesOf(CellType type)
{
    static constexpr CellNames kNames[] = {
        {"", "Channel", "Cell ID", "RSSI"},          {"CDMA", "Channel", "Cell ID", "RSSI"},
        {"GSM", "ARFCN", "Cell ID", "RSSI"},         {"UMTS", "UARFCN", "Cell ID", "RSSI"},
        {"TD-SCDMA", "UARFCN", "Cell ID", "RSSI"},   {"LTE", "E-ARFCN", "Cell Identity", "Measured RSSI"},
        {"NR", "NR-ARFCN", "Cell Identity", "RSSI"},
    };
    const auto index = static_cast<std::size_t>(type);
    return kNames[index < std::size(kNames) ? index : 0];
}

/// An area code of 0 or 0xFFFE means that there is none (3GPP TS 23.003).
std::optional<std::uint32_t> area(std::optional<std::uint32_t> code)
{
    return code && *code != 0 && *code != 0xFFFE ? code : std::nullopt;
}

void addLevels(Group& group, const SignalLevels& levels, CellType type)
{
    group.add("Measured RSRP", dbm(levels.rsrp));
    group.add("Measured RSRQ", db(levels.rsrq));
    group.add("RSCP", dbm(levels.rscp));
    group.add("Energy Per Chip", db(levels.ecio));
    group.add(namesOf(type).rssi, dbm(levels.rssi));
    group.add("SNR", db(levels.snr));
    group.add("Error Rate", percent(levels.errorRate));
}

/// Parts of a cell's identity. That of NR has none of a known length.
void addDerivedIdentity(Group& group, const ModemCell& cell)
{
    if (!cell.ci || *cell.ci >> 28 != 0) // 28 bits, 3GPP TS 36.413 and 25.413
        return;
    if (cell.type == CellType::Lte) {
        group.add("eNodeB (derived)", std::to_string(*cell.ci >> 8));
        group.add("Cell of eNodeB (derived)", std::to_string(*cell.ci & 0xFF));
    } else if (cell.type == CellType::Umts && *cell.ci >> 16 != 0)
        group.add("RNC (derived)", std::to_string(*cell.ci >> 16));
}

/// Levels first, then what tells the cell from its neighbours, then its identity.
void addCell(Group& group, const ModemCell& cell, const SignalLevels& levels)
{
    const CellNames& names = namesOf(cell.type);
    group.add("Technology", line(names.technology));
    addLevels(group, levels, cell.type);
    // RXLEV n: a level from n - 111 to n - 110 dBm (3GPP TS 45.008).
    group.add("RXLEV", number(cell.rxLevel));
    if (cell.rxLevel && *cell.rxLevel <= 63 && !levels.rssi)
        group.add("RSSI (derived)", dbm(*cell.rxLevel - 110.0));
    if (!levels.snr)
        group.add("SINR", db(cell.sinr));
    group.add("Path Loss", cell.pathLoss ? Value(formatted("%u dB", *cell.pathLoss)) : Value());
    group.add("Physical Cell ID", number(cell.physicalCell));
    group.add("Scrambling Code", number(cell.scramblingCode));
    group.add("Cell Parameter ID", number(cell.cellParameter));
    group.add("BSIC", number(cell.baseStation));
    group.add(names.channel, number(cell.channel));
    group.add("Timing Advance", number(cell.timingAdvance));
    group.add(names.identity, number(cell.ci));
    addDerivedIdentity(group, cell);
    group.add("Tracking Area Code", number(area(cell.tac)));
    group.add("Location Area Code", number(area(cell.lac)));
    group.add("System ID", number(cell.systemId));
    group.add("Network ID", number(cell.networkId));
    group.add("Base Station ID", number(cell.cdmaBaseStationId));
    group.add("Reference PN", number(cell.referencePn));
    group.add("Pilot Strength", number(cell.pilotStrength));
    addNetwork(group, cell.operatorCode);
}

/// The technology of the cell that the modem is registered on. With 5G NSA that is LTE.
CellType registeredType(std::uint32_t technologies)
{
    using enum AccessTechnology;
    static constexpr std::pair<std::uint32_t, CellType> kTypes[] = {
        {maskOf({Lte, LteCatM, LteNbIot}), CellType::Lte},
        {maskOf({Nr}), CellType::Nr},
        {maskOf({Umts, Hsdpa, Hsupa, Hspa, HspaPlus}), CellType::Umts},
        {maskOf({Gsm, GsmCompact, Gprs, Edge}), CellType::Gsm},
        {maskOf({OneXrtt, Evdo0, EvdoA, EvdoB}), CellType::Cdma},
    };
    if (technologies != kAnyTechnology)
        for (const auto& [mask, type] : kTypes)
            if ((technologies & mask) != 0)
                return type;
    return CellType::Unknown;
}

template <typename Number>
bool areEqual(std::optional<Number> left, std::optional<Number> right)
{
    return left && right && *left == *right;
}

template <typename Number>
bool differ(std::optional<Number> left, std::optional<Number> right)
{
    return left && right && *left != *right;
}

/// The code that tells apart the cells on one frequency.
std::optional<std::uint32_t> codeOf(const ModemCell& cell)
{
    for (const auto& code : {cell.physicalCell, cell.scramblingCode, cell.cellParameter, cell.baseStation})
        if (code)
            return code;
    return std::nullopt;
}

bool areSameCell(const ModemCell& left, const ModemCell& right)
{
    return left.type == right.type && !differ(left.ci, right.ci) &&
           (areEqual(left.ci, right.ci) ||
            (areEqual(left.channel, right.channel) && areEqual(codeOf(left), codeOf(right))));
}

/// Without what says "none". Where nothing is known the daemon gives a cell identity of 0, and no area.
ModemLocation knownPart(ModemLocation location)
{
    location.lac = area(location.lac);
    location.tac = area(location.tac);
    if (location.ci == 0U && !location.lac && !location.tac)
        location.ci.reset();
    return location;
}

/// Whether the modem has left the cell since GetCellInfo answered. The location is always newer.
bool isLeft(const ModemCell& cell, const ModemLocation& location)
{
    return differ(cell.ci, location.ci) || differ(area(cell.tac), location.tac) || differ(area(cell.lac), location.lac);
}

void locate(ModemCell& cell, const ModemLocation& location)
{
    if (location.ci)
        cell.ci = location.ci;
    if (location.tac)
        cell.tac = location.tac;
    if (location.lac)
        cell.lac = location.lac;
    if (!location.mcc.empty() && !location.mnc.empty())
        cell.operatorCode = location.mcc + location.mnc;
}

/// The cell that the modem is registered on, then the others that serve it. Values of two cells are never mixed.
std::vector<ModemCell> servingCells(const ModemState& modem)
{
    std::vector<ModemCell> cells;
    for (const auto& each : modem.cells)
        if (each.serving && cells.size() < kMostServingCells)
            cells.push_back(each);
    CellType registered = registeredType(modem.accessTechnologies);
    if (registered == CellType::Unknown && !cells.empty())
        registered = cells.front().type;
    std::ranges::stable_partition(cells, [registered](const ModemCell& each) { return each.type == registered; });

    const ModemLocation location = knownPart(modem.location.value_or(ModemLocation()));
    if (cells.empty() || cells.front().type != registered)
        cells.emplace(cells.begin());
    else if (isLeft(cells.front(), location))
        cells.front() = {};
    cells.front().type = registered;
    locate(cells.front(), location);

    if (isNonStandalone(modem.accessTechnologies) && std::ranges::count(cells, CellType::Nr, &ModemCell::type) == 0)
        cells.emplace_back().type = CellType::Nr;
    return cells;
}

SignalLevels levelsOf(const ModemCell& cell)
{
    SignalLevels levels;
    levels.rscp = cell.rscp;
    levels.ecio = cell.ecio;
    levels.rsrp = cell.rsrp;
    levels.rsrq = cell.rsrq;
    return levels;
}

/// The levels of the serving cell of a technology, where the modem's interface Signal has them.
std::optional<SignalLevels> levelsOf(const ModemSignal& signal, CellType type)
{
    switch (type) {
    case CellType::Gsm:
        return signal.gsm;
    case CellType::Umts:
    case CellType::TdScdma:
        return signal.umts;
    case CellType::Lte:
        return signal.lte;
    case CellType::Nr:
        return signal.nr;
    default:
        return std::nullopt;
    }
}

/// The registered cell's rows, then a group for each other serving cell.
Group servingGroup(const ModemState& modem, const std::vector<ModemCell>& cells)
{
    Group group;
    std::map<CellType, unsigned> counts;
    for (const auto& cell : cells) {
        const unsigned count = ++counts[cell.type];
        const SignalLevels own = levelsOf(cell);
        const SignalLevels levels = count == 1 ? levelsOf(modem.signal, cell.type).value_or(own) : own;
        if (&cell == cells.data()) {
            addCell(group, cell, levels);
            continue;
        }
        Group other;
        addCell(other, cell, levels);
        const std::string name(namesOf(cell.type).technology);
        group.add(count == 1 ? name : formatted("%s %u", name, count), other);
    }
    return group;
}

/// In dBm; the lowest where it is not known.
double strength(const ModemCell& cell)
{
    for (const auto& level : {cell.rsrp, cell.rscp})
        if (level && std::fabs(*level) < kLevelLimit)
            return *level;
    return cell.rxLevel ? *cell.rxLevel - 110.0 : -kLevelLimit;
}

/// The other cells: those of the registered technology first, the strongest first.
Value neighborList(const ModemState& modem, const std::vector<ModemCell>& serving)
{
    if (modem.cells.empty())
        return {};
    std::vector<const ModemCell*> neighbors;
    for (const auto& each : modem.cells) // some modems list the serving cell among the neighbours again
        if (!each.serving && std::ranges::none_of(serving, [&](const auto& cell) { return areSameCell(each, cell); }))
            neighbors.push_back(&each);
    const CellType registered = serving.front().type;
    std::ranges::stable_sort(neighbors, {}, [registered](const ModemCell* each) {
        return std::tuple(each->type != registered, each->type, -strength(*each));
    });
    return list(neighbors, kMostNeighbors, "cells", [](const ModemCell* each) {
        Group row;
        addCell(row, *each, levelsOf(*each));
        return row;
    });
}

// The other groups.

Group registrationGroup(const ModemState& modem)
{
    Group group;
    if (modem.registration)
        group.add("Registration State", registrationName(*modem.registration));
    group.add("Operator", line(modem.operatorName));
    addNetwork(group, modem.operatorCode);
    group.add("Access Technology", word(accessName(modem.accessTechnologies)));
    if (modem.packetService)
        group.add("Packet Service", packetServiceName(*modem.packetService));
    return group;
}

Group signalGroup(const ModemSignal& signal)
{
    Group group;
    for (const auto type : {CellType::Gsm, CellType::Umts, CellType::Lte, CellType::Nr}) {
        Group levels;
        addLevels(levels, levelsOf(signal, type).value_or(SignalLevels()), type);
        group.add(namesOf(type).technology, levels);
    }
    return group;
}

/// "1:02:03".
std::string durationText(std::uint32_t seconds)
{
    return formatted("%u:%02u:%02u", seconds / 3600, seconds / 60 % 60, seconds % 60);
}

std::string bearerStatus(const ModemBearer& bearer)
{
    if (!*bearer.connected)
        return "Not connected";
    return bearer.suspended.value_or(false) ? "Suspended" : "Connected";
}

Group bearerGroup(const ModemBearer& bearer)
{
    Group group;
    if (bearer.connected)
        group.add("Status", bearerStatus(bearer));
    group.add("APN", line(bearer.apn));
    group.add("Interface", line(bearer.interface));
    group.add("Address", line(bearer.address4));
    group.add("IPv6 Address", line(bearer.address6));
    if (bearer.duration)
        group.add("Duration", durationText(*bearer.duration));
    group.add("Bytes Received", number(bearer.receivedBytes));
    group.add("Bytes Sent", number(bearer.sentBytes));
    return group;
}

Group simGroup(const ModemSim& sim, bool identities)
{
    constexpr std::size_t kNetworkDigits = 5, kCountryDigits = 4; // 3GPP TS 23.003, ITU-T E.118: 89 and the country
    Group group;
    group.add("Operator", line(sim.operatorName));
    addNetwork(group, sim.operatorCode);
    group.add("IMSI", identity(sim.imsi, kNetworkDigits, identities));
    group.add("ICCID", identity(sim.identifier, kCountryDigits, identities));
    return group;
}

Group modemGroup(const ModemState& modem, const ModemStates& states, bool identities)
{
    constexpr std::size_t kTypeDigits = 8; // an IMEI's type allocation code, 3GPP TS 23.003
    Group group;
    group.add("Manufacturer", line(modem.manufacturer));
    group.add("Model", line(modem.model));
    group.add("Revision", line(modem.revision));
    group.add("Equipment Identifier", identity(modem.equipmentIdentifier, kTypeDigits, identities));
    // A hash of known things and the equipment identifier, which can be found from it by trying.
    group.add("Device Identifier", identity(modem.identifier, 0, identities));
    group.add("State", phaseName(modem));
    if (modem.lock != ModemLock::Unknown)
        group.add("Lock", lockName(modem.lock));
    const std::string version = cleaned(states.daemonVersion);
    group.add("Daemon", version.empty() ? Value() : Value("ModemManager " + version));
    return group;
}

void addModem(Group& groups, const ModemState& modem, const ModemStates& states, bool identities)
{
    groups.add("Status", statusOf(modem));
    // Of a modem that is off the daemon says 0 %, as of one without coverage.
    if (modem.phase >= ModemPhase::Enabled && modem.signalQuality && *modem.signalQuality <= 100)
        groups.add("Signal Quality",
                   formatted("%u %%", *modem.signalQuality) + (modem.signalQualityRecent ? "" : " (not recent)"));
    const auto serving = servingCells(modem);
    groups.add("Serving Cell", servingGroup(modem, serving));
    addService(groups, modem, ModemService::Location);
    groups.add("Neighbor Cells", neighborList(modem, serving));
    addService(groups, modem, ModemService::CellInformation);
    groups.add("Registration", registrationGroup(modem));
    addService(groups, modem, ModemService::Signal, signalGroup(modem.signal).value());
    addService(groups, modem, ModemService::Data,
               modem.bearers.empty() ? Value() : list(modem.bearers, kMostBearers, "connections", bearerGroup));
    addService(groups, modem, ModemService::Sim, modem.sim ? simGroup(*modem.sim, identities).value() : Value());
    groups.add("Modem", modemGroup(modem, states, identities));
}

std::string nodeName(const ModemState& modem, std::size_t index)
{
    const std::string model = cleaned(modem.model);
    const std::string name = formatted("Modem %lu", modem.number != 0 ? modem.number : index + 1);
    return model.empty() ? name : formatted("%s (%s)", name, model);
}

} // namespace

DictionaryRef makeModemTree(const ModemStates& states, Date time, const ModemTreeSetting& setting)
{
    Group root;
    if (states.daemon != ModemDaemon::Present || states.modems.empty())
        root.add("Status", statusOf(states, setting));
    else if (!setting.everyModem)
        addModem(root, states.modems.front(), states, setting.identities);
    else
        for (std::size_t i = 0; i < std::min(states.modems.size(), kMostModems); ++i) {
            Group modem;
            addModem(modem, states.modems[i], states, setting.identities);
            root.add(nodeName(states.modems[i], i), modem);
        }
    if (setting.everyModem && states.modems.size() > kMostModems)
        root.add("More Modems", std::to_string(states.modems.size() - kMostModems));
    // Readers look for this key. It is shown after the numbered ones.
    root.rows()->set("Time", isoText(time, 3));
    return root.rows();
}

} // namespace kestrum
