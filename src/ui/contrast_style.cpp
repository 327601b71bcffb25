#include "ui/contrast_style.h"

#include <QPainter>
#include <QStyleOption>
#include <algorithm>
#include <array>
#include <cmath>

#include "ui/appearance.h"

namespace tendril {
namespace {

constexpr double kCornerRadius = 2;
constexpr int kFocusWidth = 2;
constexpr int kSpinBoxTop = 1;  // of a spin box's outline
constexpr int kFrameTop = 3;    // of a group box, below its title

// Far more than the controls of a window have.
constexpr qsizetype kMaxKeptPalettes = 500;

// Lines that are drawn translucent or blurred need more contrast than others.
constexpr double kFaintLineContrast = 4.5;

// How Fusion makes an outline of the window's colour: this much darker, as QColor::lighter takes it.
struct Outline {
  QStyle::PrimitiveElement element;
  int shade;
  bool surrounds;  // the whole control
  double contrast = kEdgeContrast;
};
constexpr int kShade = 140;
constexpr std::array<Outline, 7> kOutlines{
    {{QStyle::PE_PanelButtonCommand, kShade, true},
     {QStyle::PE_FrameLineEdit, kShade, true},
     {QStyle::PE_FrameMenu, kShade, false},
     {QStyle::PE_PanelMenu, 160, false},
     {QStyle::PE_Frame, kShade, false},
     {QStyle::PE_IndicatorCheckBox, 127, false},
     {QStyle::PE_IndicatorRadioButton, 150, false, kFaintLineContrast}}};

// Draws a line of whole device pixels along the inside of `rect`.
void DrawLine(QPainter& painter, const QRectF& rect, const QColor& colour, int thickness = 1) {
  const QTransform device = painter.deviceTransform();
  const double width = std::max(1.0, std::floor(thickness * device.m11()));
  const QRectF exact = device.mapRect(rect);
  const QPointF inset(width / 2, width / 2);
  const QRectF snapped(QPointF(std::ceil(exact.left()), std::ceil(exact.top())) + inset,
                       QPointF(std::floor(exact.right()), std::floor(exact.bottom())) - inset);
  painter.save();
  painter.setRenderHint(QPainter::Antialiasing);
  painter.setPen(QPen(colour, width / device.m11()));
  painter.setBrush(Qt::NoBrush);
  painter.drawRoundedRect(device.inverted().mapRect(snapped), kCornerRadius, kCornerRadius);
  painter.restore();
}

QColor FocusColour(const QPalette& palette) {
  return WithContrast(palette.color(QPalette::Highlight), palette.color(QPalette::Window), kEdgeContrast);
}

// The outline of what has the focus. Buttons show it only to users who move it by keys.
void DrawFocus(QPainter& painter, const QStyleOption& option, const QRect& outline, bool button) {
  const auto shown = button
                         ? QStyle::State_HasFocus | QStyle::State_KeyboardFocusChange | QStyle::State_Enabled
                         : QStyle::State_HasFocus | QStyle::State_Enabled;
  if ((option.state & shown) == shown) DrawLine(painter, outline, FocusColour(option.palette), kFocusWidth);
}

}  // namespace

ContrastStyle::ContrastStyle(QStyle* base, const QString& system_style, std::optional<bool> dark)
    : QProxyStyle(base),
      system_style_(system_style),
      dark_(dark),
      draws_edges_(baseStyle()->inherits("QFusionStyle")) {}

void ContrastStyle::polish(QPalette& palette) {
  QProxyStyle::polish(palette);
  palette = WithContrast(dark_ ? ThemePalette(*dark_) : palette);
}

void ContrastStyle::drawPrimitive(PrimitiveElement element, const QStyleOption* option, QPainter* painter,
                                  const QWidget* widget) const {
  if (element == PE_FrameStatusBarItem) return;  // a lone line at the window's end, in the style of Windows
  if (!draws_edges_) return QProxyStyle::drawPrimitive(element, option, painter, widget);
  if (element == PE_FrameGroupBox) {
    const int title = std::max(pixelMetric(PM_ExclusiveIndicatorHeight), option->fontMetrics.height());
    return DrawLine(*painter, option->rect.adjusted(0, title + kFrameTop, 0, 0),
                    option->palette.color(QPalette::Mid));
  }
  if (element == PE_FrameFocusRect) {
    if (option->state & State_KeyboardFocusChange)
      DrawLine(*painter, option->rect, FocusColour(option->palette));
    return;
  }
  const auto outline = std::ranges::find(kOutlines, element, &Outline::element);
  if (outline == kOutlines.end()) return QProxyStyle::drawPrimitive(element, option, painter, widget);
  const auto draw = [&](auto edged) {
    edged.palette = WithEdges(edged.palette, outline->shade, outline->contrast);
    QProxyStyle::drawPrimitive(element, &edged, painter, widget);
  };
  if (const auto* button = qstyleoption_cast<const QStyleOptionButton*>(option)) {
    draw(*button);
  } else if (const auto* frame = qstyleoption_cast<const QStyleOptionFrame*>(option)) {
    draw(*frame);
  } else {
    draw(*option);
  }
  if (outline->surrounds) DrawFocus(*painter, *option, option->rect, element == PE_PanelButtonCommand);
}

void ContrastStyle::drawControl(ControlElement element, const QStyleOption* option, QPainter* painter,
                                const QWidget* widget) const {
  const auto* button = qstyleoption_cast<const QStyleOptionButton*>(option);
  if (draws_edges_ || element != CE_PushButtonBevel || button == nullptr ||
      !button->features.testFlag(QStyleOptionButton::DefaultButton)) {
    return QProxyStyle::drawControl(element, option, painter, widget);
  }
  // In the style of Windows the default button pulses: it is painted again and again while its dialog is open.
  QStyleOptionButton still = *button;
  still.styleObject = nullptr;
  QProxyStyle::drawControl(element, &still, painter, widget);
}

void ContrastStyle::drawComplexControl(ComplexControl control, const QStyleOptionComplex* option,
                                       QPainter* painter, const QWidget* widget) const {
  const auto draw = [&](auto edged, double contrast) {
    edged.palette = WithEdges(edged.palette, kShade, contrast);
    QProxyStyle::drawComplexControl(control, &edged, painter, widget);
  };
  const auto* spin = qstyleoption_cast<const QStyleOptionSpinBox*>(option);
  const auto* slider = qstyleoption_cast<const QStyleOptionSlider*>(option);  // of a scroll bar too
  if (draws_edges_ && spin != nullptr) {
    draw(*spin, kEdgeContrast);
    DrawFocus(*painter, *option, option->rect.adjusted(0, kSpinBoxTop, 0, 0), false);
  } else if (draws_edges_ && slider != nullptr) {
    draw(*slider, control == CC_ScrollBar ? kFaintLineContrast : kEdgeContrast);
  } else {
    QProxyStyle::drawComplexControl(control, option, painter, widget);
  }
}

QPalette ContrastStyle::WithEdges(const QPalette& palette, int shade, double contrast) const {
  if (edged_.size() > kMaxKeptPalettes) edged_.clear();
  QPalette& kept = edged_[{palette.cacheKey(), shade}];
  if (kept.resolveMask() == 0) {
    kept = palette;
    for (const auto group : {QPalette::Active, QPalette::Inactive}) {
      const QColor edge =
          WithContrast(palette.color(group, QPalette::Mid), palette.color(group, QPalette::Window), contrast);
      kept.setColor(group, QPalette::Window, edge.lighter(shade));
    }
  }
  QPalette edged = kept;
  edged.setCurrentColorGroup(palette.currentColorGroup());  // it is not part of the key
  return edged;
}

}  // namespace tendril
