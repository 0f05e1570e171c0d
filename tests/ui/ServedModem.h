#pragma once

#include "doubles/MonitorDoubles.h"
#include "platform/TelephonyService.h"

#include <chrono>
#include <optional>
#include <string_view>

namespace kestrum {

/// The telephony service and its IFX modem on the monitor's doubles. The test starts and stops them.
class ServedModem {
public:
    static constexpr const char* kCommands = "vox.commands";

    /// `lists` are the property lists of the application's roles.
    ServedModem(MonitorDoubles& doubles, PropertyLists& lists) : _doubles(doubles), _lists(lists) {}

    void serve(std::string_view technology = kVoxLogChannelTechnology_IFX)
    {
        const auto reply = wired(makeDictionary({{"GetTechnology", technology}}));
        _doubles.ports.serve(kCommands, [reply](const MemoryPorts::Request& request) {
            const bool asked = request.reply == RemotePort::Reply::Awaited;
            return MemoryPorts::Answer{0, asked ? std::optional(reply) : std::nullopt};
        });
    }
    void kill() { _doubles.ports.kill(kCommands); }

    /// Sends a message with the whole display. False when no port listens.
    bool send(const Value& display)
    {
        return _doubles.ports.send(std::string(kLogChannelServiceName), 0, textOf(wired(display).bytes()));
    }
    /// The same, followed by the refresh that reads it.
    bool show(const Value& display)
    {
        using namespace std::chrono_literals;
        const bool sent = send(display);
        _doubles.queue.advance(2s);
        return sent;
    }

    /// At least two entries, so that they are not taken for one of the modem's wrapper dictionaries.
    static Value cell(const char* rssi)
    {
        return makeDictionary({{"RSSI", rssi}, {"Band", makeDictionary({{"Now", "3"}, {"Before", "8"}})}});
    }

private:
    Data wired(const Value& list)
    {
        _doubles.propertyLists.parsed[describe(list)] = list; // needed by doubles of the property lists
        return _lists.toXml(list).value();
    }

    MonitorDoubles& _doubles;
    PropertyLists& _lists;
};

/// The precondition of Save: the marker of an internal installation.
inline constexpr const char* kInternalInstall = "/NorvaneInternal/Library/PreferenceBundles/Carrier Settings.bundle";

} // namespace kestrum
