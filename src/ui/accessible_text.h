// TextAccessible: the accessible interface of a control that shows one line of text.
#pragma once

#include <QAccessible>
#include <QAccessibleWidget>
#include <QPoint>
#include <QRect>
#include <QString>

namespace tendril {

// The text can be read character by character, and neither changed nor selected. It is the control's value too.
class TextAccessible : public QAccessibleWidget, public QAccessibleTextInterface {
 public:
  using QAccessibleWidget::QAccessibleWidget;

  // The text that the control shows now.
  virtual QString Shown() const = 0;

  QString text(QAccessible::Text kind) const override {
    return kind == QAccessible::Value ? Shown() : QAccessibleWidget::text(kind);
  }
  void* interface_cast(QAccessible::InterfaceType type) override {
    if (type == QAccessible::TextInterface) return static_cast<QAccessibleTextInterface*>(this);
    return QAccessibleWidget::interface_cast(type);
  }

  QString text(int begin, int end) const override { return Shown().mid(begin, end - begin); }
  int characterCount() const override { return static_cast<int>(Shown().size()); }
  int cursorPosition() const override { return 0; }
  void setCursorPosition(int) override {}
  QRect characterRect(int) const override { return rect(); }
  int offsetAtPoint(const QPoint&) const override { return 0; }
  QString attributes(int, int* begin, int* end) const override {
    *begin = 0;
    *end = characterCount();
    return {};
  }
  void selection(int, int* begin, int* end) const override { *begin = *end = 0; }
  int selectionCount() const override { return 0; }
  void addSelection(int, int) override {}
  void removeSelection(int) override {}
  void setSelection(int, int, int) override {}
  void scrollToSubstring(int, int) override {}
};

}  // namespace tendril
