#pragma once

#include "support/Problem.h"

#include <cstdint>
#include <functional>
#include <memory>
#include <optional>
#include <string>
#include <string_view>

namespace kestrum {

/// The service's answer to the request for a log channel.
struct LogChannelAnswer {
    std::int32_t errorDomain = 0;
    std::int32_t errorCode = 0;            ///< 0 = success
    std::optional<std::string> remotePort; ///< the port on which the service takes commands
};

/// A connection to the telephony service. Destroying the object closes it.
class VoxServerConnection {
public:
    virtual ~VoxServerConnection() = default;

    /// Asks the service to stream its log to the local port called `serviceName`. Waits up to 1 s for the answer;
    /// meanwhile timers and tasks run, which may destroy this connection. No answer is a failure.
    virtual LogChannelAnswer networkMonitorCreateLogChannel(std::string_view serviceName) = 0;
};

/// The device's telephony service.
class TelephonyService {
public:
    virtual ~TelephonyService() = default;

    using NotificationHandler = std::function<void(std::string_view name)>;

    /// Null when the service cannot be reached within 1 s. Notifications are delivered on the main queue until the
    /// connection is destroyed; equal notifications that wait there at the same time are delivered once.
    virtual std::unique_ptr<VoxServerConnection> connect(NotificationHandler handler) = 0;

    /// Why the last attempt to connect, or to create a log channel, failed; nothing when it did not.
    virtual std::optional<Problem> problem() const { return {}; }
};

/// The service's baseband-state-report log channel; the local port that receives the log has the same name.
inline constexpr std::string_view kLogChannelServiceName = "org.kestrum.vox.baseband-state-report.log";

// Technology identifiers. Each string equals the constant's name.
inline constexpr std::string_view kVoxLogChannelTechnology_IFX = "kVoxLogChannelTechnology_IFX";
inline constexpr std::string_view kVoxLogChannelTechnology_Zephra_GSM = "kVoxLogChannelTechnology_Zephra_GSM";
inline constexpr std::string_view kVoxLogChannelTechnology_Zephra_CDMA = "kVoxLogChannelTechnology_Zephra_CDMA";
inline constexpr std::string_view kVoxLogChannelTechnology_Zephra_LTE = "kVoxLogChannelTechnology_Zephra_LTE";
inline constexpr std::string_view kVoxLogChannelTechnology_Zephra_UTRAN2 = "kVoxLogChannelTechnology_Zephra_UTRAN2";

// Keys of a cell in the cell-monitor record: technology and type ...
inline constexpr std::string_view kVoxCell_Technology = "kVoxCell_Technology";
inline constexpr std::string_view kVoxCell_Type = "kVoxCell_Type";
inline constexpr std::string_view kVoxCellTechnology_GSM = "kVoxCellTechnology_GSM";
inline constexpr std::string_view kVoxCellTechnology_UMTS = "kVoxCellTechnology_UMTS";
inline constexpr std::string_view kVoxCellTechnology_LTE = "kVoxCellTechnology_LTE";
inline constexpr std::string_view kVoxCellTechnology_UTRAN2 = "kVoxCellTechnology_UTRAN2";
inline constexpr std::string_view kVoxCellType_Serving = "kVoxCellType_Serving";
inline constexpr std::string_view kVoxCellType_Neighbor = "kVoxCellType_Neighbor";
// ... and numbers.
inline constexpr std::string_view kVoxCell_MCC = "kVoxCell_MCC";
inline constexpr std::string_view kVoxCell_MNC = "kVoxCell_MNC";
inline constexpr std::string_view kVoxCell_LAC = "kVoxCell_LAC";
inline constexpr std::string_view kVoxCell_TAC = "kVoxCell_TAC";
inline constexpr std::string_view kVoxCell_CellId = "kVoxCell_CellId";
inline constexpr std::string_view kVoxCell_PhysicalCellId = "kVoxCell_PhysicalCellId";
inline constexpr std::string_view kVoxCell_BandInfo = "kVoxCell_BandInfo";
inline constexpr std::string_view kVoxCell_ARFCN = "kVoxCell_ARFCN";
inline constexpr std::string_view kVoxCell_UARFCN = "kVoxCell_UARFCN";
inline constexpr std::string_view kVoxCell_ScramblingCode = "kVoxCell_ScramblingCode";
inline constexpr std::string_view kVoxCell_RSCP = "kVoxCell_RSCP";
inline constexpr std::string_view kVoxCell_EcNo = "kVoxCell_EcNo";
inline constexpr std::string_view kVoxCell_RSSI = "kVoxCell_RSSI";

} // namespace kestrum
