// FindControl: a control of a window, by its object name.
#pragma once

#include <QAnyStringView>
#include <QWidget>
#include <stdexcept>

namespace tendril::test {

// Raises std::runtime_error when `window` has no such control.
template <typename Control = QWidget>
Control& FindControl(const QWidget& window, QAnyStringView name) {
  auto* control = window.findChild<Control*>(name.toString());
  if (control == nullptr) throw std::runtime_error("The window has no " + name.toString().toStdString());
  return *control;
}

}  // namespace tendril::test
