#pragma once

/// What the window's parts measure, in points, and how long they move, in milliseconds. A point is one of Qt's
/// device-independent pixels: the screen's own scale is applied below us.
namespace kestrum::qt {

inline constexpr int kRowHeight = 44; ///< nothing to touch is smaller
inline constexpr int kBarHeight = 48; ///< title bar and toolbar, hairline included
inline constexpr int kInset = 10;
inline constexpr int kGap = 8; ///< between neighbours on a bar
inline constexpr int kSpinner = 20;
inline constexpr int kRing = 2; ///< keyboard focus

/// Rows and bars keep to a column of at most this width: a value far from its key is hard to read across a wide screen.
inline constexpr int kColumn = 720;

inline constexpr double kTextSize = 15, kTitleSize = 17, kStatusSize = 14;

inline constexpr int kSlide = 220; ///< push and pop
inline constexpr int kSheet = 260; ///< the save screen, from below

/// The handset's shape, which the window takes on a desktop.
inline constexpr int kPhoneWidth = 390, kPhoneHeight = 844;
/// The shorter side below which a screen is a handset's, in millimetres, and in points where that is not known.
inline constexpr double kHandsetMillimetres = 110, kHandset = 600;

} // namespace kestrum::qt
