#pragma once

#include "support/Record.h"

#include <cstdint>
#include <optional>

namespace kestrum {

/// One message of the log channel: type (1), length (2), log code (2), time stamp (8), payload; little-endian. A
/// first byte of 0x81 announces a prefix of two bytes before all that.
struct ChannelMessage {
    static constexpr std::size_t kHeaderSize = 13;
    static constexpr std::size_t kPrefixSize = 2;
    static constexpr std::byte kPrefixMarker{0x81};
    static constexpr std::uint8_t kOrdinary = 1;     ///< a modem log record
    static constexpr std::uint8_t kExtraCode = 0xFF; ///< a property list of the telephony service
    static constexpr LogCode kExtraCodes = 0xFF0000; ///< added to the code of an extra-code record

    Record record; ///< less the prefix, header included
    std::uint8_t type;
    LogCode logCode; ///< the effective one

    /// Nothing for a message of fewer than 13 bytes. The test comes before the prefix is removed, so that a record
    /// may be left with 11 bytes; its type and code are there all the same.
    static std::optional<ChannelMessage> read(Bytes message);

    bool isOfKnownType() const { return type == kOrdinary || type == kExtraCode; }
    /// CDMA system time, see dateFromTimeStamp; nothing when the record was left too short for it.
    std::optional<std::uint64_t> timeStamp() const;
};

/// The telephony service's own records, property lists behind a header.
inline constexpr LogCode kSimFilesRecord = ChannelMessage::kExtraCodes;        ///< a dictionary of elementary files
inline constexpr LogCode kCellMonitorRecord = ChannelMessage::kExtraCodes + 1; ///< an array of cells
inline constexpr LogCode kPdpContextsRecord = ChannelMessage::kExtraCodes + 2; ///< an array of rows

/// Code and time stamp of a log record.
struct ChannelRecord {
    LogCode code;            ///< 0xFF0000 + the code when the type is 0xFF
    std::uint64_t timeStamp; ///< CDMA system time
};

/// Nothing for a message that is no log record: too short, of another type, a property list.
std::optional<ChannelRecord> channelRecord(Bytes message);

/// Whether the message looks like a property list (XML or binary), as an IFX modem sends them.
bool isPropertyList(Bytes message);

} // namespace kestrum
