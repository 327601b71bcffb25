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
constexpr std::array<LegendEntry, 6> kEntries{{{ScalePart::kActual, "actual"},
                                               {ScalePart::kVirtual, "virtual"},
                                               {ScalePart::kStops, "stops"},
                                               {ScalePart::kNeutral, "neutral"},
                                               {ScalePart::kDefault, "default"},
                                               {ScalePart::kArm, "arm"}}};
constexpr std::size_t kInNarrowLine = 2;

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
    if (entry.part == ScalePart::kNeutral || entry.part == ScalePart::kDefault ||
        entry.part == ScalePart::kArm) {
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

// Whole lines of equally many entries, as few lines as the width allows.
std::size_t ServoLegend::EntriesInLine() const {
  const QFontMetrics metrics = fontMetrics();
  for (const std::size_t count : {kEntries.size(), kEntries.size() / 2}) {
    int widest = 0;
    for (std::size_t first = 0; first < kEntries.size(); first += count)
      widest = std::max(widest, LegendWidth(std::span(kEntries).subspan(first, count), metrics));
    if (widest <= width()) return count;
  }
  return kInNarrowLine;
}

QSize ServoLegend::minimumSizeHint() const {
  const QFontMetrics metrics = fontMetrics();
  int widest = 0;
  for (std::size_t first = 0; first < kEntries.size(); first += kInNarrowLine)
    widest = std::max(widest, LegendWidth(std::span(kEntries).subspan(first, kInNarrowLine), metrics));
  return {widest, metrics.height() * static_cast<int>(kEntries.size() / in_line_)};
}

void ServoLegend::resizeEvent(QResizeEvent* event) {
  QWidget::resizeEvent(event);
  if (in_line_ == EntriesInLine()) return;
  in_line_ = EntriesInLine();
  updateGeometry();
}

void ServoLegend::paintEvent(QPaintEvent*) {
  QPainter painter(this);
  const QFontMetrics metrics = fontMetrics();
  const auto first_line = std::span(kEntries).first(in_line_);
  const int left = std::max(0, (width() - LegendWidth(first_line, metrics)) / 2);
  for (std::size_t first = 0; first < kEntries.size(); first += in_line_) {
    const int top = static_cast<int>(first / in_line_) * metrics.height();
    PaintEntries(painter, std::span(kEntries).subspan(first, in_line_), {left, top});
  }
}

}  // namespace tendril
