// How fast the window follows an edit of all eight channels, and how close the painting of its nine servos comes to
// the mere strokes.
#include <QApplication>
#include <QEvent>
#include <QImage>
#include <QPainter>
#include <QSpinBox>
#include <QTest>
#include <algorithm>
#include <array>
#include <cmath>
#include <cstdio>
#include <functional>
#include <set>
#include <stdexcept>
#include <string>
#include <vector>

#include "measuring.h"
#include "serial/hw_serial.h"
#include "simulator/servo_simulator.h"
#include "support/find_control.h"
#include "support/simulated_control_panel.h"
#include "ui/frm_new_servo_config.h"

namespace tendril {
namespace {

constexpr QSize kWindowSize(1280, 800);
constexpr std::size_t kServos = 9;

// The window, without a port. Channel 1 is chosen, and its edits go to all channels.
class EditedWindow : public QObject {
 public:
  EditedWindow() {
    window_.resize(kWindowSize);
    window_.show();
    const bool exposed = QTest::qWaitForWindowExposed(&window_);
    QTest::qWait(kSettleMs);  // what is not seen at first is made after the first paint
    QTest::mouseClick(&Child("ServoSimulator2_0"), Qt::LeftButton);
    QTest::mouseClick(&Child("chkUpdate_8"), Qt::LeftButton);
    QTest::qWait(kSettleMs);
    for (auto* servo : window_.findChildren<ServoSimulator*>()) {
      if (servo->isVisible()) servos_.push_back(servo);
    }
    if (!exposed || window_.size() != kWindowSize || servos_.size() != kServos) {
      throw std::runtime_error("The window does not show what is to be measured");
    }
    qApp->installEventFilter(this);
  }

  // Raises std::runtime_error when the window has no such control.
  template <typename Control = QWidget>
  Control& Child(const char* name) {
    return test::FindControl<Control>(window_, name);
  }

  // Steps `spin` once and returns how long it took until all of the window was painted, in milliseconds. Raises
  // std::runtime_error unless the value changed and every servo was painted.
  double Step(QSpinBox& spin, Qt::Key key) {
    const int value = spin.value();
    painted_.clear();
    const Stopwatch stopwatch;
    QTest::keyClick(&spin, key);
    do {
      any_painted_ = false;
      QApplication::processEvents();
    } while (any_painted_ || (painted_.size() < kServos && stopwatch.Ms() < kSettleMs));
    const double taken_ms = stopwatch.Ms();
    if (spin.value() == value || painted_.size() < kServos) {
      throw std::runtime_error("An edit is not shown by all servos");
    }
    return taken_ms;
  }

  const std::vector<ServoSimulator*>& servos() const { return servos_; }

  bool eventFilter(QObject* watched, QEvent* event) override {
    if (event->type() == QEvent::Paint) {
      any_painted_ = true;
      if (std::count(servos_.begin(), servos_.end(), watched) > 0) painted_.insert(watched);
    }
    return false;
  }

 private:
  static constexpr int kSettleMs = 200;

  test::SimulatedWorld world_;
  HwSerial link_{*world_.device, world_.time, world_.time, world_.log};
  test::SimulatedControlPanel panel_{world_};
  frmNewServoConfig window_{link_, world_.time, world_.boxes, panel_.control_panel, {{1, 0, 0}, {}, {}}};
  std::vector<ServoSimulator*> servos_;
  std::set<QObject*> painted_;  // the servos, since the last step began
  bool any_painted_ = false;
};

// One edit changes eight records and redraws nine servos.
bool MeasureEdit(EditedWindow& window) {
  constexpr int kEdits = 101;
  constexpr double kMaxMs = 3;

  auto& trim = window.Child<QSpinBox>("spnNeutralTrim");
  trim.setFocus();
  std::vector<double> ms;
  ms.reserve(kEdits);
  for (int edit = 0; edit < kEdits; ++edit) {
    ms.push_back(window.Step(trim, edit % 2 == 0 ? Qt::Key_Up : Qt::Key_Down));
  }
  std::printf("edit, median of %d: %.2f ms until all is painted (at most %.1f); the slowest %.2f ms\n",
              kEdits, Median(ms), kMaxMs, *std::max_element(ms.begin(), ms.end()));
  return Median(ms) <= kMaxMs;
}

// The strokes of a servo as it is now, all that they need worked out beforehand.
class BareStrokes {
 public:
  explicit BareStrokes(const ServoSimulator& servo) : font_(servo.font()) {
    const QSize picture = servo.size() - QSize(2 * kInset, 2 * kInset);
    ServoDial dial = servo.dial();
    for (const DialElement& element : dial.Draw(picture.width(), picture.height())) Add(element);
  }

  void Paint(QImage& image) const {
    QPainter painter(&image);
    painter.setRenderHint(QPainter::Antialiasing);
    for (const auto& stroke : strokes_) stroke(painter);
  }

  static constexpr int kInset = 5;  // of the picture in the control

 private:
  static QPointF ToPoint(DialPoint point) { return QPointF(point.x, point.y) + QPointF(kInset, kInset); }

  void Add(const DialElement& element) {
    switch (element.shape) {
      case DialShape::kBox:
        return AddBox(element);
      case DialShape::kPie:
        return AddPie(element);
      case DialShape::kLine:
        return AddLine(element);
      case DialShape::kLineOutline:
        return AddLineOutline(element);
      case DialShape::kText:
        return AddText(element);
    }
  }

  void AddBox(const DialElement& box) {
    const auto grown = [&box](double growth) {
      const double by = std::round(growth);
      return QRectF(ToPoint(box.from), ToPoint(box.to)).adjusted(-by, -by, by, by);
    };
    const QRectF outer = grown(box.line_width / 2 + box.outline_width);
    const QRectF inner = grown(-box.line_width / 2);
    strokes_.push_back(
        [outer, inner, outline = ToColour(box.outline), fill = ToColour(box.fill)](QPainter& painter) {
          painter.setRenderHint(QPainter::Antialiasing, false);
          painter.fillRect(outer, outline);
          painter.fillRect(inner, fill);
          painter.setRenderHint(QPainter::Antialiasing);
        });
  }

  void AddPie(const DialElement& pie) {
    constexpr double kSixteenths = 180 * 16 / kDialPi;
    const QPointF corner(pie.radius, pie.radius);
    const QRectF around(ToPoint(pie.from) - corner, ToPoint(pie.from) + corner);
    const int start = static_cast<int>(std::lround(pie.start_angle * kSixteenths));
    const int sweep = static_cast<int>(std::lround(pie.sweep_angle * kSixteenths));
    const QPen pen(ToColour(pie.outline), pie.line_width, Qt::SolidLine, Qt::FlatCap, Qt::RoundJoin);
    strokes_.push_back([around, start, sweep, pen, brush = QBrush(ToColour(pie.fill))](QPainter& painter) {
      painter.setPen(pen);
      painter.setBrush(brush);
      painter.drawPie(around, start, sweep);
    });
  }

  void AddLine(const DialElement& line) {
    const Qt::PenCapStyle cap = line.part == DialPart::kArm ? Qt::RoundCap : Qt::FlatCap;
    const QLineF axis(ToPoint(line.from), ToPoint(line.to));
    const auto add = [&](DialColour colour, double width) {
      strokes_.push_back([axis, pen = QPen(ToColour(colour), width, Qt::SolidLine, cap)](QPainter& painter) {
        painter.setPen(pen);
        painter.drawLine(axis);
      });
    };
    if (line.outline_width > 0) add(line.outline, line.line_width + 2 * line.outline_width);
    add(line.fill, line.line_width);
  }

  void AddLineOutline(const DialElement& line) {
    const QLineF axis(ToPoint(line.from), ToPoint(line.to));
    const QLineF normal = axis.normalVector().unitVector();
    const QPointF offset = QPointF(normal.dx(), normal.dy()) * ((line.line_width + line.outline_width) / 2);
    const std::array<QPointF, 4> contour = {axis.p1() + offset, axis.p2() + offset, axis.p2() - offset,
                                            axis.p1() - offset};
    const QPen pen(ToColour(line.fill), line.outline_width, Qt::SolidLine, Qt::FlatCap, Qt::MiterJoin);
    strokes_.push_back([contour, pen](QPainter& painter) {
      painter.setPen(pen);
      painter.setBrush(Qt::NoBrush);
      painter.drawConvexPolygon(contour.data(), static_cast<int>(contour.size()));
    });
  }

  // The caption, in the size at which it has room on the servo's body.
  void AddText(const DialElement& caption) {
    constexpr double kLeastScale = 0.8;
    constexpr double kPlateRadius = 2;
    const double full_pixels = QFontInfo(font_).pixelSize();
    const double padding = std::round(full_pixels / 6);
    const QString text = QString::fromStdString(caption.text);
    QFont font = font_;
    font.setBold(true);
    font.setPixelSize(static_cast<int>(full_pixels));
    const double room = caption.room - 2 * padding;
    if (const double width = QFontMetricsF(font).horizontalAdvance(text); width > room) {
      font.setPixelSize(static_cast<int>(std::max(full_pixels * kLeastScale, full_pixels * room / width)));
    }
    const QFontMetricsF metrics(font);
    const double plate_width = metrics.horizontalAdvance(text) + 2 * padding;
    const QRectF plate(ToPoint(caption.from) - QPointF(plate_width / 2, 0),
                       QSizeF(plate_width, metrics.height()));
    if (plate_width > caption.room) {
      strokes_.push_back([plate, pen = QPen(ToColour(kBodyOutline), 1),
                          brush = QBrush(ToColour(caption.fill))](QPainter& painter) {
        painter.setPen(pen);
        painter.setBrush(brush);
        painter.drawRoundedRect(plate, kPlateRadius, kPlateRadius);
      });
    }
    strokes_.push_back([plate, font, text](QPainter& painter) {
      painter.setFont(font);
      painter.setPen(Qt::black);
      painter.drawText(plate, Qt::AlignCenter | Qt::TextSingleLine, text);
    });
  }

  const QFont font_;
  std::vector<std::function<void(QPainter&)>> strokes_;
};

// A servo and two images of its size: of the control, and of its strokes on the control's ground.
struct Canvas {
  explicit Canvas(ServoSimulator& of)
      : servo(of), strokes(of), painted(of.size(), QImage::Format_RGB32), bare(painted) {
    // None of these is part of the dial.
    servo.SelectServo(false);
    servo.Mark(false);
    servo.setAttribute(Qt::WA_UnderMouse, false);
    painted.fill(servo.palette().color(QPalette::Button));
    bare = painted.copy();
  }

  void PaintControl() { servo.render(&painted); }
  void PaintBare() { strokes.Paint(bare); }
  bool IsSamePicture() const {
    const QRect picture = painted.rect().adjusted(BareStrokes::kInset, BareStrokes::kInset,
                                                  -BareStrokes::kInset, -BareStrokes::kInset);
    return painted.copy(picture) == bare.copy(picture);
  }

  ServoSimulator& servo;
  BareStrokes strokes;
  QImage painted;
  QImage bare;
};

// All nine, at one device pixel per unit.
bool MeasurePainting(EditedWindow& window) {
  constexpr int kRuns = 201;
  constexpr double kMaxRatio = 2;

  std::vector<Canvas> canvases;
  for (ServoSimulator* servo : window.servos()) canvases.emplace_back(*servo);
  std::vector<double> painted_ms, bare_ms;
  for (int run = 0; run < kRuns; ++run) {
    const Stopwatch bare;
    for (Canvas& canvas : canvases) canvas.PaintBare();
    bare_ms.push_back(bare.Ms());
    const Stopwatch painted;
    for (Canvas& canvas : canvases) canvas.PaintControl();
    painted_ms.push_back(painted.Ms());
    if (run > 0) continue;  // later, smooth edges lie on each other
    for (const Canvas& canvas : canvases) {
      if (!canvas.IsSamePicture()) throw std::runtime_error("The bare strokes are not those of the servo");
    }
  }
  const double ratio = Median(painted_ms) / Median(bare_ms);
  std::printf(
      "painting of nine servos, median of %d: %.3f ms, bare strokes %.3f ms, ratio %.2f (at most %.1f)\n",
      kRuns, Median(painted_ms), Median(bare_ms), ratio, kMaxRatio);
  return ratio <= kMaxRatio;
}

bool MeasureAll() {
  EditedWindow window;
  const bool edits_fast = MeasureEdit(window);
  const bool paints_fast = MeasurePainting(window);
  return edits_fast && paints_fast;
}

}  // namespace
}  // namespace tendril

int main(int argc, char** argv) { return tendril::RunBenchmark(argc, argv, tendril::MeasureAll); }
