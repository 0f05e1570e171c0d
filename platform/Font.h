#pragma once

#include <string_view>

namespace kestrum {

struct Font {
    std::string_view family; ///< empty: the system's own
    double size;
    bool bold = false;
    friend bool operator==(const Font&, const Font&) = default;
};

inline constexpr Font systemFont(double size)
{
    return {"", size};
}
inline constexpr Font boldSystemFont(double size)
{
    return {"", size, true};
}

} // namespace kestrum
