// The colours of the window: the system's, or those of the other theme, corrected where text or edges lack contrast.
#pragma once

#include <QColor>
#include <QPalette>

namespace tendril {

// The least contrast ratios of text, and of what shows where a control is or which state it has.
inline constexpr double kTextContrast = 4.5;
inline constexpr double kEdgeContrast = 3;

// The opaque colour that a translucent one shows on `background`.
QColor OnBackground(const QColor& colour, const QColor& background);

// The contrast ratio of WCAG 2.1, 1 to 21. A translucent `colour` lies on `background`.
double ContrastRatio(const QColor& colour, const QColor& background);

// `colour` with the least change of lightness that gives it this contrast to `background`. It gets lighter when it is
// lighter than the background, and darker when it is darker, unless only the other direction has room for `ratio`.
// Returns an opaque colour.
QColor WithContrast(const QColor& colour, const QColor& background, double ratio);

// `palette` with the least changes that give every pair of text and background kTextContrast, and the selection and the
// edges (QPalette::Mid) kEdgeContrast. Colours of disabled controls stay as they are.
QPalette WithContrast(QPalette palette);

// The palette of a theme, for a system that has the other one.
QPalette ThemePalette(bool dark);

// Whether the palette has light text on a dark background.
bool IsDark(const QPalette& palette);

// Corrects the application's colours, now and whenever the system changes them. Calls after the first do nothing.
void InstallAppearance();

// Whether the windows are dark. At first they are as the system is.
bool DarkAppearance();
// Makes all windows dark or light, for this session.
void SetDarkAppearance(bool dark);

}  // namespace tendril
