#pragma once

#include "insight/keys/KeyEntry.h"

#include <span>

/// Inside insight/keys: the table of each technology, and the words of the tables.
namespace kestrum::keys {

extern const std::span<const SectionEntry> kLte;
extern const std::span<const SectionEntry> kUtran;
extern const std::span<const SectionEntry> kGsm;
extern const std::span<const SectionEntry> kCdma;
extern const std::span<const SectionEntry> kIfx;
// Keys that mean the same in every section of an IFX tree: those of a cell, and the first rows of a modem.
extern const std::span<const KeyEntry> kIfxCell, kIfxModem;

using enum Kind;

inline constexpr InRow kIdentity = InRow::Identity, kSortsRows = InRow::Level;

// Dimensions that several technologies have. The scales are the reporting ranges of the standards.
inline constexpr Dimension kPlain{};
inline constexpr Dimension kRscp{"dBm", Scale{-120, -25}, Measure::Rscp};      // 3GPP TS 25.133, 9.1.1.3
inline constexpr Dimension kEcNo{"dB", Scale{-24, 0}, Measure::EcNo};          // 3GPP TS 25.133, 9.1.2.3
inline constexpr Dimension kRxLevDbm{"dBm", Scale{-110, -48}, Measure::RxLev}; // 3GPP TS 45.008, 8.1.4
inline constexpr Dimension kRxLevIndex{"", Scale{0, 63}, Measure::RxLev};      // 3GPP TS 45.008, 8.1.4

} // namespace kestrum::keys
