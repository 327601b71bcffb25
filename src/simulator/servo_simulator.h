// ServoSimulator: a drawn servo that can be clicked.
#pragma once

#include <QAbstractButton>
#include <QColor>
#include <QPalette>
#include <QRectF>
#include <QString>
#include <cstdint>

#include "simulator/servo_dial.h"

class QPainter;

namespace tendril {

// `colour` as Qt has it.
QColor ToColour(DialColour colour);

// Paints the background of a selected servo into `rect`: blue, with an outline where the window is too dark for it, a
// check mark in the corner, and `inside` where the picture lies. Adds the line that shows the focus.
void PaintSelection(QPainter& painter, const QRectF& rect, const QPalette& palette, const QColor& inside,
                    bool focus);

// The accessible description of a selected servo. `more` is what else is to be said of it.
QString DescribeSelected(const QString& more);

// Shows one servo channel as a picture. The operations below set what it shows, in degrees (0 straight up, positive to
// the right) or in microseconds (a longer pulse turns the arm left). Operations that convert raise
// RuntimeError(kErrOverflow) where 32-bit arithmetic overflows.
//
// The whole control is a button: a click with the mouse, the space bar or Enter raises Clicked. The picture lies 5
// units inside the control. The background around it shows whether the channel is selected.
//
// To assistive technology it is a button with a value. Its name is accessibleName() or else its caption ("CHAN 3" is
// spoken "Channel 3"), its value is the pulse width of the arm ("1500 µs"). While it is selected its description says
// so: most readers do not read that state of a button. accessibleDescription() follows.
class ServoSimulator : public QAbstractButton {
  Q_OBJECT

 public:
  explicit ServoSimulator(QWidget* parent = nullptr);

  // Set an arc without drawing it. The ...US forms take the lower pulse width first.
  void SetRange(std::int32_t first, std::int32_t second) { dial_.SetRange(first, second); }
  void SetRangeUS(std::int32_t first, std::int32_t second) { dial_.SetRangeUS(first, second); }
  void SetLimit(std::int32_t first, std::int32_t second) { dial_.SetLimit(first, second); }
  void SetLimitUS(std::int32_t first, std::int32_t second) { dial_.SetLimitUS(first, second); }
  void SetStops(std::int32_t first, std::int32_t second) { dial_.SetStops(first, second); }
  void SetStopsUS(std::int32_t first, std::int32_t second) { dial_.SetStopsUS(first, second); }
  // Sets the arm without drawing it.
  void SetMovingArm(std::int32_t degrees);

  // Repaints the picture. Several calls before the next paint cost one.
  void DrawServo() { update(); }

  // Whether the angles are printed on the picture, instead of the caption.
  bool DisplayServoText() const { return dial_.DisplayServoText(); }
  void SetDisplayServoText(bool display);

  // Set the arm or a marker, and draw. Once set, a marker stays visible.
  void SetMovingArmPosition(std::int32_t degrees);
  void SetMovingArmPositionUS(std::int32_t microseconds);
  void SetNeutralPosition(std::int32_t degrees);
  void SetDefaultPosition(std::int32_t degrees);
  // Places the marker where 1500 is under the neutral pulse so far. From then on `microseconds` is the neutral pulse.
  void SetNeutralPositionUS(std::int32_t microseconds);
  void SetDefaultPositionUS(std::int32_t microseconds);

  // Selects the row of drawing sizes, and with it the size hints: 1 small, 2 medium, any other value normal.
  void DisplaySize(std::int32_t size);
  // Sets the text on the servo's body.
  void DisplayCaption(const QString& text);
  // Shows the control as selected or not.
  void SelectServo(bool selected);
  // Shows the mark, or hides it. The accessible description has to say what it means.
  void Mark(bool marked);
  // The same for the sign of what differs from a unit.
  void MarkDiffers(bool differs);

  // What the control shows.
  const ServoDial& dial() const { return dial_; }

  QSize sizeHint() const override;
  QSize minimumSizeHint() const override;

 Q_SIGNALS:
  // The user chose this servo.
  void Clicked();
  // The control was resized: range and limit have their initial values again and the arm 0 degrees. What the receiver
  // sets now is painted; the initial values are never seen. `arm` is the arm's pulse width so far.
  void Resized(std::int32_t arm);
  // DisplayServoText was written.
  void DisplayServoTextChanged();

 protected:
  void paintEvent(QPaintEvent* event) override;
  void resizeEvent(QResizeEvent* event) override;
  void keyPressEvent(QKeyEvent* event) override;

 private:
  void AnnounceArm();
  void PaintBackground(QPainter& painter) const;

  ServoDial dial_;
  bool marked_ = false;
  bool differs_ = false;
  std::int64_t announced_pulse_;  // the pulse width of the arm that assistive technology was notified of
};

}  // namespace tendril
