#pragma once

/// Sizes of the window's parts in points, and durations of its animations in milliseconds. A point is one of Qt's
/// device-independent pixels; Qt applies the screen's scale.
namespace kestrum::qt {

inline constexpr int kRowHeight = 44; ///< the minimum height of everything that can be touched
inline constexpr int kBarHeight = 48; ///< title bar and toolbar, including the hairline
inline constexpr int kInset = 10;
inline constexpr int kGap = 8; ///< between neighbours on a bar
inline constexpr int kSpinner = 20;
inline constexpr int kRing = 2; ///< keyboard focus

/// The maximum width of rows and bars: on a wider row the value is too far from its key to read them together.
inline constexpr int kColumn = 720;

inline constexpr double kTextSize = 15, kTitleSize = 17, kStatusSize = 14;

inline constexpr int kSlide = 220; ///< push and pop
inline constexpr int kSheet = 260; ///< the save screen, from below

/// A handset's proportions, for the window on a desktop.
inline constexpr int kPhoneWidth = 390, kPhoneHeight = 844;
/// A screen whose shorter side is below this is a handset's: in millimetres, or in points where the size is not
/// known.
inline constexpr double kHandsetMillimetres = 110, kHandset = 600;

} // namespace kestrum::qt
