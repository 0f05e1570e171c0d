#pragma once

#include "LogGenerator/Base.h"

#include <string_view>

/// Mobility management (3GPP TS 24.008) for several sections: the record, its minimum length, the names of the states.
namespace kestrum::nas {

inline constexpr LogCode kGmmState = 0x7130, kMmState = 0x7131, kRegistration = 0x7132;
inline constexpr std::size_t kMinimumLength = 16; ///< of each of them

inline std::string_view mmState(std::uint32_t raw)
{
    // Numbers that the modem does not use are "Unknown". Kept: blanks inside a name, as field logs show them.
    static constexpr std::string_view kNames[] = {
        "MM_NULL",
        "Unknown",
        "Unknown",
        "MM_LOCATION_UPDATE_INITIATED",
        "Unknown",
        "MM_WAIT_FOR_OUTGOING_MM_CONNECTION",
        "MM_CONNECTION_ACTIVE",
        "MM_IMSI_DETACH_INITIATED",
        "MM_PROCESS_CM_SERVICE_PROMPT",
        "MM_WAIT_FOR_NETWORK_COMMAND",
        "MM_LOCATION_UPDATE_REJECTED",
        "Unknown",
        "Unknown",
        "MM_WAIT_FOR_RR_CONNECTION_LU",
        "MM_WAIT_FOR_RR_CONNECTION_MM",
        "MM_WAIT_FOR_RR_CONNECTION_IMSI_DETACH",
        "Unknown",
        "MM_REESTABLISHMENT_INITIATED",
        "MM_WAIT_FOR_RR_ACTIVE",
        "MM_IDLE",
        "MM_WAIT_FOR_ADDITIONAL_OUTGOING_MM_ CONNECTION",
        "MM_WAIT_FOR_RR_CONNECTION_ REESTABLISHMENT",
        "MM_WAIT_FOR_REESTABLISH_DECISION",
        "MM_LOCATION_UPDATING_PENDING",
        "Unknown",
        "MM_RR_CONNECTION_RELEASE_NOT_ALLOWED",
    };
    return nameIn(kNames, raw);
}

inline std::string_view registrationState(std::uint32_t raw)
{
    static constexpr std::string_view kNames[] = {
        "REG_STATE_INACTIVE",      "REG_STATE_IDLE",          "REG_STATE_REGISTERING",
        "REG_STATE_DEREGISTERING", "REG_STATE_MANUAL_SEARCH", "REG_STATE_AUTOMATIC_SEARCH",
        "REG_STATE_OFFLINE",
    };
    return nameIn(kNames, raw);
}

inline constexpr Row kServiceState[] = {{u8(13), "MM Service State", named<registrationState>}};
static_assert(reach(kServiceState) <= kMinimumLength);

} // namespace kestrum::nas
