#pragma once

namespace kestrum {

class Bundle;
class Clock;
class Console;
class FileSystem;
class MainQueue;
class MessagePorts;
class Preferences;
class PropertyLists;
class RecordWatch;
class SystemLog;
class TelephonyService;
class Toolkit;

/// The roles that decoding needs. Borrowed: main() owns the adapters, and they outlive their users.
struct DecodingRoles {
    SystemLog& log;
    Console& console;
    Clock& clock;
    Bundle& bundle;
    PropertyLists& propertyLists;
    RecordWatch* watch = nullptr; ///< may be null
};

/// The roles that the monitor model needs.
struct MonitorRoles : DecodingRoles {
    MainQueue& queue;
    MessagePorts& ports;
    TelephonyService& telephony;
};

/// The roles that the application needs.
struct ApplicationRoles : MonitorRoles {
    Preferences& preferences;
    FileSystem& files;
    Toolkit& toolkit;
};

} // namespace kestrum
