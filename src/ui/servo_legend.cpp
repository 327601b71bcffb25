#include "ui/servo_legend.h"

#include <QFontMetrics>
#include <QPainter>
#include <algorithm>
#include <array>
#include <span>

#include "ui/servo_parts.h"

namespace tendril {
namespace {

constexpr int kSwatchGap = 4;
constexpr int kEntryGap = 5;

struct LegendEntry {
  ScalePart part;
  const char* name;
};
constexpr std::array<LegendEntry, 3> kRangeEntries{
    {{ScalePart::kActual, "actual"}, {ScalePart::kVirtual, "virtual"}, {ScalePart::kStops, "stops"}}};
constexpr std::array<LegendEntry, 2> kLineEntries{
    {{ScalePart::kNeutral, "neutral"}, {ScalePart::kDefault, "default"}}};

// An even number, so that a line stands in the middle.
int SwatchSize(const QFontMetrics& metrics) { return (metrics.ascent() + 1) / 2 * 2; }

int LegendWidth(const LegendEntry& entry, const QFontMetrics& metrics) {
  return SwatchSize(metrics) + kSwatchGap + metrics.horizontalAdvance(QLatin1String(entry.name));
}

int LegendWidth(std::span<const LegendEntry> entries, const QFontMetrics& metrics) {
  int width = -kEntryGap;
  for (const LegendEntry& entry : entries) width += kEntryGap + LegendWidth(entry, metrics);
  return width;
}

// Paints `entries` on the line that begins at `place`.
void PaintEntries(QPainter& painter, std::span<const LegendEntry> entries, QPoint place) {
  const QFontMetrics metrics = painter.fontMetrics();
  const int size = SwatchSize(metrics);
  const int top = place.y() + (metrics.height() - size) / 2;
  for (const LegendEntry& entry : entries) {
    const QRectF swatch(place.x(), top, size, size);
    if (entry.part == ScalePart::kNeutral || entry.part == ScalePart::kDefault) {
      const double beside = (size - kMarkerLine) / 2;
      PaintPlate(painter, swatch);
      PaintLine(painter, entry.part, swatch.adjusted(beside, 1, -beside, -1));
    } else {
      PaintBar(painter, entry.part, swatch);
    }
    painter.drawText(place + QPoint(size + kSwatchGap, metrics.ascent()), QLatin1String(entry.name));
    place.rx() += LegendWidth(entry, metrics) + kEntryGap;
  }
}

}  // namespace

ServoLegend::ServoLegend() {
  setSizePolicy(QSizePolicy::Expanding, QSizePolicy::Fixed);
  setAccessibleName(QStringLiteral("Colours of the servo"));
  setAccessibleDescription(QStringLiteral(
      "Yellow: actual range. Olive: virtual range. Light blue: between the stops. Black line: neutral "
      "position. Pink line: default position. Red: the arm."));
}

QSize ServoLegend::minimumSizeHint() const {
  const QFontMetrics metrics = fontMetrics();
  return {std::max(LegendWidth(kRangeEntries, metrics), LegendWidth(kLineEntries, metrics)),
          metrics.height() * (two_lines_ ? 2 : 1)};
}

void ServoLegend::resizeEvent(QResizeEvent* event) {
  QWidget::resizeEvent(event);
  const QFontMetrics metrics = fontMetrics();
  const bool two_lines =
      LegendWidth(kRangeEntries, metrics) + kEntryGap + LegendWidth(kLineEntries, metrics) > width();
  if (two_lines == two_lines_) return;
  two_lines_ = two_lines;
  updateGeometry();
}

void ServoLegend::paintEvent(QPaintEvent*) {
  QPainter painter(this);
  const QFontMetrics metrics = fontMetrics();
  const int ranges = LegendWidth(kRangeEntries, metrics);
  const int lines = LegendWidth(kLineEntries, metrics);
  if (two_lines_) {
    const int left = (width() - ranges) / 2;
    PaintEntries(painter, kRangeEntries, {left, 0});
    PaintEntries(painter, kLineEntries, {left, metrics.height()});
  } else {
    const int left = (width() - ranges - kEntryGap - lines) / 2;
    PaintEntries(painter, kRangeEntries, {left, 0});
    PaintEntries(painter, kLineEntries, {left + ranges + kEntryGap, 0});
  }
}

}  // namespace tendril
