#pragma once

#include "support/Record.h"

#include <cstdint>
#include <optional>

namespace kestrum {

/// One message of the log channel: type (1 byte), length (2), log code (2), time stamp (8), payload; little-endian.
/// When the first byte is 0x81, a prefix of two bytes comes before the type.
struct ChannelMessage {
    static constexpr std::size_t kHeaderSize = 13;
    static constexpr std::size_t kPrefixSize = 2;
    static constexpr std::byte kPrefixMarker{0x81};
    static constexpr std::uint8_t kOrdinary = 1;     ///< a modem log record
    static constexpr std::uint8_t kExtraCode = 0xFF; ///< a property list of the telephony service
    static constexpr LogCode kExtraCodes = 0xFF0000; ///< added to the code of an extra-code record

    Record record; ///< without the prefix, with the header; borrowed
    std::uint8_t type;
    LogCode logCode; ///< with kExtraCodes added for type 0xFF

    /// Nothing for a message of fewer than 13 bytes, prefix included. A record behind a prefix may so have only 11
    /// bytes; its type and code are always there.
    static std::optional<ChannelMessage> read(Bytes message)
    {
        if (message.size() < kHeaderSize)
            return std::nullopt;
        const Record record(message.front() == kPrefixMarker ? message.subspan(kPrefixSize) : message);
        const auto type = static_cast<std::uint8_t>(record.read(u8(0)).value_or(0));
        const LogCode code = record.read(u16(3)).value_or(0);
        return ChannelMessage{record, type, type == kExtraCode ? kExtraCodes + code : code};
    }

    bool isOfKnownType() const { return type == kOrdinary || type == kExtraCode; }
    /// CDMA system time, see dateFromTimeStamp; nothing when the record was left too short for it.
    std::optional<std::uint64_t> timeStamp() const { return record.read64(5); }
};

/// Log codes of the telephony service's records: a property list follows the header.
inline constexpr LogCode kSimFilesRecord = ChannelMessage::kExtraCodes;        ///< a dictionary of elementary files
inline constexpr LogCode kCellMonitorRecord = ChannelMessage::kExtraCodes + 1; ///< an array of cells
inline constexpr LogCode kPdpContextsRecord = ChannelMessage::kExtraCodes + 2; ///< an array of rows

/// Code and time stamp of a log record.
struct ChannelRecord {
    LogCode code;            ///< 0xFF0000 + the code when the type is 0xFF
    std::uint64_t timeStamp; ///< CDMA system time
};

/// Nothing for a message that is not a log record: too short, of another type, or a property list.
std::optional<ChannelRecord> channelRecord(Bytes message);

/// Whether the message begins like a property list (XML or binary), the messages of an IFX modem.
bool isPropertyList(Bytes message);

} // namespace kestrum
