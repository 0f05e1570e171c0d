#pragma once

#include "platform/TelephonyService.h"
#include "support/Bytes.h"

#include <chrono>
#include <cstdint>
#include <optional>
#include <string>
#include <string_view>
#include <vector>

/// The messages between a display and the telephony service; docs/protocol.md has the bytes.
namespace kestrum::vox {

/// The port on which the service accepts server connections.
inline constexpr std::string_view kServerPort = "org.kestrum.vox";

// Message ids on a server connection.
inline constexpr std::int32_t kCreateLogChannel = 1; ///< request: the address of the receiving port, as text
inline constexpr std::int32_t kNotification = 2;     ///< message from the service: the notification's name, as text

// Message ids on a log channel.
inline constexpr std::int32_t kLogMessage = 0;  ///< to the service a command, to the display a message of the modem
inline constexpr std::int32_t kLossMessage = 1; ///< to the display: how many messages were dropped before the next

// Error domains of an answer; 0 is success.
inline constexpr std::int32_t kServiceErrors = 1; ///< codes below
inline constexpr std::int32_t kSystemErrors = 2;  ///< codes are errno values
// Codes of kServiceErrors.
inline constexpr std::int32_t kBadRequest = 1;
inline constexpr std::int32_t kTooManyChannels = 2;
inline constexpr std::int32_t kNoReceiver = 3; ///< no process listens at the given address

/// The address of a process's receive port: name and process number. All displays of a user have the same port name.
std::string addressOfPort(std::string_view name, int process);

/// The answer's payload: error domain and error code (32 bits each, little-endian), the remote port's name.
std::vector<std::byte> encode(const LogChannelAnswer& answer);
std::optional<LogChannelAnswer> decodeAnswer(Bytes payload); ///< nothing when it is too short

} // namespace kestrum::vox
