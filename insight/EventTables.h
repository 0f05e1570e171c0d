#pragma once

#include "support/Record.h"

#include <cstddef>
#include <cstdint>
#include <span>
#include <string_view>

namespace kestrum {

/// What an event is about.
enum class EventKind : std::uint8_t {
    Technology,   ///< the radio access, or the modem's technology
    ServingCell,  ///< the first cell after a start
    Reselection,  ///< another cell while no channel is in use
    Handover,     ///< another cell while a channel is in use
    Registration, ///< network, area, registration state
    RrcState,
    Call,
    Data,
    Silence,    ///< no message came for a while
    Connection, ///< the log channel was lost, or is back
};

/// "technology", "serving cell", "reselection", ...
std::string_view word(EventKind kind);

/// A value of the display: the names of the nodes from the root, joined by "/". In a list, "0" is the first row and "*"
/// stands for all rows.
struct Place {
    std::string_view path;
    /// The only code whose records change it; 0: every code that its section takes.
    LogCode code = 0;
};

/// A value whose changes are events. Several parts make one text, "001-01-4354".
struct FollowedValue {
    EventKind kind;
    std::string_view name; ///< "tracking area"
    std::span<const Place> parts;
    /// Words for the value's texts; equal words are no change. Null: the texts themselves.
    std::string_view (*wordOf)(std::string_view text) = nullptr;
};

/// A state that no record states, but that a record implies by its coming: idle-mode measurements mean idle.
struct StateName {
    std::string_view text;
};
struct ImpliedState {
    LogCode code;
    const StateName* state;
};

struct CellPart {
    std::string_view name; ///< "EARFCN"
    Place place;
};

/// A level of the serving cell. Several records may tell it; the last one counts.
struct CellLevel {
    std::string_view name; ///< "RSRP"
    std::span<const Place> places;
};

/// Where a radio access shows its serving cell.
struct ServingCellTable {
    std::string_view radio; ///< "LTE", "UMTS"
    std::span<const CellPart> identity;
    std::size_t decisive; ///< this many parts alone tell two cells apart, where all of them are known
    /// The records of this code come only while this radio access serves, and no other of the technology then does. 0:
    /// it always serves.
    LogCode campedBy = 0;
    std::span<const CellLevel> levels = {}; ///< the first is the cell's level
    /// The state that tells whether a channel is in use, and its texts for that. A change of cell is then a handover.
    Place state = {};
    std::span<const std::string_view> connected = {};
};

/// Which values of a technology's display make events.
struct EventTable {
    std::string_view technology; ///< kVoxLogChannelTechnology_...
    std::string_view name;       ///< for people
    std::span<const ServingCellTable> cells;
    std::span<const FollowedValue> values;
    std::span<const ImpliedState> rrcStates = {};        ///< where the display has no RRC state
    std::span<const FollowedValue> liveModemValues = {}; ///< of the machine's own modem, whose tree has other names
};

extern const EventTable kLteEvents, kGsmEvents, kUtranEvents, kCdmaEvents, kIfxEvents;

/// The tables of all technologies.
std::span<const EventTable* const> eventTables();
/// Null for an unknown technology.
const EventTable* eventTableOf(std::string_view technology);

} // namespace kestrum
