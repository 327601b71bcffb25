#include "app/demo_show.h"

#include <QAbstractButton>
#include <QApplication>
#include <QComboBox>
#include <QDeadlineTimer>
#include <QDir>
#include <QLabel>
#include <QPixmap>
#include <cstdio>
#include <string>
#include <variant>

#include "bench/line_printer.h"
#include "config/option_bytes.h"

namespace tendril {
namespace {

constexpr int kLongestSendMs = 30000;
constexpr QSize kPictureSize(1280, 800);

void Print(const std::string& line) {
  std::puts(line.c_str());
  std::fflush(stdout);
}

class Actor {
 public:
  Actor(frmNewServoConfig& window, const QString& folder) : window_(window), folder_(folder) {}

  template <typename Widget>
  Widget& Find(const char* name) const {
    return *window_.findChild<Widget*>(QString::fromUtf8(name));
  }

  // Lets the program run until `done`; false when it takes too long.
  template <typename Done>
  static bool RunUntil(Done done) {
    const QDeadlineTimer deadline(kLongestSendMs);
    while (!done()) {
      if (deadline.hasExpired()) return false;
      QApplication::processEvents(QEventLoop::WaitForMoreEvents);
    }
    return true;
  }

  bool SavePicture(const char* name) const {
    const QString path = QDir(folder_).filePath(QString::fromUtf8(name));
    const bool saved = window_.grab().save(path);
    Print(saved ? "Picture: " + path.toStdString() : "This picture cannot be saved: " + path.toStdString());
    return saved;
  }

 private:
  frmNewServoConfig& window_;
  QString folder_;
};

// Compares port by port, and prints what the unit holds.
bool HoldsWhatWasSent(const VirtualUnit& unit, const ChannelTable& sent) {
  bool all_equal = true;
  for (int port = 1; port <= kUnitPorts; ++port) {
    const PortOptionBytes& held = unit.PortOptions(port);
    const auto encoded = EncodeOptions(sent.At(static_cast<std::size_t>(port - 1)));
    const auto* bytes = std::get_if<OptionBytes>(&encoded);
    const bool equal = bytes != nullptr && *bytes == held;
    std::string line = "Port " + std::to_string(port) + " of unit 01 holds";
    for (const std::uint8_t byte : held) line += " " + std::to_string(byte);
    Print(line + (equal ? "" : "   NOT what was sent"));
    all_equal = all_equal && equal;
  }
  return all_equal;
}

}  // namespace

void PrintedBoxes::Show(const BoxMessage& message) {
  Print("Box \"" + message.title + "\": " + message.text);
}

bool PrintedBoxes::AskYesNo(const BoxMessage& message) {
  Show(message);
  return false;
}

int ShowWithoutDisplay(frmNewServoConfig& window, VirtualLine& line, const VirtualUnit& unit,
                       const QString& folder) {
  const Actor actor(window, folder);
  window.resize(kPictureSize);
  QApplication::processEvents();
  if (!QDir().mkpath(folder) || !actor.SavePicture("window-start.png")) return 1;

  LinePrinter printer(Print);
  line.SetTap([&printer](const LineByte& byte) { printer.Note(byte); });
  auto& ports = actor.Find<QComboBox>("cmbNYX");
  ports.setCurrentIndex(1);
  Q_EMIT ports.activated(1);
  Print("Chosen: " + ports.currentText().toStdString() +
        ", unit 01. Sending the configuration of eight ports ...");
  actor.Find<QAbstractButton>("Command3_0").click();

  auto& outcome = actor.Find<QLabel>("lblProgress");
  // In the pause between two ports: a picture takes longer than a unit waits for the line.
  bool ended = Actor::RunUntil([&] { return unit.accepted_commands() >= 4 && !line.NextEventUs(); });
  const bool saved = actor.SavePicture("window-sending.png");
  ended = ended && Actor::RunUntil([&] { return !outcome.text().isEmpty(); });
  printer.Flush();
  line.SetTap(nullptr);
  Print("The window says: " + outcome.text().toStdString());
  const bool equal = HoldsWhatWasSent(unit, window.WorkingConfiguration());
  Print(equal ? "The unit holds what was sent." : "The unit does NOT hold what was sent.");
  return actor.SavePicture("window-sent.png") && saved && ended && equal ? 0 : 1;
}

}  // namespace tendril
