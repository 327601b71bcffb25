// Small helpers that the areas of the window share.
#pragma once

#include <QButtonGroup>
#include <QComboBox>
#include <QGroupBox>
#include <QLabel>
#include <QLineEdit>
#include <QPoint>
#include <QSpinBox>
#include <QString>
#include <QWidget>
#include <cstdint>
#include <functional>

#include "ui/model/bounded_value.h"

namespace tendril {

// A combo box that a turn of the mouse wheel does not change: the wheel scrolls what lies around it.
class CalmComboBox : public QComboBox {
 public:
  using QComboBox::QComboBox;

  // Does what the user's choice of `line` does, of the line that is chosen already too. Nothing while it is disabled.
  void Choose(int line);

 protected:
  void wheelEvent(QWheelEvent* event) override;
};

// A spin box in microseconds. The wheel changes it only while it has the focus, and what is typed counts when it
// is whole: at Enter, or when the focus leaves.
class CalmSpinBox : public QSpinBox {
 public:
  explicit CalmSpinBox(QWidget* parent = nullptr);

  // Shows a value and its limits. Runs no handler.
  void Show(const BoundedValue& value);

 protected:
  void wheelEvent(QWheelEvent* event) override;
  void mousePressEvent(QMouseEvent* event) override;
  void mouseReleaseEvent(QMouseEvent* event) override;

 private:
  void ApplyLimits();
  bool ArrowHeld() const;

  BoundedValue shown_;
  bool pressed_ = false;  // the mouse button went down on it; it may have come up on something else
};

// A text that cannot be edited, but pressed: with the left mouse button, Enter or the space bar.
class PressableText : public QLineEdit {
 public:
  // `pressed` is what a press does.
  explicit PressableText(std::function<void()> pressed);

  // Does what a press does. Nothing while it is disabled.
  void Press();

 protected:
  void mousePressEvent(QMouseEvent* event) override;
  void mouseDoubleClickEvent(QMouseEvent* event) override { mousePressEvent(event); }
  void keyPressEvent(QKeyEvent* event) override;

 private:
  std::function<void()> pressed_;
};

// A group box that is painted several times as fast. A style may stretch the picture of a frame over the whole box;
// Qt's own group box has that done smoothly, by threads that must first be started, and it looks the same.
class FrameBox : public QGroupBox {
 public:
  using QGroupBox::QGroupBox;

 protected:
  void paintEvent(QPaintEvent* event) override;
};

// Gives `widget` its design name, and returns it.
template <typename Widget>
Widget* Named(Widget* widget, const QString& name) {
  widget->setObjectName(name);
  return widget;
}

// The name of element `index` of a control array.
QString ArrayName(const QString& array, int index);

// Sets what the control does, for the mouse (tool tip) and for assistive technology.
void Describe(QWidget* widget, const QString& what_it_does);

// Disables the control; its tool tip says why.
void Disable(QWidget* widget, const QString& why);

// Enables the control and says what it does; with a reason not to, disables it and gives that.
void EnableUnless(const QString& why_not, QWidget* widget, const QString& what_it_does);

// Checks the button of an exclusive group that has this id; none when no button has it. Runs no handler of clicks.
void CheckOnly(QButtonGroup& group, int id);

// A label in the theme's less prominent text colour.
QLabel* DimLabel(const QString& text);

// A label in bold type.
QLabel* BoldLabel(const QString& text);

// The unit of a form's measures is a fifteenth of a pixel.
inline constexpr int kFormUnitsPerPixel = 15;

// The place next to `wanted` at which `panel` lies wholly within its parent, as far as it fits.
QPoint WithinParent(const QWidget& panel, QPoint wanted);

// What a port that drives no servo is labelled with, on two lines; empty for a servo and for an unknown kind.
QString OutputLabel(std::int16_t port_type);

// Whether the palette in force has light text on a dark ground.
bool IsDark(const QWidget& widget);

}  // namespace tendril
