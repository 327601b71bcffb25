// Small helpers that the areas of the window share.
#pragma once

#include <QComboBox>
#include <QLabel>
#include <QString>
#include <QWidget>

namespace tendril {

// A combo box that a turn of the mouse wheel does not change: the wheel scrolls what lies around it.
class CalmComboBox : public QComboBox {
 public:
  using QComboBox::QComboBox;

 protected:
  void wheelEvent(QWheelEvent* event) override;
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

// A label in the theme's less prominent text colour.
QLabel* DimLabel(const QString& text, QWidget* parent = nullptr);

// A label in bold type.
QLabel* BoldLabel(const QString& text, QWidget* parent = nullptr);

// Whether the palette in force has light text on a dark ground.
bool IsDark(const QWidget& widget);

}  // namespace tendril
