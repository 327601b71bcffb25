// MeasuredWindow: the program's window with its real adapters, on a bench in a process of its own.
#pragma once

#include <QAbstractButton>
#include <QAction>
#include <QApplication>
#include <QComboBox>
#include <QEventLoop>
#include <QLabel>
#include <QString>
#include <QTimer>
#include <cstddef>
#include <memory>
#include <stdexcept>
#include <string>

#include "app/qt_platform.h"
#include "measuring.h"
#include "platform/bytes.h"
#include "platform/paths.h"
#include "platform/qt/qt_serial_device.h"
#include "platform/qt/qt_tcp_socket.h"
#include "platform/system_processes.h"
#include "platform/system_registry.h"
#include "prefs/registry.h"
#include "serial/command_log.h"
#include "serial/hw_serial.h"
#include "support/bench_process.h"
#include "support/counting_device.h"
#include "support/find_control.h"
#include "trace/line_trace.h"
#include "ui/frm_new_servo_config.h"
#include "unitops/control_panel.h"

namespace tendril {

// Shown, and with Comm 1 open, from the start. Unit 01 is chosen and well-behaved.
class MeasuredWindow {
 public:
  MeasuredWindow() {
    window_.show();
    auto& ports = Child<QComboBox>("cmbNYX");
    ports.setCurrentIndex(1);
    Q_EMIT ports.activated(1);
    RunFor(kSettleMs);
  }

  // Raises std::runtime_error when the window has no such control.
  template <typename Control>
  Control& Child(const char* name) {
    return test::FindControl<Control>(window_, name);
  }

  // Presses the button of a unit command and waits for its outcome. Returns how long that took in
  // milliseconds; `device` has counted from the click to the outcome. Raises std::runtime_error unless the
  // outcome is `success`.
  double RunCommand(const char* button, const char* success) {
    auto& outcome = Child<QLabel>("lblProgress");
    outcome.clear();
    RunFor(kSettleMs);  // what is still on the line does not belong to the command
    device.ClearInput();
    device.sent = device.received = device.pended = 0;
    const Stopwatch stopwatch;
    Child<QAbstractButton>(button).click();
    while (outcome.text().isEmpty() && stopwatch.Ms() < kLongestCommandMs) {
      QApplication::processEvents(QEventLoop::WaitForMoreEvents);
    }
    const double taken_ms = stopwatch.Ms();
    if (outcome.text() != QString::fromLatin1(success)) {
      throw std::runtime_error("The command failed: " + outcome.text().toStdString());
    }
    return taken_ms;
  }

  // Shows the pane of the line, with a full trace.
  void ShowFullLine() {
    constexpr std::size_t kPacketsAtOnce = 200;  // each in the trace once as sent, and once as echo
    Bytes packets;
    for (std::size_t i = 0; i < kPacketsAtOnce; ++i) packets.insert(packets.end(), {1, 0});
    Child<QAction>("actLine").trigger();
    for (std::size_t i = 0; i < LineTrace::kMaxEntries / 2 / kPacketsAtOnce; ++i) {
      link_.RawOutput(packets);
      RunFor(kSettleMs + 50);  // they take that long on the line
    }
  }

  // Runs the event loop for `ms` milliseconds.
  static void RunFor(int ms) {
    QEventLoop loop;
    QTimer::singleShot(ms, Qt::PreciseTimer, &loop, [&loop] { loop.quit(); });
    loop.exec();
  }

 private:
  static constexpr int kSettleMs = 200;
  static constexpr double kLongestCommandMs = 30000;

  // Its device is there when the window lists the ports.
  struct StartedBench : test::BenchProcess {
    StartedBench() { Start(); }
  };

  StartedBench bench_;
  QtPlatform platform_;
  const std::unique_ptr<SerialDevice> serial_ = std::make_unique<QtSerialDevice>(platform_.on_fault);

 public:
  test::CountingDevice device{*serial_};

 private:
  FileCommandLog log_{CommandLogPath()};
  HwSerial link_{device, platform_.timers, platform_.clock, log_};
  // The client goes on trying to connect meanwhile, as it does without a Control Panel.
  QtTcpSocket wsCLI_{platform_.on_fault};
  const std::unique_ptr<RegistryStore> registry_store_ = OpenSystemRegistry({});
  Registry registry_{*registry_store_, {}};
  const std::unique_ptr<ProcessList> processes_ = OpenProcessList();
  ControlPanel control_panel_{platform_.timers, platform_.boxes, wsCLI_, registry_, *processes_};
  frmNewServoConfig window_{link_, platform_.timers, platform_.boxes, control_panel_, {{1, 0, 0}, {}, {}}};
};

}  // namespace tendril
