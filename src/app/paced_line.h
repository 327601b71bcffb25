// PacedLine: a virtual line in real time.
#pragma once

#include <QSocketNotifier>
#include <QTimer>
#include <chrono>
#include <cstdint>
#include <memory>

#include "app/console.h"
#include "app/pseudo_terminal.h"
#include "bench/printers.h"
#include "bench/virtual_line.h"

namespace tendril {

// Runs a line in real time on a pseudo-terminal. What the program at the near end sends is heard by the
// units, and what they say reaches it, each byte when it would come over a wire.
class PacedLine {
 public:
  // Terminal, line and console must outlive this object. Whether the bytes on the line are printed is
  // `show_bytes`.
  PacedLine(const PseudoTerminal& terminal, VirtualLine& line, Console& console, bool show_bytes);

  // The time on the line, since it was made.
  std::uint64_t NowUs() const;

 private:
  void Step();
  bool HasRoom();
  void TakeInput();
  void FollowSpeed();
  void OnClosing();

  const PseudoTerminal& terminal_;
  VirtualLine& line_;
  Console& console_;
  LinePrinter printer_;
  const std::chrono::steady_clock::time_point start_ = std::chrono::steady_clock::now();
  std::uint32_t program_baud_;  // as last noted
  bool program_reads_ = true;   // as last noted
  bool program_heard_ = false;  // since one was last seen to close the device
  QTimer timer_;
  QSocketNotifier input_;
  std::unique_ptr<QSocketNotifier> closings_;
};

}  // namespace tendril
