#pragma once

#include "platform/Preferences.h"

#include <functional>
#include <initializer_list>
#include <string>
#include <string_view>
#include <vector>

namespace kestrum {

/// Stores the calls in order: "set domain key false", "synchronize domain", "changed domain key".
class RecordingPreferences final : public Preferences {
public:
    void setApplicationValue(std::string_view domain, std::string_view key, bool value) override
    {
        done({"set", domain, key, value ? "true" : "false"});
    }
    bool synchronize(std::string_view domain) override
    {
        done({"synchronize", domain});
        return writable;
    }
    void postChanged(std::string_view domain, std::string_view key) override { done({"changed", domain, key}); }

    std::vector<std::string> calls;
    bool writable = true;
    std::function<void()> onCall; ///< runs before a call is stored

private:
    void done(std::initializer_list<std::string_view> words)
    {
        if (onCall)
            onCall();
        std::string call;
        for (const auto word : words)
            (call += call.empty() ? "" : " ") += word;
        calls.push_back(call);
    }
};

} // namespace kestrum
