#pragma once

#include <string_view>

namespace kestrum {

/// The store of all applications' preferences.
class Preferences {
public:
    virtual ~Preferences() = default;

    /// Sets a value of the application with that domain. `synchronize` writes it.
    virtual void setApplicationValue(std::string_view domain, std::string_view key, bool value) = 0;

    /// Writes the values that were set in the domain. False when they cannot be written.
    virtual bool synchronize(std::string_view domain) = 0;

    /// Notifies that application that the key changed. Does nothing when no application listens.
    virtual void postChanged(std::string_view domain, std::string_view key) = 0;
};

/// The device's home-screen application.
inline constexpr std::string_view kHomeScreenDomain = "org.kestrum.homescreen";

} // namespace kestrum
