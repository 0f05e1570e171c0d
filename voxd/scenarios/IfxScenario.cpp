#include "voxd/scenarios/IfxScenario.h"

#include "platform/PropertyLists.h"
#include "platform/TelephonyService.h"
#include "support/Format.h"
#include "voxd/scenarios/Random.h"
#include "voxd/scenarios/Scenario.h"

#include <algorithm>
#include <array>
#include <cmath>
#include <deque>

namespace kestrum {
namespace {

constexpr std::chrono::milliseconds kStep{500};
constexpr double kStepSeconds = 0.5;
constexpr int kFraction = 3; // digits of the second in "Time"
constexpr int kCells = 12;
constexpr std::size_t kShownNeighbors = 6;
constexpr double kSpacing = 900;         // metres of road between two sites
constexpr double kSpeed = 16;            // m/s
constexpr double kRoadside = 120;        // metres from a site to the road
constexpr double kHysteresis = 4;        // dB; a neighbour stronger by this much is reselected
constexpr double kLowestLevel = -110;    // dBm; the lowest level that GSM reports (RXLEV 0, 3GPP TS 45.008)
constexpr double kRxLevAccessMin = -104; // dBm
constexpr std::size_t kRememberedCells = 5;

struct Cell {
    int arfcn, bsic, identity, area;
    double place; // metres along the road
    double fade;  // dB, changes slowly
    double level; // dBm, the current received level

    int c1() const { return static_cast<int>(std::lround(level - kRxLevAccessMin)); }
};

enum class Call { Idle, Setup, Active, Release };

struct CallPhase {
    const char* connection; // of mobility management
    const char* channel;    // of radio resource management
    int shortest, longest;  // steps
};

// In the order of the enumeration Call.
constexpr CallPhase kPhases[] = {
    {"Idle", "BCCH/CCCH", 30, 90},
    {"Wait for network", "SDCCH/8", 4, 8},
    {"Connection active", "TCH/F", 40, 120},
    {"Wait for release", "SDCCH/8", 2, 4},
};

class IfxScenario final : public ScenarioSource {
public:
    explicit IfxScenario(const ScenarioSetting& setting)
        : _lists(setting.lists), _start(setting.start), _random(setting.seed)
    {
        for (int i = 0; i < kCells; ++i)
            _cells[static_cast<std::size_t>(i)] = {_random.whole(1, 124),
                                                   _random.whole(0, 63),
                                                   0x2A00 + 16 * i + _random.whole(1, 3),
                                                   0x1107 + i / 4,
                                                   kSpacing * i,
                                                   4 * _random.normal(),
                                                   0};
        receive();
        _serving = strongest();
        _remaining = phaseLength();
    }

    std::string_view technology() const override { return kVoxLogChannelTechnology_IFX; }
    std::vector<ScenarioCell> servingCells() const override { return {{"GSM", _cells[_serving].identity}}; }

    std::optional<Message> next() override
    {
        if (_steps > 0)
            drive();
        const auto list = _lists.toXml(tree());
        if (!list)
            return std::nullopt;
        const auto bytes = list->bytes();
        return Message{kStep * _steps++, {bytes.begin(), bytes.end()}};
    }

private:
    void drive()
    {
        _place = std::fmod(_place + kSpeed * kStepSeconds, kSpacing * kCells);
        receive();
        const std::size_t best = strongest();
        if (best != _serving && _cells[best].level > _cells[_serving].level + kHysteresis) {
            _left.push_front(_cells[_serving].identity);
            _left.resize(std::min(_left.size(), kRememberedCells));
            ++(_call == Call::Active ? _handovers : _reselections);
            _areaUpdates += _cells[best].area != _cells[_serving].area;
            _serving = best;
        }
        if (--_remaining == 0) {
            _call = static_cast<Call>((static_cast<int>(_call) + 1) % 4);
            _calls += _call == Call::Active;
            _remaining = phaseLength();
        }
        if (_random.chance(0.01))
            _packetData = !_packetData;
        if (_packetData) {
            _sent += _random.whole(0, 900);
            _received += _random.whole(0, 4200);
        }
    }

    // The road is a ring. Path loss as in a suburb: 35 dB per decade of distance.
    void receive()
    {
        constexpr double kRing = kSpacing * kCells;
        for (auto& each : _cells) {
            const double apart = std::fabs(_place - each.place);
            const double way = std::hypot(std::min(apart, kRing - apart), kRoadside);
            each.fade = 0.95 * each.fade + 1.2 * _random.normal();
            each.level = std::max(-48 - 35 * std::log10(way / kRoadside) + each.fade, kLowestLevel);
        }
    }

    std::size_t strongest() const
    {
        return static_cast<std::size_t>(std::ranges::max_element(_cells, {}, &Cell::level) - _cells.begin());
    }

    int phaseLength() { return _random.whole(phase().shortest, phase().longest); }
    const CallPhase& phase() const { return kPhases[static_cast<std::size_t>(_call)]; }

    static std::string dbm(double level) { return formatted("%d dBm", static_cast<int>(std::lround(level))); }

    // The modem wraps each group into a dictionary with one entry, and puts the number of elements first in every
    // array. A display has to remove both.
    static Value wrapped(std::string_view name, DictionaryRef group)
    {
        return makeDictionary({{std::string(name), Value(std::move(group))}});
    }
    static Value counted(std::vector<Value> elements)
    {
        elements.insert(elements.begin(), Value(formatted("%lu", elements.size())));
        return makeArray(std::move(elements));
    }

    Value tree()
    {
        return makeDictionary({{"Time", Value(isoText(_start + kStep * _steps, kFraction))},
                               {"Serving Cell", wrapped("GSM Cell", servingCell())},
                               {"Neighbor Cells", neighbors()},
                               {"Radio Resource", radioResource()},
                               {"Mobility Management", mobility()},
                               {"Packet Data", packetData()},
                               {"Cell Changes", cellChanges()}});
    }

    DictionaryRef servingCell()
    {
        const Cell& cell = _cells[_serving];
        return makeDictionary({{"MCC", Value("001")},
                               {"MNC", Value("01")},
                               {"LAC", Value(formatted("0x%04x", static_cast<unsigned>(cell.area)))},
                               {"Cell ID", Value(formatted("0x%04x", static_cast<unsigned>(cell.identity)))},
                               {"ARFCN", Value(formatted("%d", cell.arfcn))},
                               {"BSIC", Value(formatted("%d", cell.bsic))},
                               {"RSSI", Value(dbm(cell.level))},
                               {"C1", Value(formatted("%d", cell.c1()))},
                               {"C2", Value(formatted("%d", cell.c1()))}});
    }

    Value neighbors()
    {
        std::vector<const Cell*> order;
        for (const auto& each : _cells)
            if (&each != &_cells[_serving] && each.level > kLowestLevel)
                order.push_back(&each);
        std::ranges::sort(order, std::greater(), &Cell::level);
        std::vector<Value> shown;
        for (const auto* each : order)
            if (shown.size() < kShownNeighbors)
                shown.push_back(makeDictionary({{"ARFCN", Value(formatted("%d", each->arfcn))},
                                                {"BSIC", Value(formatted("%d", each->bsic))},
                                                {"RSSI", Value(dbm(each->level))},
                                                {"C1", Value(formatted("%d", each->c1()))}}));
        return counted(std::move(shown));
    }

    Value radioResource()
    {
        const Cell& cell = _cells[_serving];
        const bool dedicated = _call != Call::Idle;
        auto status =
            makeDictionary({{"State", Value(dedicated ? "Dedicated" : "Idle")}, {"Channel", Value(phase().channel)}});
        if (dedicated) {
            const double apart = std::fabs(_place - cell.place);
            // A step of the timing advance is 554 m: the distance there and back, halved (3GPP TS 45.010).
            status->set("Timing Advance", formatted("%d", static_cast<int>(apart / 554)));
            status->set("Tx Power", formatted("%d dBm", std::clamp(static_cast<int>(-cell.level) / 2 - 18, 5, 33)));
            status->set("RxQual", formatted("%d", std::clamp((-80 - static_cast<int>(cell.level)) / 4, 0, 7)));
        }
        return makeDictionary(
            {{"Status", Value(status)},
             {"Ciphering", wrapped("Algorithm", makeDictionary({{"Name", Value(dedicated ? "A5/3" : "None")}}))},
             {"Band", Value("P-GSM 900")}});
    }

    Value mobility()
    {
        const std::string area = formatted("001-01-%04x", static_cast<unsigned>(_cells[_serving].area));
        return makeDictionary({{"MM State", Value(phase().connection)},
                               {"GMM State", Value(_packetData ? "Registered, ready" : "Registered, standby")},
                               {"Location Area", Value(area)},
                               {"Equivalent PLMNs", counted({Value("001-01"), Value("001-02")})}});
    }

    Value packetData()
    {
        std::vector<Value> contexts;
        if (_packetData)
            contexts.push_back(makeDictionary({{"APN", Value("internet.example")},
                                               {"NSAPI", Value("5")},
                                               {"Address", Value("192.0.2.17")},
                                               {"QoS Class", Value("Interactive")}}));
        return makeDictionary({{"Attached", Value("Yes")},
                               {"PDP Contexts", counted(std::move(contexts))},
                               {"Bytes Sent", Value(formatted("%ld", _sent))},
                               {"Bytes Received", Value(formatted("%ld", _received))}});
    }

    Value cellChanges()
    {
        std::vector<Value> left;
        left.reserve(_left.size());
        for (const int identity : _left)
            left.push_back(Value(formatted("0x%04x", static_cast<unsigned>(identity))));
        return makeDictionary({{kSortedKey, kSortedKey},
                               {"0;Reselections", Value(formatted("%d", _reselections))},
                               {"1;Handovers", Value(formatted("%d", _handovers))},
                               {"2;Location Updates", Value(formatted("%d", _areaUpdates))},
                               {"3;Calls", Value(formatted("%d", _calls))},
                               {"4;Cells Left", counted(std::move(left))}});
    }

    PropertyLists& _lists;
    Date _start;
    Random _random;
    std::array<Cell, kCells> _cells;
    std::size_t _serving = 0;
    double _place = 0;
    int _steps = 0;

    Call _call = Call::Idle;
    int _remaining = 0; // steps left in the call's phase
    bool _packetData = true;
    long _sent = 0, _received = 0;
    int _reselections = 0, _handovers = 0, _areaUpdates = 0, _calls = 0;
    std::deque<int> _left; // identities of the previous cells, the latest first
};

} // namespace

std::unique_ptr<ScenarioSource> makeIfxScenario(const ScenarioSetting& setting)
{
    return std::make_unique<IfxScenario>(setting);
}

} // namespace kestrum
