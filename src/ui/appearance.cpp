#include "ui/appearance.h"

#include <QApplication>
#include <QStyleFactory>
#include <QToolTip>
#include <algorithm>
#include <cmath>
#include <initializer_list>
#include <optional>

#include "ui/contrast_style.h"

namespace tendril {
namespace {

constexpr double kOpaque = 255;
constexpr double kMidContrast = 3.1;  // a style makes shades of it, and rounds them

double Linear(int channel) {
  const double c = channel / 255.0;
  return c <= 0.04045 ? c / 12.92 : std::pow((c + 0.055) / 1.055, 2.4);
}

double Luminance(const QColor& colour) {
  return 0.2126 * Linear(colour.red()) + 0.7152 * Linear(colour.green()) + 0.0722 * Linear(colour.blue());
}

// The first colour on the way from `colour` to white or to black that has the contrast; nothing when none has.
std::optional<QColor> Towards(bool white, const QColor& colour, const QColor& background, double ratio) {
  const auto at = [&](int steps) {
    const int lightness = colour.lightness() + (white ? steps : -steps);
    return QColor(QColor::fromHsl(colour.hslHue(), colour.hslSaturation(), lightness).rgb());
  };
  const auto reached = [&](int steps) { return ContrastRatio(at(steps), background) >= ratio; };
  int too_few = 0;
  int enough = white ? 255 - colour.lightness() : colour.lightness();
  if (!reached(enough)) return std::nullopt;
  while (enough - too_few > 1) {
    const int middle = (too_few + enough) / 2;
    (reached(middle) ? enough : too_few) = middle;
  }
  return at(enough);
}

// Corrects the colour of `role` against those of all `backgrounds`.
void Correct(QPalette& palette, QPalette::ColorGroup group, QPalette::ColorRole role,
             std::initializer_list<QPalette::ColorRole> backgrounds, double ratio) {
  const QColor old = palette.color(group, role);
  QColor colour = old;
  for (const auto background : backgrounds)
    colour = WithContrast(colour, palette.color(group, background), ratio);
  if (colour != old) palette.setColor(group, role, colour);
}

// Text on the selection is usually white, on a colour of medium lightness. So the selection's colour changes first.
void CorrectSelection(QPalette& palette, QPalette::ColorGroup group) {
  const auto holds = [&palette, group](const QColor& highlight) {
    const auto stands_out = [&](QPalette::ColorRole role) {
      return ContrastRatio(highlight, palette.color(group, role)) >= kEdgeContrast;
    };
    return stands_out(QPalette::Window) && stands_out(QPalette::Base);
  };
  const QColor darker = WithContrast(palette.color(group, QPalette::Highlight),
                                     palette.color(group, QPalette::HighlightedText), kTextContrast);
  if (holds(darker)) palette.setColor(group, QPalette::Highlight, darker);
  Correct(palette, group, QPalette::Highlight, {QPalette::Window, QPalette::Base}, kEdgeContrast);
  Correct(palette, group, QPalette::HighlightedText, {QPalette::Highlight}, kTextContrast);
}

const ContrastStyle* Installed() { return qobject_cast<const ContrastStyle*>(QApplication::style()); }

// Makes the application's style one that draws `dark` or, without it, the system's theme.
void SetTheme(const QString& system_style, std::optional<bool> dark) {
  // A native style draws the system's theme alone.
  QStyle* base = QStyleFactory::create(dark ? QStringLiteral("Fusion") : system_style);
  QApplication::setStyle(new ContrastStyle(base, system_style, dark));
  QToolTip::setPalette(QGuiApplication::palette());
}

}  // namespace

QColor OnBackground(const QColor& colour, const QColor& background) {
  const auto mix = [part = colour.alpha() / kOpaque](int over, int under) {
    return static_cast<int>(std::lround(over * part + under * (1 - part)));
  };
  return {mix(colour.red(), background.red()), mix(colour.green(), background.green()),
          mix(colour.blue(), background.blue())};
}

double ContrastRatio(const QColor& colour, const QColor& background) {
  const auto [dark, light] =
      std::minmax({Luminance(OnBackground(colour, background)), Luminance(background)});
  return (light + 0.05) / (dark + 0.05);
}

QColor WithContrast(const QColor& colour, const QColor& background, double ratio) {
  const QColor opaque = OnBackground(colour, background);
  if (ContrastRatio(opaque, background) >= ratio) return colour;
  const bool lighter = Luminance(opaque) > Luminance(background);
  for (const bool white : {lighter, !lighter}) {
    if (const auto found = Towards(white, opaque, background, ratio)) return *found;
  }
  return ContrastRatio(Qt::white, background) > ContrastRatio(Qt::black, background) ? Qt::white : Qt::black;
}

QPalette WithContrast(QPalette palette) {
  using P = QPalette;
  for (const auto group : {P::Active, P::Inactive}) {
    Correct(palette, group, P::WindowText, {P::Window}, kTextContrast);
    Correct(palette, group, P::Text, {P::Base, P::AlternateBase}, kTextContrast);
    Correct(palette, group, P::ButtonText, {P::Button}, kTextContrast);
    Correct(palette, group, P::ToolTipText, {P::ToolTipBase}, kTextContrast);
    for (const auto role : {P::PlaceholderText, P::Link, P::LinkVisited})
      Correct(palette, group, role, {P::Window, P::Base}, kTextContrast);
    CorrectSelection(palette, group);
    Correct(palette, group, P::Mid, {P::Window, P::Base}, kMidContrast);
  }
  return palette;
}

QPalette ThemePalette(bool dark) {
  const QColor window(dark ? 0x282A2D : 0xEFEFEF);
  const QColor text(dark ? 0xE6E6E6 : 0x000000);
  const QColor disabled_text(dark ? 0x85888D : 0xBEBEBE);
  QPalette palette(dark ? QColor(0x3A3D42) : window, window);
  palette.setColor(QPalette::Base, dark ? QColor(0x1B1C1E) : Qt::white);
  palette.setColor(QPalette::AlternateBase, dark ? QColor(0x222427) : QColor(0xF7F7F7));
  palette.setColor(QPalette::ToolTipBase, dark ? QColor(0x3A3D42) : QColor(0xFFFFDC));
  for (const auto role :
       {QPalette::WindowText, QPalette::Text, QPalette::ButtonText, QPalette::ToolTipText}) {
    palette.setColor(role, text);
    palette.setColor(QPalette::Disabled, role, disabled_text);
  }
  palette.setColor(QPalette::PlaceholderText, dark ? QColor(0xA0A4A8) : QColor(0x6B6B6B));
  palette.setColor(QPalette::Highlight, dark ? QColor(0x2A82DA) : QColor(0x308CC6));
  palette.setColor(QPalette::HighlightedText, Qt::white);
  return palette;
}

bool IsDark(const QPalette& palette) {
  return palette.color(QPalette::Window).lightness() < palette.color(QPalette::WindowText).lightness();
}

void InstallAppearance() {
  if (Installed() == nullptr) SetTheme(QApplication::style()->name(), std::nullopt);
}

bool DarkAppearance() { return IsDark(QGuiApplication::palette()); }

void SetDarkAppearance(bool dark) {
  InstallAppearance();
  if (dark == DarkAppearance()) return;
  const QString system_style = Installed()->SystemStyle();
  SetTheme(system_style, std::nullopt);
  if (dark != DarkAppearance()) SetTheme(system_style, dark);
}

}  // namespace tendril
