#include "simulator/servo_simulator.h"

#include <QAccessible>
#include <QAccessibleWidget>
#include <QFontMetricsF>
#include <QKeyEvent>
#include <QPainter>
#include <algorithm>
#include <array>
#include <cmath>
#include <exception>

#include "simulator/marks.h"

namespace tendril {
namespace {

constexpr int kMargin = 5;  // around the picture
constexpr double kCornerRadius = 4;
constexpr int kPressedShade = 112;  // percent, as QColor::darker takes it
constexpr int kHoverShade = 106;
constexpr double kFocusRingWidth = 1.5;
constexpr int kLeastLightness = 152;  // of a window to which the blue of the selection has a contrast of 3
constexpr double kSelectionOutline = 1;
constexpr double kMarkSize = 12;  // of the check mark of the selection
constexpr double kMarkLine = 1.6;
constexpr double kAngleTextScale = 0.75;  // of the control's font
constexpr double kMinTextScale = 0.8;     // of a text's full size
constexpr double kMinTextPixels = 7;
constexpr double kPlateRadius = 2;
constexpr double kPlateOutline = 1;

QPointF ToPoint(DialPoint point) { return {point.x, point.y}; }

QSize SquareFor(const DialSizes& sizes, int small, int medium, int normal) {
  const int side = sizes == kSmallSizes ? small : sizes == kMediumSizes ? medium : normal;
  return {side, side};
}

void PaintFocus(QPainter& painter, const QRectF& rect, const QColor& colour) {
  const double middle = kMargin / 2.0;
  painter.setPen(QPen(colour, kFocusRingWidth));
  painter.setBrush(Qt::NoBrush);
  painter.drawRoundedRect(rect.adjusted(middle, middle, -middle, -middle), kCornerRadius, kCornerRadius);
}

// Draws the elements of a dial. The top left corner of the picture is the origin of the painter.
class DialPainter {
 public:
  DialPainter(QPainter& painter, double picture_width, bool bold_caption)
      : painter_(painter),
        scale_(painter.deviceTransform().m11()),
        picture_width_(picture_width),
        bold_caption_(bold_caption),
        font_(painter.font()) {}

  void Stroke(const DialElement& element) {
    switch (element.shape) {
      case DialShape::kBox:
        Box(element);
        break;
      case DialShape::kPie:
        Pie(element);
        break;
      case DialShape::kLine:
        Line(element);
        break;
      case DialShape::kLineOutline:
        LineOutline(element);
        break;
      case DialShape::kText:
        Text(element);
        break;
    }
  }

 private:
  // `box` enlarged on all sides by `growth`, in whole device pixels: an outline is equally wide on each side.
  QRectF Grown(const DialElement& box, double growth) const {
    const double grown = std::round(growth * scale_) / scale_;
    return QRectF(ToPoint(box.from), ToPoint(box.to)).adjusted(-grown, -grown, grown, grown);
  }

  void Box(const DialElement& box) {
    const double straddling = box.line_width / 2;
    painter_.setRenderHint(QPainter::Antialiasing, false);  // keeps upright edges crisp
    painter_.fillRect(Grown(box, straddling + box.outline_width), ToColour(box.outline));
    painter_.fillRect(Grown(box, -straddling), ToColour(box.fill));
    painter_.setRenderHint(QPainter::Antialiasing);
  }

  void Pie(const DialElement& pie) {
    constexpr double kSixteenths = 180 * 16 / kDialPi;  // QPainter's unit of angle
    painter_.setPen(QPen(ToColour(pie.outline), pie.line_width, Qt::SolidLine, Qt::FlatCap, Qt::RoundJoin));
    painter_.setBrush(ToColour(pie.fill));
    painter_.drawPie(QRectF(pie.from.x - pie.radius, pie.from.y - pie.radius, 2 * pie.radius, 2 * pie.radius),
                     static_cast<int>(std::lround(pie.start_angle * kSixteenths)),
                     static_cast<int>(std::lround(pie.sweep_angle * kSixteenths)));
  }

  void Line(const DialElement& line) {
    const Qt::PenCapStyle cap = line.part == DialPart::kArm ? Qt::RoundCap : Qt::FlatCap;
    const auto draw = [&](DialColour colour, double width) {
      painter_.setPen(QPen(ToColour(colour), width, Qt::SolidLine, cap));
      painter_.drawLine(ToPoint(line.from), ToPoint(line.to));
    };
    if (line.outline_width > 0) draw(line.outline, line.line_width + 2 * line.outline_width);
    draw(line.fill, line.line_width);
  }

  void LineOutline(const DialElement& line) {
    const QLineF axis(ToPoint(line.from), ToPoint(line.to));
    const QLineF normal = axis.normalVector().unitVector();
    const QPointF offset = QPointF(normal.dx(), normal.dy()) * ((line.line_width + line.outline_width) / 2);
    const std::array<QPointF, 4> contour = {axis.p1() + offset, axis.p2() + offset, axis.p2() - offset,
                                            axis.p1() - offset};
    painter_.setPen(QPen(ToColour(line.fill), line.outline_width, Qt::SolidLine, Qt::FlatCap, Qt::MiterJoin));
    painter_.setBrush(Qt::NoBrush);
    painter_.drawConvexPolygon(contour.data(), static_cast<int>(contour.size()));
  }

  // The text has the size of the control's font, or a smaller one to fit into its room. Text that would become too
  // small to read extends beyond its room instead, up to the width of the picture. The plate keeps it readable there.
  void Text(const DialElement& element) {
    const bool caption = element.part == DialPart::kCaption;
    const double full_pixels = QFontInfo(font_).pixelSize() * (caption ? 1 : kAngleTextScale);
    const double min_pixels = std::max(full_pixels * kMinTextScale, kMinTextPixels);
    const double padding = std::round(full_pixels / 6);
    QString text = QString::fromStdString(element.text);
    QFont font = font_;
    font.setBold(caption && bold_caption_);
    font.setPixelSize(std::max(1, static_cast<int>(full_pixels)));
    double width = QFontMetricsF(font).horizontalAdvance(text);
    if (const double room = element.room - 2 * padding; width > room) {
      font.setPixelSize(static_cast<int>(std::max(min_pixels, full_pixels * room / width)));
      text = QFontMetricsF(font).elidedText(text, Qt::ElideRight,
                                            picture_width_ - 2 * (padding + kPlateOutline));
      width = QFontMetricsF(font).horizontalAdvance(text);
    }
    const double plate_width = width + 2 * padding;
    const QRectF plate(element.from.x - plate_width / 2, element.from.y, plate_width,
                       QFontMetricsF(font).height());
    const bool extends = plate_width > element.room;
    if (extends || !caption) {
      painter_.setPen(extends ? QPen(ToColour(kBodyOutline), kPlateOutline) : QPen(Qt::NoPen));
      painter_.setBrush(ToColour(element.fill));
      painter_.drawRoundedRect(plate, kPlateRadius, kPlateRadius);
    }
    painter_.setFont(font);
    painter_.setPen(Qt::black);
    painter_.drawText(plate, Qt::AlignCenter | Qt::TextSingleLine, text);
  }

  QPainter& painter_;
  const double scale_;  // device pixels in a unit
  const double picture_width_;
  const bool bold_caption_;
  const QFont font_;
};

// The accessible interface: a button with a name, and with the pulse width of the arm as its value.
class ServoAccessible : public QAccessibleWidget, public QAccessibleValueInterface {
 public:
  explicit ServoAccessible(ServoSimulator* servo)
      : QAccessibleWidget(servo, QAccessible::Button), servo_(*servo) {}

  static QAccessibleInterface* Create(const QString&, QObject* object) {
    auto* servo = qobject_cast<ServoSimulator*>(object);
    return servo != nullptr ? new ServoAccessible(servo) : nullptr;
  }

  void* interface_cast(QAccessible::InterfaceType type) override {
    if (type == QAccessible::ValueInterface) return static_cast<QAccessibleValueInterface*>(this);
    return QAccessibleWidget::interface_cast(type);
  }

  QString text(QAccessible::Text kind) const override {
    if (kind == QAccessible::Value) return QStringLiteral("%1 µs").arg(servo_.dial().arm_pulse());
    if (kind == QAccessible::Description && servo_.dial().selected())
      return DescribeSelected(servo_.accessibleDescription());
    if (kind == QAccessible::Name && servo_.accessibleName().isEmpty()) {
      QString name = QString::fromStdString(servo_.dial().caption());
      const QLatin1String abbreviation("CHAN ");
      if (name.startsWith(abbreviation)) name.replace(0, abbreviation.size(), QLatin1String("Channel "));
      return name;
    }
    return QAccessibleWidget::text(kind);
  }

  QAccessible::State state() const override {
    QAccessible::State state = QAccessibleWidget::state();
    state.selectable = true;
    state.selected = servo_.dial().selected();
    state.pressed = servo_.isDown();
    return state;
  }

  QStringList actionNames() const override { return {pressAction(), setFocusAction()}; }

  void doAction(const QString& action) override {
    if (action == pressAction()) {
      servo_.click();
    } else {
      QAccessibleWidget::doAction(action);
    }
  }

  QVariant currentValue() const override { return static_cast<qlonglong>(servo_.dial().arm_pulse()); }
  void setCurrentValue(const QVariant&) override {}  // only the container moves the arm
  QVariant minimumValue() const override { return kMinPulseWidth; }
  QVariant maximumValue() const override { return kMaxPulseWidth; }
  QVariant minimumStepSize() const override { return kPulseResolution; }

 private:
  ServoSimulator& servo_;
};

}  // namespace

QColor ToColour(DialColour colour) {
  return QColor(static_cast<int>(colour & 0xFF), static_cast<int>(colour >> 8 & 0xFF),
                static_cast<int>(colour >> 16 & 0xFF));
}

void PaintSelection(QPainter& painter, const QRectF& rect, const QPalette& palette, const QColor& inside,
                    bool focus) {
  const QColor blue = ToColour(kSelectedBackground);
  const auto paint_all = [&](const QColor& colour, double inset) {
    painter.setBrush(colour);
    painter.drawRoundedRect(rect.adjusted(inset, inset, -inset, -inset), kCornerRadius, kCornerRadius);
  };
  const bool too_dark = palette.color(QPalette::Window).lightness() < kLeastLightness;
  painter.setRenderHint(QPainter::Antialiasing);
  painter.setPen(Qt::NoPen);
  if (too_dark) paint_all(palette.color(QPalette::WindowText), 0);
  paint_all(blue, too_dark ? kSelectionOutline : 0);
  painter.fillRect(rect.adjusted(kMargin, kMargin, -kMargin, -kMargin), inside);

  const QRectF corner(rect.right() - kMargin - kMarkSize, rect.top() + kMargin, kMarkSize, kMarkSize);
  painter.fillRect(corner, blue);
  painter.setPen(QPen(Qt::white, kMarkLine, Qt::SolidLine, Qt::RoundCap, Qt::RoundJoin));
  std::array<QPointF, 3> mark{{{0.2, 0.45}, {0.45, 0.7}, {0.85, 0.15}}};
  for (QPointF& point : mark) point = corner.topLeft() + point * kMarkSize;
  painter.drawPolyline(mark.data(), static_cast<int>(mark.size()));
  if (focus) PaintFocus(painter, rect, Qt::white);
}

QString DescribeSelected(const QString& more) {
  return QStringLiteral("Selected") + (more.isEmpty() ? QString() : QStringLiteral(". ") + more);
}

ServoSimulator::ServoSimulator(QWidget* parent)
    : QAbstractButton(parent), announced_pulse_(dial_.arm_pulse()) {
  [[maybe_unused]] static const bool installed =
      (QAccessible::installFactory(&ServoAccessible::Create), true);
  setAttribute(Qt::WA_Hover);
  setFocusPolicy(Qt::StrongFocus);
  setSizePolicy(QSizePolicy::Expanding, QSizePolicy::Expanding);
  connect(this, &QAbstractButton::clicked, this, &ServoSimulator::Clicked);
}

void ServoSimulator::SetMovingArm(std::int32_t degrees) {
  dial_.SetMovingArm(degrees);
  AnnounceArm();
}

void ServoSimulator::SetDisplayServoText(bool display) {
  dial_.SetDisplayServoText(display);
  DrawServo();
  Q_EMIT DisplayServoTextChanged();
}

void ServoSimulator::SetMovingArmPosition(std::int32_t degrees) {
  SetMovingArm(degrees);
  DrawServo();
}

void ServoSimulator::SetMovingArmPositionUS(std::int32_t microseconds) {
  dial_.SetMovingArmPositionUS(microseconds);
  AnnounceArm();
  DrawServo();
}

void ServoSimulator::SetNeutralPosition(std::int32_t degrees) {
  dial_.SetNeutralPosition(degrees);
  DrawServo();
}

void ServoSimulator::SetDefaultPosition(std::int32_t degrees) {
  dial_.SetDefaultPosition(degrees);
  DrawServo();
}

void ServoSimulator::SetNeutralPositionUS(std::int32_t microseconds) {
  dial_.SetNeutralPositionUS(microseconds);
  DrawServo();
}

void ServoSimulator::SetDefaultPositionUS(std::int32_t microseconds) {
  dial_.SetDefaultPositionUS(microseconds);
  DrawServo();
}

void ServoSimulator::DisplaySize(std::int32_t size) {
  dial_.DisplaySize(size);
  updateGeometry();
  DrawServo();
}

void ServoSimulator::DisplayCaption(const QString& text) {
  dial_.DisplayCaption(text.toStdString());
  QAccessibleEvent event(this, QAccessible::NameChanged);
  QAccessible::updateAccessibility(&event);
  DrawServo();
}

void ServoSimulator::SelectServo(bool selected) {
  if (selected == dial_.selected()) return;
  dial_.SelectServo(selected);
  QAccessibleEvent event(this, selected ? QAccessible::SelectionAdd : QAccessible::SelectionRemove);
  QAccessible::updateAccessibility(&event);
  update();
}

void ServoSimulator::Mark(bool marked) {
  if (marked == marked_) return;
  marked_ = marked;
  update();
}

void ServoSimulator::MarkDiffers(bool differs) {
  if (differs == differs_) return;
  differs_ = differs;
  update();
}

void ServoSimulator::AnnounceArm() {
  if (dial_.arm_pulse() == announced_pulse_) return;
  announced_pulse_ = dial_.arm_pulse();
  QAccessibleValueChangeEvent event(this, static_cast<qlonglong>(announced_pulse_));
  QAccessible::updateAccessibility(&event);
}

QSize ServoSimulator::sizeHint() const { return SquareFor(dial_.sizes(), 110, 180, 320); }

QSize ServoSimulator::minimumSizeHint() const { return SquareFor(dial_.sizes(), 72, 120, 200); }

void ServoSimulator::paintEvent(QPaintEvent*) {
  QPainter painter(this);
  PaintBackground(painter);
  painter.translate(kMargin, kMargin);
  const QSize picture = size() - QSize(2 * kMargin, 2 * kMargin);
  DialPainter dial_painter(painter, picture.width(), dial_.selected() || dial_.sizes().marker > 0);
  for (const DialElement& element : dial_.Draw(picture.width(), picture.height())) {
    try {
      dial_painter.Stroke(element);
    } catch (const std::exception&) {
      // A failure to draw one element does not stop the others.
    }
  }
}

void ServoSimulator::PaintBackground(QPainter& painter) const {
  const QColor face = palette().color(QPalette::Button);
  const QColor button = isDown()                      ? face.darker(kPressedShade)
                        : isEnabled() && underMouse() ? face.lighter(kHoverShade)
                                                      : face;
  const QRectF whole = rect();
  painter.fillRect(whole, button);
  painter.setRenderHint(QPainter::Antialiasing);
  if (dial_.selected()) {
    PaintSelection(painter, whole, palette(), button, hasFocus());
  } else if (hasFocus()) {
    PaintFocus(painter, whole, palette().color(QPalette::WindowText));
  }
  const QColor text = palette().color(QPalette::ButtonText);
  if (marked_) PaintMark(painter, whole, text);
  if (differs_) PaintDiffersMark(painter, whole, text);
}

void ServoSimulator::resizeEvent(QResizeEvent* event) {
  QAbstractButton::resizeEvent(event);
  const auto arm = static_cast<std::int32_t>(dial_.arm_pulse());
  dial_.ResetAfterResize();
  DrawServo();
  Q_EMIT Resized(arm);
  AnnounceArm();  // only now: the receiver may have put the arm back
}

void ServoSimulator::keyPressEvent(QKeyEvent* event) {
  const bool enter = event->key() == Qt::Key_Return || event->key() == Qt::Key_Enter;
  if (enter && !event->isAutoRepeat()) {
    click();
  } else {
    QAbstractButton::keyPressEvent(event);
  }
}

}  // namespace tendril
