#pragma once

#include <cstddef>
#include <filesystem>
#include <map>
#include <string>
#include <string_view>
#include <sys/types.h>
#include <vector>

namespace kestrum {

/// A device for the test. The real telephony service on it replays the messages that the test sets.
class Demonstration {
public:
    Demonstration();
    ~Demonstration();
    Demonstration(const Demonstration&) = delete;
    Demonstration& operator=(const Demonstration&) = delete;

    /// Every message is a property list with a whole display, as from an IFX modem. One message is sent every 500 ms.
    void serve(const std::vector<std::string>& displays, const std::vector<std::string>& options = {"--loop"});
    void killService();
    void signalService(int number);
    void restartService();

    void offerSave();
    std::filesystem::path directory() const { return _directory; }
    std::filesystem::path diagnosticLogs() const { return _directory / "device/var/log/diagnostics"; }
    /// The number of displays with a socket for the log.
    std::size_t displaysSockets() const;
    /// The environment of the programs on this device.
    std::map<std::string, std::string> environment() const;

private:
    std::filesystem::path _directory;
    std::vector<std::string> _arguments;
    pid_t _service = -1;
};

/// Writes a channel capture of the messages.
void writeCapture(const std::string& path, const std::vector<std::string>& messages);

/// A property list of a dictionary with these entries.
std::string propertyList(const std::string& entries);
/// The entries of a dictionary in the given order: texts, and dictionaries made by `dictionary`.
std::string text(std::string_view key, std::string_view value);
std::string dictionary(std::string_view key, const std::string& entries);

} // namespace kestrum
