#pragma once

#include "LogGenerator/Row.h"

/// The record of the UMTS cell searcher, which four sections read.
namespace kestrum::searcher {

inline constexpr LogCode kCode = 0x417A;
inline constexpr std::size_t kMinimumLength = 16;

inline constexpr Field kReceiveAgc = u16(13); ///< signed, 0.1 dB
inline constexpr Field kCount = u8(15);
inline constexpr Elements kCells{16, 15};
inline constexpr std::size_t kMeasurementSize = 44; ///< bytes; one measurement for each cell, after all cells

} // namespace kestrum::searcher
