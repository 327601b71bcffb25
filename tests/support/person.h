// Person: works the program's window by mouse and keyboard, and reads its message boxes.
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

namespace tendril::test {

// The buttons.
inline constexpr char kSend[] = "Command3_0";
inline constexpr char kGet[] = "Command3_1";
inline constexpr char kChangeId[] = "Command3_2";
inline constexpr char kSweep[] = "cmdTest_0";

// Reads each box and presses Yes or OK, for as long as it is not at rest.
class Person {
 public:
  using Box = std::pair<std::string, std::string>;  // its title and its text

  Person() {
    reading_.setInterval(20);
    QObject::connect(&reading_, &QTimer::timeout, &reading_, [this] {
      if (auto* box = qobject_cast<QMessageBox*>(QApplication::activeModalWidget())) {
        read.emplace_back(box->windowTitle().toStdString(), box->text().toStdString());
        box->button(box->button(QMessageBox::Yes) != nullptr ? QMessageBox::Yes : QMessageBox::Ok)->click();
      }
    });
    reading_.start();
  }

  // Where the controls are from now on; it must last as long as they are used.
  void SitDownAt(QWidget& window) { window_ = &window; }
  void Rest(bool resting) { resting ? reading_.stop() : reading_.start(); }

  // Raises std::runtime_error when the window has no such control.
  template <typename Control>
  Control& Find(const char* name) const {
    auto* control = window_->findChild<Control*>(QString::fromLatin1(name));
    if (control == nullptr) throw std::runtime_error(std::string("The window has no ") + name);
    return *control;
  }
  // Opens the list of ports and takes Comm 1, be it chosen already or not. Raises when it is not there.
  void ChooseComm1() const {
    auto& ports = Find<QComboBox>("cmbNYX");
    ports.showPopup();
    const int entry = ports.findText(QStringLiteral("Comm 1"));
    if (entry < 0) throw std::runtime_error("Comm 1 is not there");
    ports.view()->setCurrentIndex(ports.model()->index(entry, 0));
    QTest::keyClick(ports.view(), Qt::Key_Return);
  }
  QAbstractButton& Button(const char* name) const { return Find<QAbstractButton>(name); }
  // Where the outcome of a command is told.
  QLabel& OutcomeLabel() const { return Find<QLabel>("lblProgress"); }
  void Press(const char* button) const {
    OutcomeLabel().clear();
    QTest::mouseClick(&Button(button), Qt::LeftButton);
  }

  std::vector<Box> read;

 private:
  QWidget* window_ = nullptr;
  QTimer reading_;
};

}  // namespace tendril::test
