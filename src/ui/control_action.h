// ControlAction: a menu's way to a control of the window.
#pragma once

#include <QAbstractButton>
#include <QAction>
#include <QKeySequence>
#include <QString>
#include <functional>

#include "ui/controls.h"

namespace tendril {

// Enabled while the control is enabled and visible, so that a key reaches nothing that the mouse cannot reach.
class ControlAction : public QAction {
 public:
  // Clicks `button`; shows its check mark if it has one. The button must outlive the action.
  ControlAction(const QString& text, const QKeySequence& key, QAbstractButton& button, QObject* parent);
  // Gives `list` the focus and opens it. The list must outlive the action.
  ControlAction(const QString& text, const QKeySequence& key, CalmComboBox& list, QObject* parent);

 protected:
  bool eventFilter(QObject* control, QEvent* event) override;

 private:
  ControlAction(const QString& text, const QKeySequence& key, QWidget& control, std::function<void()> act,
                QObject* parent);
};

}  // namespace tendril
