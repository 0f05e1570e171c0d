#pragma once

#include "platform/FileSystem.h"

namespace kestrum {

/// The device's files under a device root: "/" unless KESTRUM_DEVICE_ROOT names another folder.
class LinuxFileSystem final : public FileSystem {
public:
    LinuxFileSystem();

    bool exists(std::string_view path) const override;

    /// $XDG_STATE_HOME/kestrum/DiagnosticLogs; under another device root <root>/var/log/diagnostics.
    std::string diagnosticLogDirectory() const override;

    /// $XDG_CONFIG_HOME/kestrum/<name>, under another device root too: it is the user's.
    Configuration configuration(std::string_view name) const override;

    Stored create(const std::string& path, const std::function<void(const Write&)>& contents) override;

private:
    std::string _root; // without a trailing "/"; empty: the system's root
};

} // namespace kestrum
