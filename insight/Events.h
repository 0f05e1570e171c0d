#pragma once

#include "LogGenerator/LogGenerator.h"
#include "insight/Cells.h"
#include "insight/EventTables.h"
#include "insight/WatchedPlace.h"
#include "support/Date.h"
#include "support/Value.h"

#include <array>
#include <chrono>
#include <cstddef>
#include <cstdint>
#include <deque>
#include <memory>
#include <optional>
#include <string>
#include <string_view>
#include <unordered_map>
#include <utility>
#include <vector>

namespace kestrum {

/// Something that happened. Texts are cut at `kLongestText` bytes.
struct Event {
    std::optional<Date> time; ///< of the message; nothing when it has none
    EventKind kind;
    std::string_view name;   ///< what has changed, a constant: "tracking area"; the radio of a cell
    std::string was, is;     ///< empty: not known
    std::string levels = {}; ///< of the serving cell at that moment: "RSRP -98.25 dBm, RSRQ -11.00 dB"
};

/// Whether another cell serves, or the first one.
bool isCellChange(const Event& event);
/// "reselection (LTE)"
std::string titleOf(const Event& event);

/// The latest events, the oldest first. At most `kMost`; beyond that the oldest go.
class Events {
public:
    static constexpr std::size_t kMost = 10'000;

    void add(Event event);

    auto begin() const { return _events.begin(); }
    auto end() const { return _events.end(); }
    std::size_t size() const { return _events.size(); }
    /// Events that are no longer listed.
    std::uint64_t dropped() const { return _dropped; }

private:
    std::deque<Event> _events;
    std::uint64_t _dropped = 0;
};

/// Watches a display, message by message, and notes events and visited cells. What to watch stands in the technology's
/// EventTable. A value that becomes known for the first time is no event, but the first serving cell is.
class EventFinder {
public:
    /// A gap in the messages' times that is an event.
    static constexpr std::chrono::seconds kSilence{10};
    /// A gap beyond this, or a step back, is a clock that was set: no silence, and no time on a cell.
    static constexpr std::chrono::hours kClockSet{24};
    /// Levels are sampled at this pace: records with levels come up to a hundred times a second.
    static constexpr std::chrono::milliseconds kSampling{500};

    EventFinder() = default;
    EventFinder(const EventFinder&) = delete;
    EventFinder& operator=(const EventFinder&) = delete;

    /// Call it after each message that the generator has decoded into the state.
    void look(const LogGenerator& generator, const State& state, Bytes message);
    /// The same with what is known of the message: nothing for an IFX tree, which has no code.
    void look(const LogGenerator& generator, const State& state, std::optional<LogCode> code, std::optional<Date> time);

    /// Notes a silence at once, where the next message may be far. Call it when no message has come for `kSilence`.
    void silent();
    /// The log channel was lost, or is back. Only changes are events.
    void connected(bool isConnected, std::optional<Date> at);

    const Events& events() const { return _events; }
    /// Up to the last message.
    const Cells& cells();

private:
    /// Time stamps count 1.25 ms in their upper 48 bits.
    static constexpr std::uint64_t stampsIn(std::chrono::microseconds time)
    {
        return static_cast<std::uint64_t>(time / std::chrono::microseconds(1250)) << 16;
    }

    /// A serving cell.
    struct Serving {
        const ServingCellTable* table;
        std::vector<WatchedPlace> identity = {};
        struct Level {
            std::vector<WatchedPlace> places = {};
            const WatchedPlace* latest = nullptr; ///< the place that the last record told
            std::optional<Reading> reading = {};  ///< the last one in the cell's spread, and its number
            double number = 0;
            std::uint64_t sampled = 0; ///< the time stamp of the last sample; 0: none of this cell
        };
        std::vector<Level> levels = {};
        std::optional<WatchedPlace> state = {};
        std::vector<std::string> known = {}; ///< the identity of the cell that serves, or served last
        VisitedCell* visit = nullptr;

        std::string text() const; ///< "LTE cell 1712898, PCI 232"; empty: no cell yet
        bool isSame() const;
    };
    struct Followed {
        const FollowedValue* value;
        std::vector<WatchedPlace> parts = {};
        std::string shown = {};
    };
    /// What a message of a code may change.
    struct Reach {
        Serving* camped = nullptr;
        const StateName* implied = nullptr;
        std::vector<std::pair<Serving*, std::vector<WatchedPlace*>>> cells = {};
        std::vector<std::pair<Followed*, std::vector<WatchedPlace*>>> values = {};
        struct Sample {
            Serving* cell;
            Serving::Level* level;
            const WatchedPlace* place;
        };
        std::vector<Sample> levels = {};

        std::vector<const WatchedPlace*> places = {}; ///< of cells and values
        Serving::Level* paced = nullptr;              ///< tells when the next sample is due; null: there are no levels

        bool isEmpty() const { return camped == nullptr && implied == nullptr && places.empty() && paced == nullptr; }
    };

    void lookAgain(const LogGenerator& generator, const State& state, Bytes message);
    void lookAt(const LogGenerator& generator, const State& state, std::optional<LogCode> code);
    void adopt(const Value& display, std::string_view technology);
    void useTable(const EventTable* table);
    template <typename Use>
    void forEachPlace(Use use);
    const Reach* reachOf(std::optional<LogCode> code, const LogGenerator& generator);
    std::unique_ptr<const Reach> makeReach(std::optional<LogCode> code, const LogGenerator& generator);

    void catchUp();
    void pass(Date time);
    void camp(Serving& now);
    void imply(const StateName& state);
    void begin(Serving& serving, EventKind kind, std::string_view was);
    void compare(Serving& serving);
    void compare(Followed& followed, bool isChange);
    /// Whether nothing but levels can have changed.
    bool isQuiet(const Reach& reach) const;
    /// Without times all levels count.
    bool isSampleDue(const Reach& reach) const
    {
        return reach.paced != nullptr && (_stamp == 0 || _stamp - reach.paced->sampled >= stampsIn(kSampling));
    }
    void sample(const Reach& reach);
    void sample(const Reach::Sample& at);
    void leave(Serving& serving);
    bool isConnected(const Serving& serving) const;
    std::string levelsNow() const;
    void note(EventKind kind, std::string_view name, std::string_view was, std::string_view is);

    const EventTable* _table = nullptr;
    SectionRef _display;
    std::vector<Serving> _serving;
    std::vector<Followed> _followed;
    std::unordered_map<LogCode, std::unique_ptr<const Reach>> _reaches; ///< null: nothing
    struct Recent {
        LogCode code = ~LogCode{0}; // no message has it
        const Reach* reach = nullptr;
    };
    std::array<Recent, 256> _recent;     ///< by the low byte of the code: cheaper than the map
    std::unique_ptr<const Reach> _all;   ///< of messages without a code
    std::optional<Date> _time;           ///< of the last message that has one, but for ...
    std::uint64_t _stamp = 0;            ///< ... its time stamp; 0: none
    std::optional<Date> _now;            ///< of the message that is looked at
    Serving* _camped = nullptr;          ///< the radio access that serves, where only one of them does
    const StateName* _implied = nullptr; ///< the RRC state
    bool _isConnected = true, _isSilent = false;

    Events _events;
    Cells _cells;
};

} // namespace kestrum
