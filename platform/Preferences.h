#pragma once

#include <string_view>

namespace kestrum {

/// The store of all applications' preferences.
class Preferences {
public:
    virtual ~Preferences() = default;

    /// Sets a value of the application whose domain is given; it is kept at the next `synchronize`.
    virtual void setApplicationValue(std::string_view domain, std::string_view key, bool value) = 0;

    /// Writes what was set in the domain. False when it cannot be written.
    virtual bool synchronize(std::string_view domain) = 0;

    /// Tells that application that the key changed. Without anybody to tell, nothing happens.
    virtual void postChanged(std::string_view domain, std::string_view key) = 0;
};

/// The device's home-screen application.
inline constexpr std::string_view kHomeScreenDomain = "org.kestrum.homescreen";

} // namespace kestrum
