// tendril-demo-show: works the demonstration's window by itself, on a machine without a display.
#include <QAction>
#include <QApplication>
#include <QCommandLineParser>
#include <QDir>
#include <QElapsedTimer>
#include <QPainter>
#include <QPixmap>
#include <QSize>
#include <QSlider>
#include <QSpinBox>
#include <QTest>
#include <QTimer>
#include <algorithm>
#include <cstdint>
#include <cstdio>
#include <cstdlib>
#include <functional>
#include <span>
#include <stdexcept>
#include <string>
#include <utility>
#include <variant>

#include "app/demo_program.h"
#include "bench/printers.h"
#include "config/option_bytes.h"
#include "platform/hex_text.h"
#include "platform/wait_for.h"
#include "support/user.h"
#include "ui/appearance.h"

namespace tendril::test {
namespace {

constexpr int kMaxStepMs = 30'000;
constexpr int kBetweenPictures = 24;

void Print(const std::string& line) {
  std::puts(line.c_str());
  std::fflush(stdout);
}

void Require(bool met, const std::string& otherwise) {
  if (!met) throw std::runtime_error(otherwise);
}

// Two pictures in one, side by side, each in the middle of its height.
QPixmap Beside(const QPixmap& left, const QPixmap& right, const QColor& ground) {
  QPixmap both(left.width() + kBetweenPictures + right.width(), std::max(left.height(), right.height()));
  both.fill(ground);
  QPainter painter(&both);
  painter.drawPixmap(0, (both.height() - left.height()) / 2, left);
  painter.drawPixmap(both.width() - right.width(), (both.height() - right.height()) / 2, right);
  return both;
}

// Each step raises std::runtime_error when it does not succeed.
class Show {
 public:
  // Saves pictures of a window of this size in `folder`, which is created.
  Show(const QString& folder, const QSize& size) : folder_(folder) {
    QDir().mkpath(folder);
    program_.window.resize(size);
    program_.window.show();
    user_.SetWindow(program_.window);
    QApplication::processEvents();
  }

  // Sends the configuration to unit 01, reads that of unit 0A, which is another, and reads unit 01 back. Then takes Comm
  // 3 from the Control Panel and gives it back. Prints what crosses the line and the connection to the panel.
  void Demonstrate() {
    SavePicture("start.png");
    line_.SetTap([this](const LineByte& byte) { printer_.Note(byte); });
    user_.ChoosePort(1);
    Print("Chosen: Comm 1, unit 01. Sending the configuration of eight ports ...");
    Send();
    const ChannelTable sent = program_.window.WorkingConfiguration();
    Read(10, program_.bench.unit_0a);
    SavePicture("read.png");
    Read(1, program_.bench.unit_01);
    line_.SetTap(nullptr);
    Require(program_.window.WorkingConfiguration() == sent, "What was read back is not what was sent.");
    Print("What was sent is what was read back.");
    PassPortBackAndForth();
  }

  // Pictures of the window at the start, of the editor with a servo, a digital and a PWM channel, of a send, of the
  // summary, of a number entry open in it, of what crossed the line, of the question for a port, and of what the help menu
  // shows.
  void TakePictures() {
    SavePicture("start.png");
    user_.ChoosePort(1);
    Press("ServoSimulator2_2");
    Press("chkUpdate_6");
    Step("spnNeutralTrim", 10);
    Step("spnLeftVirtStop", 15);
    Step("spnDefaultPos", -20);
    SavePicture("servo.png");
    Press("ServoSimulator2_4");
    Press("optChannelType_1");
    SavePicture("digital.png");
    Press("ServoSimulator2_5");
    Press("optChannelType_2");
    SavePicture("pwm.png");

    Press("cmdShowSummary");
    auto& text = user_.Find("txtSumStopRange_3");
    Await([&text] { return text.isVisible(); }, "the summary");
    SavePicture("summary.png");
    QTest::mouseClick(&text, Qt::LeftButton);
    SavePicture("number-entry.png");
    Press("cmdShowConfig");
    Press("ServoSimulator2_2");
    Send();
    Trigger("&Line");
    QApplication::processEvents();  // the content makes way, and scrolls
    SavePicture("line.png");
    Trigger("&Line");
    SavePictureOfQuestion();
    SavePictureOfDialog("&About", "AboutDialog", "about.png");
    SavePictureOfDialog("&Keys", "KeysDialog", "keys.png");
  }

  // Pictures of parts of the window, for the manual: the connection to a unit fresh from the factory; a servo beside its
  // pulse scale as it is at first, with a trim, and with a left stop at which it rests; the servo at both ends of its
  // virtual range; and values that are not stored.
  void TakeCloseUps() {
    user_.ChoosePort(2);
    user_.Find<QComboBox>("CmbUnitID_0").setCurrentIndex(0xF);
    user_.Find<QComboBox>("CmbUnitID_1").setCurrentIndex(0xF);
    auto& find = user_.Find("cmdFindUnits");
    QWidget& group = *find.parentWidget();
    Save(group.grab({0, 0, find.geometry().right() + kBetweenPictures, group.height()}), "connection.png");

    Press("ServoSimulator2_0");
    SaveCloseUp("scale-first.png", Servo(), Scale());
    const QPixmap shortest = ServoAt(0);
    SaveCloseUp("pulse-lengths.png", shortest, ServoAt(LiveTest::kSliderMaximum));

    ServoAt(LiveTest::kSliderMaximum / 2);
    Step("spnNeutralTrim", 10);
    SavePicture(*user_.Find("PulseScale").parentWidget(), "not-stored.png");
    Press("ServoSimulator2_0");  // stores, and moves the arm with the range
    SaveCloseUp("scale-trim.png", Servo(), Scale());
    Step("spnLeftVirtStop", 15);
    Step("spnDefaultPos", -20);
    const QPixmap at_stop = ServoAt(0);
    SaveCloseUp("scale-left-stop.png", at_stop, Scale());
  }

 private:
  static void Await(const std::function<bool()>& done, const std::string& what) {
    Require(WaitFor(done, kMaxStepMs),
            "Waited " + std::to_string(kMaxStepMs / 1000) + " s in vain for " + what + ".");
  }

  void Press(const char* button) const {
    user_.Button(button).setFocus(Qt::MouseFocusReason);
    user_.Button(button).click();
  }
  void Step(const char* spin, int steps) const {
    auto& stepped = user_.Find<QSpinBox>(spin);
    stepped.setFocus(Qt::MouseFocusReason);
    stepped.stepBy(steps);
  }

  void SavePicture(const char* name) { SavePicture(program_.window, name); }
  void SavePicture(QWidget& shown, const char* name) const {
    QApplication::sendPostedEvents(nullptr, QEvent::LayoutRequest);  // of texts that have just changed
    Save(shown.grab(), name);
  }

  QPixmap Picture(const char* control) const {
    QApplication::sendPostedEvents(nullptr, QEvent::LayoutRequest);
    return user_.Find(control).grab();
  }
  QPixmap Servo() const { return Picture("ServoSimulator1"); }
  QPixmap Scale() const { return Picture("PulseScale"); }
  // The servo with the slider at `place`, or as near to it as the stops allow.
  QPixmap ServoAt(int place) const {
    user_.Find<QSlider>("HScrollSendServoPosition").setValue(place);
    return Servo();
  }
  void SaveCloseUp(const char* name, const QPixmap& left, const QPixmap& right) const {
    Save(Beside(left, right, program_.window.palette().color(QPalette::Window)), name);
  }
  void Save(const QPixmap& picture, const char* name) const {
    const QString path = QDir(folder_).filePath(QString::fromUtf8(name));
    Require(picture.save(path), "Cannot save the picture " + path.toStdString());
    Print("Picture: " + path.toStdString());
  }
  void SavePictureOfQuestion() {
    user_.Rest(true);
    bool saved = false;
    QTimer::singleShot(0, qApp, [&] {
      QWidget* const box = QApplication::activeModalWidget();
      if (box == nullptr) return;
      SavePicture(*box, "port-in-use.png");
      saved = true;
      box->close();
    });
    user_.ChoosePort(kDemoPanelPort);
    Require(saved, "No question for Comm 3");
  }

  void Trigger(const char* menu_item) const {
    for (auto* action : program_.window.findChildren<QAction*>()) {
      if (action->text() == QString::fromUtf8(menu_item)) action->trigger();
    }
  }
  void SavePictureOfDialog(const char* menu_item, const char* dialog, const char* name) const {
    Trigger(menu_item);
    auto& shown = user_.Find(dialog);
    QApplication::processEvents();
    SavePicture(shown, name);
    shown.close();
  }

  void AwaitOutcome(const char* success) {
    Await([this] { return user_.CommandOver(); }, "the end of a command");
    printer_.Flush();
    PrintBoxes();
    const std::string outcome = user_.OutcomeLabel().text().toStdString();
    Print("The window says: " + outcome);
    Require(outcome == success, "The command failed.");
  }
  void PrintBoxes() {
    for (const auto& [title, text] : std::exchange(user_.read, {})) Print("Box \"" + title + "\": " + text);
  }

  void Send() {
    QApplication::processEvents();  // all of it is painted before the first poll
    const VirtualUnit& unit = program_.bench.unit_01;
    user_.Press(kSend);
    // In the pause between two ports: a picture takes longer than a unit waits for the line.
    Await([&] { return user_.CommandOver() || (unit.accepted_commands() >= 4 && !line_.NextEventUs()); },
          "the fourth port of a send");
    SavePicture("sending.png");
    AwaitOutcome("SUCCESS: Send Complete!");
    Compare(unit);
    SavePicture("sent.png");
  }

  // Reads the configuration of unit 0`digit`.
  void Read(int digit, const VirtualUnit& unit) {
    user_.Find<QComboBox>("CmbUnitID_1").setCurrentIndex(digit);
    Print("Chosen: unit " + HexByte(unit.id()) + ". Reading its configuration ...");
    user_.Press(kGet);
    AwaitOutcome("SUCCESS: Upload Complete");
    Compare(unit);
  }

  // Prints what the unit holds, port by port.
  void Compare(const VirtualUnit& unit) const {
    const ChannelTable shown = program_.window.WorkingConfiguration();
    for (int port = 1; port <= kUnitPorts; ++port) {
      const PortOptionBytes& held = unit.PortOptions(port);
      std::string line = "Port " + std::to_string(port) + " of unit " + HexByte(unit.id()) + " holds";
      for (const std::uint8_t byte : held) line += " " + std::to_string(byte);
      Print(line);
      const auto encoded = EncodeOptions(shown.At(static_cast<std::size_t>(port - 1)));
      const auto* bytes = std::get_if<OptionBytes>(&encoded);
      Require(bytes != nullptr && *bytes == held, "That is not what the window shows.");
    }
  }

  // Takes Comm 3 from the Control Panel and gives it back, which closes the window.
  void PassPortBackAndForth() {
    VirtualControlPanel& panel = program_.bench.panel;
    QElapsedTimer since;
    since.start();
    panel.SetTap([&since](PanelSide from, std::span<const std::uint8_t> bytes) {
      Print(PrintPanelBytes(static_cast<std::uint64_t>(since.nsecsElapsed() / 1000), from, bytes));
    });
    Print("Choosing Comm 3, which the Control Panel holds, and answering Yes ...");
    user_.ChoosePort(kDemoPanelPort);
    Await([&] { return !panel.Holds(kDemoPanelPort); }, "Comm 3");
    Await([this] { return user_.read.size() == 2; }, "the question and its answer");
    PrintBoxes();
    Print("Choosing Comm 3 again, and closing the window ...");
    user_.ChoosePort(kDemoPanelPort);
    Require(!program_.window.close(), "The window closed at once.");
    Await([&] { return panel.Holds(kDemoPanelPort) && !program_.window.isVisible(); }, "the window to close");
    panel.SetTap(nullptr);
    Print("The Control Panel has given up Comm 3, and has it back.");
  }

  const QString folder_;
  DemoProgram program_;
  VirtualLine& line_ = program_.bench.ports.Line(1);
  LinePrinter printer_{Print};
  User user_;
};

}  // namespace
}  // namespace tendril::test

int main(int argc, char** argv) {
  if (!qEnvironmentVariableIsSet("QT_QPA_PLATFORM")) qputenv("QT_QPA_PLATFORM", "offscreen");
  QApplication application(argc, argv);
  QCommandLineParser parser;
  parser.setApplicationDescription(
      QStringLiteral("Works the window of tendril-demo by itself: sends a configuration to unit 01, reads it "
                     "back, takes Comm 3 from "
                     "the Control Panel and gives it back. Prints what crosses the lines and saves pictures "
                     "of the window."));
  parser.addHelpOption();
  const QCommandLineOption pictures(
      QStringLiteral("pictures"),
      QStringLiteral("Only save pictures: of every view of the window, and of its dialogs."));
  const QCommandLineOption close_ups(
      QStringLiteral("close-ups"),
      QStringLiteral("Only save pictures of parts of the window, for the manual."));
  const QCommandLineOption dark(QStringLiteral("dark"), QStringLiteral("Light text on a dark background."));
  const QCommandLineOption size(QStringLiteral("size"), QStringLiteral("The size of the window."),
                                QStringLiteral("width>x<height"), QStringLiteral("1280x800"));
  parser.addOptions({pictures, close_ups, dark, size});
  parser.addPositionalArgument(QStringLiteral("folder"), QStringLiteral("Where to save the pictures."));
  parser.process(application);
  if (parser.positionalArguments().size() != 1) parser.showHelp(EXIT_FAILURE);
  if (parser.isSet(dark)) tendril::SetDarkAppearance(true);
  try {
    const QStringList sides = parser.value(size).split(QLatin1Char('x'));
    tendril::test::Require(sides.size() == 2, "The size needs a width and a height.");
    tendril::test::Show show(parser.positionalArguments().constFirst(), {sides[0].toInt(), sides[1].toInt()});
    if (parser.isSet(close_ups)) {
      show.TakeCloseUps();
    } else {
      parser.isSet(pictures) ? show.TakePictures() : show.Demonstrate();
    }
    return EXIT_SUCCESS;
  } catch (const std::exception& fault) {
    std::fprintf(stderr, "%s\n", fault.what());
    return EXIT_FAILURE;
  }
}
