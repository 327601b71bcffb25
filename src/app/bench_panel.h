// BenchPanel: the Control Panel beside a bench's serial line, which holds the line's device until a program asks for
// it.
#pragma once

#include <QTimer>
#include <cstdint>
#include <functional>
#include <memory>
#include <string>

#include "app/bench_options.h"
#include "app/control_panel_server.h"
#include "app/pseudo_terminal.h"
#include "bench/virtual_control_panel.h"
#include "platform/posix/serial_hold.h"
#include "platform/timer.h"

namespace tendril {

class BenchPanel {
 public:
  // Takes the device of `terminal`, which programs know as the comm port of `options`, and listens. `print` gets
  // lines of text. Raises what SerialHold and ControlPanelServer raise. Terminal and timers must outlive the
  // panel.
  BenchPanel(const BenchPanelOptions& options, const PseudoTerminal& terminal, TimerFactory& timers,
             std::function<void(const std::string&)> print);

  // Prints each connection that begins or ends and what crosses it, with times from `now_us`.
  void ShowConnections(std::function<std::uint64_t()> now_us);
  // The TCP port where it listens.
  std::uint16_t tcp_port() const { return server_.port(); }

 private:
  void SetHeld(bool held);
  void TakeBack();
  void Note(const std::string& sentence) const { print_("-- " + sentence); }

  const PseudoTerminal& terminal_;
  const std::string comm_port_;  // "Comm 1"
  std::function<void(const std::string&)> print_;
  std::function<std::uint64_t()> now_us_;  // empty while connections are not shown
  VirtualControlPanel panel_;
  ControlPanelServer server_;
  std::unique_ptr<SerialHold> hold_;
  QTimer retry_;  // runs while the device is wanted back and a program has it
};

}  // namespace tendril
