// What crosses a line or a connection to the Control Panel, for the user to read.
#pragma once

#include <cstdint>
#include <functional>
#include <span>
#include <string>

#include "bench/virtual_control_panel.h"
#include "bench/virtual_line.h"
#include "trace/packet_meaning.h"

namespace tendril {

// Puts the bytes of a line together to packets and prints each as one line of text: the time of its last byte in
// seconds, who sent it, its bytes in hexadecimal, and what it means.
//
//     1.284375  program  00 01 88 30 2D 00                               poll unit 01, kind '0'
//     1.290104  unit     00 00 00 FE 30 01 0A 00                         reply to '0': acknowledged
class LinePrinter {
 public:
  // `print` gets each line without an end of line.
  explicit LinePrinter(std::function<void(const std::string&)> print);

  // The next byte, as from VirtualLine::SetTap().
  void Note(const LineByte& byte);
  // Prints an incomplete packet. To be called when the line falls silent.
  void Flush();

 private:
  std::function<void(const std::string&)> print_;
  LineSide from_ = LineSide::kProgram;
  PacketSplitter packet_;
  std::uint64_t last_us_ = 0;
  bool garbled_ = false;
};

// One line of text about a frame on a connection to the Control Panel, in the same columns.
//
//     3.284375  program  43 31 30 30 30 30 32 03 00                      request 1: give up Comm 3
//     3.284402  panel    31 31 30 30 30 30 30                            reply to 1: done
std::string PrintPanelBytes(std::uint64_t at_us, PanelSide from, std::span<const std::uint8_t> bytes);

}  // namespace tendril
