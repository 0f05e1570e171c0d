#pragma once

#include <cstddef>
#include <filesystem>
#include <map>
#include <string>
#include <string_view>
#include <sys/types.h>
#include <vector>

namespace kestrum {

/// A device of the test's own, with the real telephony service on it that replays what the test says.
class Demonstration {
public:
    Demonstration();
    ~Demonstration();
    Demonstration(const Demonstration&) = delete;
    Demonstration& operator=(const Demonstration&) = delete;

    /// Every message is a property list, which an IFX modem sends as a whole display. One comes every 500 ms.
    void serve(const std::vector<std::string>& displays, const std::vector<std::string>& options = {"--loop"});
    void killService();
    void signalService(int number);
    void restartService();

    void offerSave();
    std::filesystem::path diagnosticLogs() const { return _directory / "device/var/log/diagnostics"; }
    /// How many displays have a socket for the log.
    std::size_t displaysSockets() const;
    /// For the programs on this device.
    std::map<std::string, std::string> environment() const;

private:
    std::filesystem::path _directory;
    std::vector<std::string> _arguments;
    pid_t _service = -1;
};

/// A property list of the dictionary whose entries these are.
std::string propertyList(const std::string& entries);
/// A dictionary's entries, sorted as they are given: texts, and dictionaries made by `dictionary`.
std::string text(std::string_view key, std::string_view value);
std::string dictionary(std::string_view key, const std::string& entries);

} // namespace kestrum
