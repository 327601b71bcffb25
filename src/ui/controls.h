// Small helpers that the areas of the window share.
#pragma once

#include <QAnyStringView>
#include <QButtonGroup>
#include <QComboBox>
#include <QFrame>
#include <QLabel>
#include <QLineEdit>
#include <QMargins>
#include <QPalette>
#include <QString>
#include <QWheelEvent>
#include <cstddef>
#include <cstdint>

class QTableView;

namespace tendril {

// A combo box that the mouse wheel does not change: the wheel scrolls what lies around it.
class CalmComboBox : public QComboBox {
  Q_OBJECT

 public:
  using QComboBox::QComboBox;

  // Does what the user's choice of `line` does, also of the current line. Does nothing while the box is disabled.
  void Choose(int line);

  void showPopup() override;

 Q_SIGNALS:
  // The list is about to open.
  void Opening();

 protected:
  void wheelEvent(QWheelEvent* event) override { event->ignore(); }
};

// A read-only text that can be pressed: with the left mouse button, Enter or the space bar. No part of it can be selected,
// and Ctrl+C is left to the window.
class PressableText : public QLineEdit {
  Q_OBJECT

 public:
  PressableText();

  // Does what a press does. Does nothing while the text is disabled.
  void Press();

 Q_SIGNALS:
  void Pressed();

 protected:
  bool event(QEvent* event) override;
  void mousePressEvent(QMouseEvent* event) override;
  void mouseDoubleClickEvent(QMouseEvent* event) override { mousePressEvent(event); }
  void keyPressEvent(QKeyEvent* event) override;
};

// A frame that floats over the window, hidden until it is opened.
class PopUp : public QFrame {
 public:
  // `window` owns it.
  PopUp(const char* name, QWidget& window);

 protected:
  // Shows it this far to the right of and below the top left corner of `widget`, in form units, but within the window.
  void OpenBeside(const QWidget& widget, int right, int below);
};

// Gives `widget` its design name, and returns it.
template <typename Widget>
Widget* Named(Widget* widget, const char* name) {
  widget->setObjectName(name);
  return widget;
}

// The same for element `index` of a control array: "chkUpdate_3".
template <typename Widget>
Widget* Named(Widget* widget, const char* array, std::size_t index) {
  widget->setObjectName(QStringLiteral("%1_%2").arg(QString::fromUtf8(array)).arg(index));
  return widget;
}

// Gives `parent` a layout with these margins. A negative spacing is the style's.
template <typename Layout>
Layout* AddLayout(QWidget* parent, const QMargins& margins, int spacing = -1) {
  auto* layout = new Layout(parent);
  layout->setContentsMargins(margins);
  layout->setSpacing(spacing);
  return layout;
}

// Sets what the control does, as its tool tip and for assistive technology. While EnableUnless() disables it, the
// reason stays.
void Describe(QWidget* widget, QAnyStringView what_it_does);

// Adds "≠ here 1100, unit 1000" below what Describe() says; `words` are without the sign. Empty: takes that away.
void DescribeDifference(QWidget* widget, const QString& words);

// Enables the control when `why_not` is empty. Otherwise disables it, and its tool tip gives the reason in the place
// of the description.
void EnableUnless(const QString& why_not, QWidget* widget);

// Checks the button of an exclusive group that has this id; none when no button has it. Emits no clicked signal.
void CheckOnly(QButtonGroup& group, int id);

// Labels in the theme's less prominent text colour, and in bold type.
QLabel* DimLabel(QAnyStringView text);
QLabel* BoldLabel(QAnyStringView text = {});

// The height of a button in a line of text.
int LowButtonHeight(const QWidget& button);

// Scrolls what contains `widget`, if that scrolls, until it is visible.
void Reveal(QWidget& widget);

// The selected rows of the table in their order, a line each, with tabs between the columns.
QString SelectedRows(const QTableView& table);

// If `widget` has the focus, its window gets it. Called before the widget is hidden or disabled: Qt would give the focus
// to the next control, and scroll there.
void MoveFocusToWindow(QWidget& widget);

// Multiplies the type size of `widget`.
void ScaleType(QWidget* widget, double factor);

// Sets one colour of the widget's palette.
void SetPaletteColour(QWidget* widget, QPalette::ColorRole role, const QColor& colour);

// The text on two lines for a port that drives no servo; empty for a servo and for an unknown kind.
QString OutputLabel(std::int16_t port_type);

}  // namespace tendril
