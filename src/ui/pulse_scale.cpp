#include "ui/pulse_scale.h"

#include <QAccessible>
#include <QAccessibleWidget>
#include <QFontMetricsF>
#include <QPainter>
#include <algorithm>
#include <cmath>

#include "ui/controls.h"
#include "ui/hatch.h"
#include "ui/servo_parts.h"

namespace tendril {
namespace {

constexpr double kDash = 4;
constexpr double kDashGap = 3;

// A half circle with its head at the right end for a `side` of 1, at the left end for -1.
void PaintTurn(QPainter& painter, const QRectF& box, int side) {
  const double unit = box.height() / 14;
  const QPointF middle = box.center();
  const QPointF tip = middle + QPointF(4 * side, 3) * unit;
  const QPointF head[] = {tip + QPointF(-2.5, -2.5) * unit, tip, tip + QPointF(2.5, -2.5) * unit};
  painter.setRenderHint(QPainter::Antialiasing);
  painter.setPen(QPen(painter.pen().color(), 1.2 * unit));
  painter.drawArc(QRectF(middle - QPointF(4, 3) * unit, QSizeF(8, 8) * unit), 0, 180 * 16);
  painter.drawPolyline(head, 3);
  painter.setRenderHint(QPainter::Antialiasing, false);
}

// The accessible interface: a picture, described in words.
class ScaleAccessible : public QAccessibleWidget {
 public:
  explicit ScaleAccessible(PulseScale* scale)
      : QAccessibleWidget(scale, QAccessible::Graphic), scale_(*scale) {}

  static QAccessibleInterface* Create(const QString&, QObject* object) {
    auto* scale = qobject_cast<PulseScale*>(object);
    return scale != nullptr ? new ScaleAccessible(scale) : nullptr;
  }

  QString text(QAccessible::Text kind) const override {
    return kind == QAccessible::Description ? scale_.InWords() : QAccessibleWidget::text(kind);
  }

 private:
  const PulseScale& scale_;
};

}  // namespace

PulseScale::PulseScale() {
  [[maybe_unused]] static const bool installed =
      (QAccessible::installFactory(&ScaleAccessible::Create), true);
  setAccessibleName(QStringLiteral("Pulse scale"));
  Describe(this,
           "What the editor shows, as pulse widths. A longer pulse turns the servo to the left: so the left "
           "stop, the "
           "shorter pulse, is the right edge in the picture of the servo.");
  setSizePolicy(QSizePolicy::Expanding, QSizePolicy::Maximum);
}

void PulseScale::ShowValues(const std::optional<ChannelConfig>& shown, const Unstored& unstored) {
  if (shown == shown_ && unstored == unstored_) return;
  shown_ = shown;
  unstored_ = unstored;
  update();
  if (!QAccessible::isActive()) return;
  QAccessibleEvent event(this, QAccessible::DescriptionChanged);
  QAccessible::updateAccessibility(&event);
}

// Only the servo reports the arm to assistive technology.
void PulseScale::MoveArm(Microseconds arm) {
  if (arm == arm_) return;
  arm_ = arm;
  if (shown_) update();
}

QString PulseScale::InWords() const {
  if (!shown_) return QStringLiteral("No channel is chosen.");
  QString words = QStringLiteral("Actual range ");
  for (const PulseFieldText& field : PulseFieldTexts(*shown_))
    words += QString::fromStdString(field.InWords()) + QStringLiteral(" µs, ");
  words += QStringLiteral("arm at %1 µs. A longer pulse turns the servo to the left.").arg(arm_);
  return unstored_.Any() ? words + QLatin1Char(' ') + QString::fromStdString(unstored_.Sentence()) : words;
}

ScaleRoom PulseScale::Room() const {
  const QFontMetricsF metrics(font());
  return {
      static_cast<double>(width()), static_cast<double>(height()), metrics.height(),
      [metrics](const std::string& text) { return metrics.horizontalAdvance(QString::fromStdString(text)); }};
}

QSize PulseScale::sizeHint() const {
  return {minimumSizeHint().width(), static_cast<int>(MaximumScaleHeight(Room().line_height))};
}

QSize PulseScale::minimumSizeHint() const {
  const ScaleRoom room = Room();
  return {static_cast<int>(std::ceil(MinimumScaleWidth(room))),
          static_cast<int>(std::ceil(MinimumScaleHeight(room.line_height)))};
}

void PulseScale::paintEvent(QPaintEvent*) {
  QPainter painter(this);
  std::optional<ScaleValues> values;
  if (shown_) values = {*shown_, arm_};
  const std::vector<ScaleElement> elements = LayOutPulseScale(values, Room());
  for (const ScaleElement& element : elements) {
    if (IsUnstored(element.part)) {
      PaintUnstored(painter, element, elements);
    } else {
      Paint(painter, element);
    }
  }
}

bool PulseScale::IsUnstored(ScalePart part) const {
  switch (part) {
    case ScalePart::kActual:
      return unstored_.Has(Parameter::kActualRange);
    case ScalePart::kVirtual:
      return unstored_.Has(Parameter::kVirtualRange);
    case ScalePart::kStops:
      return unstored_.Has(Parameter::kLeftStop) || unstored_.Has(Parameter::kRightStop);
    case ScalePart::kDefault:
      return unstored_.Has(Parameter::kDefaultPosition);
    case ScalePart::kNeutral:
      return unstored_.Has(Parameter::kNeutralTrim);
    case ScalePart::kAxis:
    case ScalePart::kArm:
      break;
  }
  return false;
}

// Bars are hatched beside their numbers; lines, which are too thin for it, are dashed.
void PulseScale::PaintUnstored(QPainter& painter, const ScaleElement& element,
                               const std::vector<ScaleElement>& elements) const {
  if (element.shape == ScaleShape::kLine) {
    ScaleElement dash = element;
    for (dash.y = element.y; dash.y < element.Bottom(); dash.y += kDash + kDashGap) {
      dash.height = std::min(kDash, element.Bottom() - dash.y);
      Paint(painter, dash);
    }
    return;
  }
  Paint(painter, element);
  if (element.shape != ScaleShape::kBar) return;
  const QRectF box(element.x, element.y, element.width, element.height);
  QRegion beside_numbers(box.toAlignedRect());
  for (const ScaleElement& number : elements) {
    if (number.part == element.part && number.shape == ScaleShape::kNumber)
      beside_numbers -= QRectF(number.x - 2, number.y, number.width + 4, number.height).toAlignedRect();
  }
  painter.save();
  painter.setClipRegion(beside_numbers);
  PaintHatch(painter, box, Qt::black);
  painter.restore();
}

void PulseScale::Paint(QPainter& painter, const ScaleElement& element) const {
  const QRectF box(element.x, element.y, element.width, element.height);
  const QColor text = palette().color(shown_ ? QPalette::WindowText : QPalette::PlaceholderText);
  painter.setPen(element.shape == ScaleShape::kNumber ? Qt::black : text);
  switch (element.shape) {
    case ScaleShape::kBar:
      PaintBar(painter, element.part, box);
      break;
    case ScaleShape::kLine:
      if (element.part == ScalePart::kAxis) {
        painter.fillRect(box, text);
      } else {
        PaintLine(painter, element.part, box);
      }
      break;
    case ScaleShape::kTurnRight:
      PaintTurn(painter, box, 1);
      break;
    case ScaleShape::kTurnLeft:
      PaintTurn(painter, box, -1);
      break;
    case ScaleShape::kNumber:
    case ScaleShape::kText:
      painter.drawText(box, Qt::AlignCenter | Qt::TextSingleLine, QString::fromStdString(element.text));
      break;
  }
}

}  // namespace tendril
