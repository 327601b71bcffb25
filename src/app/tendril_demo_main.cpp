// tendril-demo: the utility's window on a virtual bench inside the process, for trying it without hardware.
#include <QApplication>
#include <QCommandLineParser>
#include <QPalette>
#include <QStyleFactory>
#include <QTemporaryDir>
#include <cstdint>
#include <filesystem>
#include <memory>
#include <string>
#include <string_view>

#include "app/demo_show.h"
#include "app/qt_platform.h"
#include "app/version.h"
#include "bench/virtual_control_panel.h"
#include "bench/virtual_ports.h"
#include "bench/virtual_tcp_socket.h"
#include "bench/virtual_unit.h"
#include "platform/memory_registry.h"
#include "platform/process_list.h"
#include "prefs/registry.h"
#include "serial/command_log.h"
#include "serial/hw_serial.h"
#include "ui/frm_new_servo_config.h"
#include "unitops/control_panel.h"

namespace {

using namespace tendril;

// Pads enough for the program to release the line in time even when its window has just been painting.
constexpr ReplyTiming kPatient{.turn_round_us = 2000, .pads = 45};

// Where the demonstration's Control Panel listens: what the preferences say when nothing is in them.
constexpr std::uint16_t kListenerPort = 8837;
constexpr std::uint8_t kPanelPort = 3;

// The Control Panel runs, and nothing else does.
class DemoProcesses final : public ProcessList {
 public:
  bool IsRunning(std::string_view program) const override { return program == kControlPanelProgram; }
};

// Comm 1: two working units. Comm 2: one fresh from the factory. Comm 3: a working unit, held by the Control Panel
// until it is asked for. Comm 4: nobody answers.
DemoUnits FillBench(VirtualPorts& bench, VirtualControlPanel& panel) {
  for (const int port : {1, 2, 3, 4}) bench.AddPort(port);
  auto& first = bench.Attach<VirtualUnit>(1, std::uint8_t{0x01}, kPatient);
  auto& second = bench.Attach<VirtualUnit>(1, std::uint8_t{0x0A}, kPatient);
  bench.Attach<VirtualUnit>(2, std::uint8_t{0xFF}, kPatient);
  bench.Attach<VirtualUnit>(kPanelPort, std::uint8_t{0x01}, kPatient);
  panel.AddPort(kPanelPort);
  bench.SetHeldByAnother(kPanelPort, true);
  panel.SetPortHandler([&bench](std::uint8_t port, bool held) { bench.SetHeldByAnother(port, held); });
  // Somebody has set them up before, otherwise than the window starts with.
  for (int port = 1; port <= kUnitPorts; ++port) {
    first.SetPortOptions(port, {1, 80, 220, 125, 175, 125, 175, 150, 150});
    const auto by = [port](int width) { return static_cast<std::uint8_t>(width + 2 * port); };
    second.SetPortOptions(port, {1, 60, 240, by(80), by(170), by(90), by(160), by(120), by(130)});
  }
  return {first, second};
}

QPalette DarkPalette() {
  const QColor text(0xE6, 0xE6, 0xE6);
  QPalette dark(QColor(0x50, 0x53, 0x57), QColor(0x3C, 0x3F, 0x43));
  dark.setColor(QPalette::Base, QColor(0x1F, 0x21, 0x24));
  dark.setColor(QPalette::AlternateBase, QColor(0x2B, 0x2D, 0x30));
  for (const auto role :
       {QPalette::WindowText, QPalette::Text, QPalette::ButtonText, QPalette::ToolTipText}) {
    dark.setColor(role, text);
    dark.setColor(QPalette::Disabled, role, QColor(0x8A, 0x8D, 0x91));
  }
  dark.setColor(QPalette::PlaceholderText, QColor(0xA0, 0xA4, 0xA8));
  dark.setColor(QPalette::ToolTipBase, QColor(0x3C, 0x3F, 0x43));
  dark.setColor(QPalette::Highlight, QColor(0x2A, 0x82, 0xDA));
  dark.setColor(QPalette::HighlightedText, Qt::white);
  return dark;
}

}  // namespace

int main(int argc, char** argv) {
  QApplication application(argc, argv);
  QCommandLineParser parser;
  parser.setApplicationDescription(QStringLiteral(
      "The Tendril Configuration Utility on a virtual bench. Comm 1 has working units at 01 and 0A, Comm 2 "
      "one fresh from the factory at FF, Comm 3 is held by a Control Panel that can be asked for it, and on "
      "Comm 4 nobody answers."));
  parser.addHelpOption();
  const QCommandLineOption show(
      QStringLiteral("without-display"),
      QStringLiteral(
          "Send a configuration to unit 01, read it back, take Comm 3 from the Control Panel and give "
          "it back, print what crosses the lines, save pictures of the window in <folder>, and end."),
      QStringLiteral("folder"));
  const QCommandLineOption pictures(
      QStringLiteral("pictures"),
      QStringLiteral(
          "Save pictures of the editor, of the summary and of the question for a port in <folder>, and end."),
      QStringLiteral("folder"));
  const QCommandLineOption dark(QStringLiteral("dark"), QStringLiteral("Light text on a dark ground."));
  parser.addOptions({show, pictures, dark});
  parser.process(application);
  if (parser.isSet(dark)) {
    QApplication::setStyle(QStyleFactory::create(QStringLiteral("Fusion")));
    QApplication::setPalette(DarkPalette());
  }

  QTemporaryDir scratch;  // a demonstration leaves nothing behind
  QtPlatform platform;
  VirtualPorts bench(platform.clock, platform.timers);
  VirtualControlPanel panel(platform.timers);
  const DemoUnits units = FillBench(bench, panel);
  const std::unique_ptr<SerialDevice> device = bench.CreateDevice();
  FileCommandLog log(std::filesystem::path(scratch.filePath(QStringLiteral("HUtest.txt")).toStdString()));
  HwSerial Serial1(*device, platform.timers, platform.clock, log);
  PrintedBoxes printed_boxes;
  MessageBoxes& boxes = parser.isSet(show) ? static_cast<MessageBoxes&>(printed_boxes) : platform.boxes;
  VirtualTcpSocket wsCLI(panel, kListenerPort, platform.timers);
  MemoryRegistry registry_store;
  Registry registry(registry_store, [](const std::string& /*warning*/) {});
  const DemoProcesses processes;
  ControlPanel control_panel(platform.timers, boxes, wsCLI, registry, processes);
  frmNewServoConfig window(Serial1, platform.timers, boxes, control_panel, kVersion);
  platform.boxes.SetParent(&window);
  window.show();
  if (parser.isSet(show)) return ShowWithoutDisplay(window, bench.Line(1), units, panel, parser.value(show));
  if (parser.isSet(pictures)) return TakePictures(window, parser.value(pictures));
  return QApplication::exec();
}
