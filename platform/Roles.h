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

/// What decoding needs of the device. References: main() owns the adapters, and they outlive what uses them.
struct DecodingRoles {
    SystemLog& log;
    Console& console;
    Clock& clock;
    Bundle& bundle;
    PropertyLists& propertyLists;
    RecordWatch* watch = nullptr; ///< optional
};

/// What the monitor model needs besides.
struct MonitorRoles : DecodingRoles {
    MainQueue& queue;
    MessagePorts& ports;
    TelephonyService& telephony;
};

/// What the application needs besides.
struct ApplicationRoles : MonitorRoles {
    Preferences& preferences;
    FileSystem& files;
    Toolkit& toolkit;
};

} // namespace kestrum
