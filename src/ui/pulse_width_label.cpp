#include "ui/pulse_width_label.h"

#include <QPainter>
#include <QResizeEvent>
#include <algorithm>

#include "simulator/marks.h"
#include "ui/controls.h"
#include "ui/hatch.h"

namespace tendril {
namespace {

constexpr double kUnstoredBand = 4;  // high, below the text
constexpr int kSignRoom = 12;
constexpr int kLeastSignRoom = 10;
constexpr double kSignSize = 8;

QString InWords(int first, int second) { return QStringLiteral("%1 to %2 µs").arg(first).arg(second); }
QString InBrief(int first, int second) { return QStringLiteral("%1–%2").arg(first).arg(second); }

}  // namespace

PulseWidthLabel::PulseWidthLabel() {
  QFont bold = font();
  bold.setBold(true);
  setFont(bold);
  setSizePolicy(QSizePolicy::Preferred, QSizePolicy::Preferred);
}

void PulseWidthLabel::ShowRange(const PulsePair& ends) {
  Show(InWords(ends[0], ends[1]), InBrief(ends[0], ends[1]));
}

void PulseWidthLabel::ShowPosition(Microseconds position) {
  const QString text = QStringLiteral("%1 µs").arg(position);
  Show(text, text);
}

void PulseWidthLabel::Show(const QString& full, const QString& brief) {
  full_ = full;
  brief_ = brief;
  Fit();
}

void PulseWidthLabel::ShowStored(bool stored) {
  if (stored == stored_) return;
  stored_ = stored;
  update();
}

void PulseWidthLabel::ShowDiffers(const QString& words) {
  DescribeDifference(this, words);
  if (differs_ == !words.isEmpty()) return;
  differs_ = !differs_;
  update();
}

void PulseWidthLabel::paintEvent(QPaintEvent* event) {
  QLabel::paintEvent(event);
  if (stored_ && !differs_) return;
  QPainter painter(this);
  const QColor colour = palette().color(foregroundRole());
  if (differs_) PaintDiffers(painter, QRectF(0, (height() - kSignSize) / 2, kSignSize, kSignSize), colour);
  if (stored_) return;
  const double bottom = (height() + fontMetrics().height()) / 2.0;
  const double top = std::min(bottom - 1, height() - kUnstoredBand);
  PaintHatch(painter,
             QRectF(contentsMargins().left(), top, fontMetrics().horizontalAdvance(text()), kUnstoredBand),
             colour);
}

// All digits are equally wide, and no pulse width has more of them.
QSize PulseWidthLabel::sizeHint() const {
  return {fontMetrics().horizontalAdvance(InWords(kMaxPulseWidth, kMaxPulseWidth)) + 1 + kSignRoom,
          fontMetrics().height()};
}

QSize PulseWidthLabel::minimumSizeHint() const {
  return {fontMetrics().horizontalAdvance(InBrief(kMaxPulseWidth, kMaxPulseWidth)) + 1 + kLeastSignRoom,
          fontMetrics().height()};
}

void PulseWidthLabel::resizeEvent(QResizeEvent* event) {
  QLabel::resizeEvent(event);
  Fit();
}

// All ranges change their form at the same width.
void PulseWidthLabel::Fit() {
  const bool narrow = width() < sizeHint().width();
  setContentsMargins(narrow ? kLeastSignRoom : kSignRoom, 0, 0, 0);
  setText(narrow ? brief_ : full_);
}

}  // namespace tendril
