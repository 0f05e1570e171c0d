#pragma once

#include "platform/Clock.h"

#include <map>
#include <string>

namespace kestrum {

/// A clock that stands still until the test moves it.
class VirtualClock final : public Clock {
public:
    Date now() const override { return date; }
    Zone zoneAt(Date at) const override { return at < zoneChange ? zone : zoneAfterChange; }
    /// Knows the pattern letters y, M, d, H, m and s, each repeated once per digit of its field.
    std::string localText(Date at, std::string_view pattern) const override
    {
        const std::string digits = dateText(at + zoneAt(at).offset);
        const std::map<char, std::string> fields{{'y', digits.substr(0, 4)},  {'M', digits.substr(5, 2)},
                                                 {'d', digits.substr(8, 2)},  {'H', digits.substr(11, 2)},
                                                 {'m', digits.substr(14, 2)}, {'s', digits.substr(17, 2)}};
        std::string text;
        bool quoted = false;
        for (std::size_t i = 0; i < pattern.size(); ++i) {
            const auto field = fields.find(pattern[i]);
            if (pattern[i] == '\'') {
                quoted = !quoted;
            } else if (quoted || field == fields.end()) {
                text += pattern[i];
            } else {
                text += field->second;
                i += field->second.size() - 1;
            }
        }
        return text;
    }

    Date date = Date(std::chrono::sys_days(std::chrono::year{2026} / 11 / 16)) + std::chrono::hours{6} +
                std::chrono::minutes{5} + std::chrono::seconds{42};
    Zone zone{std::chrono::seconds{0}, false};
    Date zoneChange = Date::max();
    Zone zoneAfterChange = zone;
};

} // namespace kestrum
