#pragma once

#include "platform/Preferences.h"

#include <map>
#include <string>

namespace kestrum {

/// Preferences as INI files, $XDG_CONFIG_HOME/<domain>.ini, section "preferences". A change is announced on the session
/// bus: signal Changed(domain, key) of the interface org.kestrum.Preferences at /org/kestrum/Preferences.
class LinuxPreferences final : public Preferences {
public:
    void setApplicationValue(std::string_view domain, std::string_view key, bool value) override;
    bool synchronize(std::string_view domain) override;
    void postChanged(std::string_view domain, std::string_view key) override;

private:
    std::map<std::string, std::map<std::string, bool>> _set; // by domain: values that the next synchronize writes
};

} // namespace kestrum
