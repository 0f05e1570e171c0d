#pragma once

#include <cstdint>
#include <optional>
#include <string>
#include <vector>

/// What is known of the machine's modems. Every empty optional, text and list means "unknown". Enumerations have the
/// numbers of ModemManager's D-Bus interface and keep numbers that they have no name for, so that a later version's
/// number is cast, never refused. Texts are kept as they came: they can hold anything.
namespace kestrum {

/// MMModemState.
enum class ModemPhase : std::int32_t {
    Failed = -1,
    Unknown = 0,
    Initializing,
    Locked,
    Disabled,
    Disabling,
    Enabling,
    Enabled,
    Searching,
    Registered,
    Disconnecting,
    Connecting,
    Connected,
};

/// MMModemStateFailedReason.
enum class ModemFailure : std::uint32_t {
    None,
    Unknown,
    SimMissing,
    SimError,
    UnknownCapabilities,
    EsimWithoutProfiles,
};

/// MMModemLock: the code that the modem waits for.
enum class ModemLock : std::uint32_t {
    Unknown,
    None,
    SimPin,
    SimPin2,
    SimPuk,
    SimPuk2,
    ServiceProviderPin,
    ServiceProviderPuk,
    NetworkPin,
    NetworkPuk,
    PhoneSimPin,
    CorporatePin,
    CorporatePuk,
    FirstSimPin,
    FirstSimPuk,
    NetworkSubsetPin,
    NetworkSubsetPuk,
};

/// MMModemAccessTechnology: bits of a mask. LTE and NR together are 5G NSA.
enum class AccessTechnology : std::uint32_t {
    Pots = 1U << 0,
    Gsm = 1U << 1,
    GsmCompact = 1U << 2,
    Gprs = 1U << 3,
    Edge = 1U << 4,
    Umts = 1U << 5,
    Hsdpa = 1U << 6,
    Hsupa = 1U << 7,
    Hspa = 1U << 8,
    HspaPlus = 1U << 9,
    OneXrtt = 1U << 10,
    Evdo0 = 1U << 11,
    EvdoA = 1U << 12,
    EvdoB = 1U << 13,
    Lte = 1U << 14,
    Nr = 1U << 15,
    LteCatM = 1U << 16,
    LteNbIot = 1U << 17,
};

/// MMModem3gppRegistrationState.
enum class ModemRegistration : std::uint32_t {
    Idle,
    Home,
    Searching,
    Denied,
    Unknown,
    Roaming,
    HomeSmsOnly,
    RoamingSmsOnly,
    EmergencyOnly,
    HomeCsfbNotPreferred,
    RoamingCsfbNotPreferred,
    AttachedRlos,
};

/// MMModem3gppPacketServiceState.
enum class PacketService : std::uint32_t { Unknown, Detached, Attached };

/// MMCellType.
enum class CellType : std::uint32_t { Unknown, Cdma, Gsm, Umts, TdScdma, Lte, Nr };

/// The levels of one technology. A technology measures some of them only.
struct SignalLevels {
    std::optional<double> rssi;      ///< dBm
    std::optional<double> rscp;      ///< dBm
    std::optional<double> ecio;      ///< dB
    std::optional<double> rsrp;      ///< dBm
    std::optional<double> rsrq;      ///< dB
    std::optional<double> snr;       ///< dB; in GetCellInfo's NR cells this is "sinr"
    std::optional<double> errorRate; ///< percent

    bool operator==(const SignalLevels&) const = default;
};

/// The interface Modem.Signal. A technology without a value is an empty optional: "LTE" of a modem on GSM.
struct ModemSignal {
    std::optional<SignalLevels> gsm, umts, lte, nr;

    bool operator==(const ModemSignal&) const = default;
};

/// Location "3gpp-lac-ci". Areas and identity are numbers, parsed from hexadecimal texts, 0 included.
struct ModemLocation {
    std::string mcc, mnc; ///< texts: "01" and "001" are two networks
    std::optional<std::uint32_t> lac;
    std::optional<std::uint64_t> ci;
    std::optional<std::uint32_t> tac;

    bool operator==(const ModemLocation&) const = default;
};

/// An entry of GetCellInfo. The hexadecimal texts (lac, tac, ci, physical-ci, base-station-id) are numbers here.
struct ModemCell {
    CellType type = CellType::Unknown;
    bool serving = false;
    std::string operatorCode; ///< MCC and MNC in one text, "00101"
    std::optional<std::uint32_t> lac, tac;
    std::optional<std::uint64_t> ci;
    std::optional<std::uint32_t> channel;           ///< arfcn, uarfcn, earfcn or nrarfcn
    std::optional<std::uint32_t> physicalCell;      ///< LTE and NR: physical-ci
    std::optional<std::uint32_t> scramblingCode;    ///< UMTS: psc
    std::optional<std::uint32_t> baseStation;       ///< GSM: base-station-id, the BSIC
    std::optional<std::uint32_t> cellParameter;     ///< TD-SCDMA: cell-parameter-id
    std::optional<std::uint32_t> timingAdvance;     ///< as the modem counts it
    std::optional<std::uint32_t> rxLevel;           ///< GSM: rx-level, RXLEV 0 to 63
    std::optional<std::uint32_t> pathLoss;          ///< UMTS and TD-SCDMA, dB
    std::optional<double> rscp, ecio;               ///< UMTS and TD-SCDMA, dBm and dB
    std::optional<double> rsrp, rsrq, sinr;         ///< LTE and NR, dBm, dB and dB
    std::optional<std::uint32_t> systemId;          ///< CDMA: sid
    std::optional<std::uint32_t> networkId;         ///< CDMA: nid
    std::optional<std::uint32_t> cdmaBaseStationId; ///< CDMA: base-station-id
    std::optional<std::uint32_t> referencePn;       ///< CDMA: ref-pn
    std::optional<std::uint32_t> pilotStrength;     ///< CDMA: pilot-strength

    bool operator==(const ModemCell&) const = default;
};

/// A SIM. Identifier and IMSI are identities: the tree masks them unless they are asked for.
struct ModemSim {
    std::string identifier; ///< ICCID
    std::string imsi;
    std::string operatorCode, operatorName;

    bool operator==(const ModemSim&) const = default;
};

/// A data connection. Only these keys of its properties are ever read: the others hold a user name and a password.
struct ModemBearer {
    std::optional<bool> connected, suspended;
    std::string interface;
    std::string apn;
    std::string address4, address6;
    std::optional<std::uint32_t> duration; ///< seconds
    std::optional<std::uint64_t> receivedBytes, sentBytes;

    bool operator==(const ModemBearer&) const = default;
};

/// What the service asks ModemManager for and can be refused.
enum class ModemService { Signal, Location, CellInformation, Sim, Data };

enum class RefusalReason {
    NotPermitted, ///< by polkit or the policy of the bus
    NotSupported,
    NoAnswer, ///< within the service's own limit
    Failed,   ///< with a text
};

struct ModemRefusal {
    ModemService service;
    RefusalReason reason;
    std::string text; ///< of the daemon; for Failed

    bool operator==(const ModemRefusal&) const = default;
};

struct ModemState {
    /// 1, 2, ... in the order in which the service first saw the modems. A modem that comes back has its number again.
    std::uint32_t number = 0;
    std::string identifier; ///< DeviceIdentifier: stays the same when the modem comes back
    std::string manufacturer, model, revision;
    std::string equipmentIdentifier; ///< IMEI; an identity
    ModemPhase phase = ModemPhase::Unknown;
    ModemFailure failure = ModemFailure::None;  ///< why, where the phase is Failed
    ModemLock lock = ModemLock::Unknown;        ///< UnlockRequired; SimPin2 does not lock the modem
    std::uint32_t accessTechnologies = 0;       ///< bits of AccessTechnology; 0 is unknown
    std::optional<std::uint32_t> signalQuality; ///< percent
    bool signalQualityRecent = false;

    std::optional<ModemRegistration> registration;
    std::string operatorCode, operatorName; ///< of the network, MCC and MNC in one text
    std::optional<PacketService> packetService;

    std::optional<ModemSim> sim;
    std::vector<ModemBearer> bearers;
    ModemSignal signal;
    std::optional<ModemLocation> location;
    std::vector<ModemCell> cells;       ///< of GetCellInfo, in its order; serving cells can be repeated
    std::vector<ModemRefusal> refusals; ///< at most one to a service

    bool operator==(const ModemState&) const = default;
};

/// Whether the daemon can be asked.
enum class ModemDaemon {
    NoBus,  ///< no system bus
    Absent, ///< ModemManager is not on the bus
    Silent, ///< it is, and has not answered yet
    NotPermitted,
    Present,
};

/// All that is known: the daemon, and those of its modems that the user chose, in a lasting order.
struct ModemStates {
    ModemDaemon daemon = ModemDaemon::Absent;
    std::string daemonVersion;
    std::vector<ModemState> modems;
    std::uint32_t otherModems = 0; ///< that the daemon has and the user did not choose

    bool operator==(const ModemStates&) const = default;
};

} // namespace kestrum
