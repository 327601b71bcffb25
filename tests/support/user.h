// User: works the program's window by mouse and keyboard, and answers its message boxes.
#pragma once

#include <QAbstractButton>
#include <QAbstractItemView>
#include <QApplication>
#include <QComboBox>
#include <QLabel>
#include <QMessageBox>
#include <QTest>
#include <QTimer>
#include <stdexcept>
#include <string>
#include <utility>
#include <vector>

#include "support/find_control.h"

namespace tendril::test {

// Object names of buttons.
inline constexpr char kSend[] = "Command3_0";
inline constexpr char kGet[] = "Command3_1";
inline constexpr char kChangeId[] = "Command3_2";
inline constexpr char kSweep[] = "cmdTest_0";

// Answers each message box with Yes or OK, unless it rests.
class User {
 public:
  using Box = std::pair<std::string, std::string>;  // title and text

  User() {
    reading_.setInterval(20);
    QObject::connect(&reading_, &QTimer::timeout, &reading_, [this] {
      if (auto* box = qobject_cast<QMessageBox*>(QApplication::activeModalWidget())) {
        read.emplace_back(box->windowTitle().toStdString(), box->text().toStdString());
        box->button(box->button(QMessageBox::Yes) != nullptr ? QMessageBox::Yes : QMessageBox::Ok)->click();
      }
    });
    reading_.start();
  }

  // `window` has the controls from now on and must outlive their use.
  void SetWindow(QWidget& window) { window_ = &window; }
  void Rest(bool resting) { resting ? reading_.stop() : reading_.start(); }

  template <typename Control = QWidget>
  Control& Find(const char* name) const {
    return FindControl<Control>(*window_, name);
  }
  // Opens the list of ports and takes Comm `number`, even if it is chosen already. Raises std::runtime_error when it is
  // not in the list.
  void ChoosePort(int number) const {
    auto& ports = Find<QComboBox>("cmbNYX");
    ports.showPopup();
    const int entry = ports.findText(QStringLiteral("Comm %1").arg(number));
    if (entry < 0) throw std::runtime_error("The list has no Comm " + std::to_string(number));
    ports.view()->setCurrentIndex(ports.model()->index(entry, 0));
    QTest::keyClick(ports.view(), Qt::Key_Return);
  }
  QAbstractButton& Button(const char* name) const { return Find<QAbstractButton>(name); }
  // Shows the outcome of a command.
  QLabel& OutcomeLabel() const { return Find<QLabel>("lblProgress"); }
  void Press(const char* button) const {
    OutcomeLabel().clear();
    QTest::mouseClick(&Button(button), Qt::LeftButton);
  }
  // A command has ended and the next one can start.
  bool CommandOver() const { return !OutcomeLabel().text().isEmpty() && Button(kSend).isEnabled(); }

  std::vector<Box> read;

 private:
  QWidget* window_ = nullptr;
  QTimer reading_;
};

}  // namespace tendril::test
