#include "app/demo_show.h"

#include <QAbstractButton>
#include <QApplication>
#include <QComboBox>
#include <QDeadlineTimer>
#include <QDir>
#include <QElapsedTimer>
#include <QLabel>
#include <QMouseEvent>
#include <QPixmap>
#include <QSpinBox>
#include <QTimer>
#include <cstdint>
#include <cstdio>
#include <span>
#include <string>
#include <utility>
#include <variant>

#include "bench/line_printer.h"
#include "bench/panel_printer.h"
#include "config/option_bytes.h"
#include "platform/hex_text.h"

namespace tendril {
namespace {

constexpr int kLongestCommandMs = 30000;
constexpr QSize kPictureSize(1280, 800);

void Print(const std::string& line) {
  std::puts(line.c_str());
  std::fflush(stdout);
}

class Actor {
 public:
  Actor(frmNewServoConfig& window, const QString& folder) : window_(window), folder_(folder) {
    window_.resize(kPictureSize);
    QApplication::processEvents();
    QDir().mkpath(folder_);
  }

  template <typename Widget>
  Widget& Find(const char* name) const {
    return *window_.findChild<Widget*>(QString::fromUtf8(name));
  }

  // Lets the program run until `done`; false when it takes too long.
  template <typename Done>
  static bool RunUntil(Done done) {
    const QDeadlineTimer deadline(kLongestCommandMs);
    while (!done()) {
      if (deadline.hasExpired()) return false;
      QApplication::processEvents(QEventLoop::WaitForMoreEvents);
    }
    return true;
  }

  // Chooses an entry of a list, as a person does.
  void Choose(const char* list, int entry) const {
    auto& box = Find<QComboBox>(list);
    box.setCurrentIndex(entry);
    Q_EMIT box.activated(entry);
  }

  // Presses a button, which takes the focus as it does under the mouse.
  void Press(const char* button) const {
    auto& pressed = Find<QAbstractButton>(button);
    pressed.setFocus(Qt::MouseFocusReason);
    pressed.click();
  }
  void PressOnText(const char* name) const {
    auto& text = Find<QWidget>(name);
    const QPointF middle = QRectF(text.rect()).center();
    QMouseEvent press(QEvent::MouseButtonPress, middle, text.mapToGlobal(middle), Qt::LeftButton,
                      Qt::LeftButton, Qt::NoModifier);
    QApplication::sendEvent(&text, &press);
  }
  void Step(const char* spin, int steps) const {
    auto& stepped = Find<QSpinBox>(spin);
    stepped.setFocus(Qt::MouseFocusReason);
    stepped.stepBy(steps);
  }

  // Presses a command's button and waits for the outcome; false when there is none.
  bool RunCommand(const char* button) const {
    Start(button);
    return AwaitOutcome();
  }
  void Start(const char* button) const {
    Find<QLabel>("lblProgress").clear();
    Find<QAbstractButton>(button).click();
  }
  bool AwaitOutcome() const {
    const auto& outcome = Find<QLabel>("lblProgress");
    const bool ended = RunUntil([&] { return !outcome.text().isEmpty(); });
    Print("The window says: " + outcome.text().toStdString());
    return ended;
  }

  bool SavePicture(const char* name) const { return SavePicture(window_, name); }
  bool SavePicture(QWidget& shown, const char* name) const {
    const QString path = QDir(folder_).filePath(QString::fromUtf8(name));
    const bool saved = shown.grab().save(path);
    Print(saved ? "Picture: " + path.toStdString() : "This picture cannot be saved: " + path.toStdString());
    return saved;
  }

 private:
  frmNewServoConfig& window_;
  QString folder_;
};

// Compares port by port, and prints what the unit holds.
bool AreEqual(const VirtualUnit& unit, const ChannelTable& shown) {
  bool all_equal = true;
  for (int port = 1; port <= kUnitPorts; ++port) {
    const PortOptionBytes& held = unit.PortOptions(port);
    const auto encoded = EncodeOptions(shown.At(static_cast<std::size_t>(port - 1)));
    const auto* bytes = std::get_if<OptionBytes>(&encoded);
    const bool equal = bytes != nullptr && *bytes == held;
    std::string line = "Port " + std::to_string(port) + " of unit " + HexByte(unit.id()) + " holds";
    for (const std::uint8_t byte : held) line += " " + std::to_string(byte);
    Print(line + (equal ? "" : "   NOT what the window shows"));
    all_equal = all_equal && equal;
  }
  return all_equal;
}

// Takes a port from the Control Panel and gives it back, which ends the window; false when it does not change hands.
bool PassPortBackAndForth(const Actor& actor, frmNewServoConfig& window, VirtualControlPanel& panel) {
  constexpr int kPort = 3;
  QElapsedTimer since;
  since.start();
  panel.SetTap([&since](PanelSide from, std::span<const std::uint8_t> bytes) {
    Print(PrintPanelBytes(static_cast<std::uint64_t>(since.nsecsElapsed() / 1000), from, bytes));
  });
  Print("Choosing Comm 3, which the Control Panel holds ...");
  actor.Choose("cmbNYX", kPort);
  const bool given_up = Actor::RunUntil([&] { return !panel.Holds(kPort); });
  Print("Choosing Comm 3 again, and closing the window ...");
  actor.Choose("cmbNYX", kPort);
  const bool closed_at_once = window.close();
  const bool given_back = Actor::RunUntil([&] { return panel.Holds(kPort) && !window.isVisible(); });
  panel.SetTap(nullptr);
  const bool good = given_up && !closed_at_once && given_back;
  Print(good ? "The Control Panel has given up Comm 3, and has it back." : "Comm 3 did NOT change hands.");
  return good;
}

// Of the box that comes up for the port that the Control Panel holds.
bool SavePictureOfQuestion(const Actor& actor) {
  bool saved = false;
  QTimer::singleShot(0, qApp, [&] {
    QWidget* const box = QApplication::activeModalWidget();
    if (box == nullptr) return;
    saved = actor.SavePicture(*box, "window-port-in-use.png");
    box->close();
  });
  actor.Choose("cmbNYX", 3);
  return saved;
}

}  // namespace

void PrintedBoxes::Show(const BoxMessage& message) {
  Print("Box \"" + message.title + "\": " + message.text);
}

bool PrintedBoxes::AskYesNo(const BoxMessage& message) {
  Show(message);
  Print("The answer: Yes");
  return true;
}

int ShowWithoutDisplay(frmNewServoConfig& window, VirtualLine& line, const DemoUnits& units,
                       VirtualControlPanel& panel, const QString& folder) {
  const Actor actor(window, folder);
  if (!actor.SavePicture("window-start.png")) return 1;

  LinePrinter printer(Print);
  line.SetTap([&printer](const LineByte& byte) { printer.Note(byte); });
  actor.Choose("cmbNYX", 1);
  Print("Chosen: Comm 1, unit 01. Sending the configuration of eight ports ...");
  actor.Start("Command3_0");
  // In the pause between two ports: a picture takes longer than a unit waits for the line.
  bool good = Actor::RunUntil([&] { return units.first.accepted_commands() >= 4 && !line.NextEventUs(); });
  good = actor.SavePicture("window-sending.png") && good;
  good = actor.AwaitOutcome() && good;
  printer.Flush();
  good = AreEqual(units.first, window.WorkingConfiguration()) && good;
  good = actor.SavePicture("window-sent.png") && good;
  const ChannelTable sent = window.WorkingConfiguration();

  for (const auto& [digit, unit] : {std::pair(10, &units.second), std::pair(1, &units.first)}) {
    actor.Choose("CmbUnitID_1", digit);
    Print("Chosen: unit " + std::string(digit == 10 ? "0A" : "01") + ". Reading its configuration ...");
    good = actor.RunCommand("Command3_1") && good;
    printer.Flush();
    good = AreEqual(*unit, window.WorkingConfiguration()) && good;
    if (digit == 10) good = actor.SavePicture("window-read.png") && good;
  }
  line.SetTap(nullptr);
  good = good && window.WorkingConfiguration() == sent;
  Print(good ? "What was sent is what was read back." : "What was read back is NOT what was sent.");
  return PassPortBackAndForth(actor, window, panel) && good ? 0 : 1;
}

int TakePictures(frmNewServoConfig& window, const QString& folder) {
  const Actor actor(window, folder);
  actor.Press("ServoSimulator2_2");
  actor.Press("chkUpdate_6");
  actor.Step("spnNeutralTrim", 10);
  actor.Step("spnLeftVirtStop", 15);
  actor.Step("spnDefaultPos", -20);
  bool good = actor.SavePicture("window-servo.png");
  actor.Press("ServoSimulator2_4");
  actor.Press("optChannelType_1");
  good = actor.SavePicture("window-digital.png") && good;
  actor.Press("ServoSimulator2_5");
  actor.Press("optChannelType_2");
  good = actor.SavePicture("window-pwm.png") && good;

  actor.Press("cmdShowSummary");
  const auto& text = actor.Find<QWidget>("txtSumStopRange_3");
  good = Actor::RunUntil([&text] { return text.isVisible(); }) && good;
  good = actor.SavePicture("window-summary.png") && good;
  actor.PressOnText("txtSumStopRange_3");
  good = actor.SavePicture("window-number-entry.png") && good;
  return SavePictureOfQuestion(actor) && good ? 0 : 1;
}

}  // namespace tendril
