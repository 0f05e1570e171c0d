#pragma once

#include "LogGenerator/Row.h"

/// The record of the cells ranked for reselection (3GPP TS 25.304), which two sections read.
namespace kestrum::ranking {

inline constexpr LogCode kCode = 0x4005;
inline constexpr std::size_t kMinimumLength = 15;
inline constexpr std::size_t kFirstCell = 15; ///< of either list

} // namespace kestrum::ranking
