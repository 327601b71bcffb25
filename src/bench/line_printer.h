// LinePrinter: what crosses a line, for a person to read.
#pragma once

#include <cstdint>
#include <functional>
#include <string>

#include "bench/virtual_line.h"
#include "platform/bytes.h"

namespace tendril {

// Puts the bytes of a line together to packets and prints each as one line of text: the time of its last byte
// in seconds, who sent it, its bytes in hexadecimal, and what it means.
//
//     1.284375  program  00 01 88 30 2D 00                               poll unit 01, kind '0'
//     1.290104  unit     00 00 00 FE 30 01 0A 00                         reply to '0': acknowledged
class LinePrinter {
 public:
  // `print` gets each line without an end of line.
  explicit LinePrinter(std::function<void(const std::string&)> print);

  // The next byte, as from VirtualLine::SetTap().
  void Note(const LineByte& byte);
  // Prints what has come of a packet that is not complete. To be called when the line falls silent.
  void Flush();

 private:
  std::function<void(const std::string&)> print_;
  LineSide from_ = LineSide::kProgram;
  Bytes bytes_;  // of the packet that is coming in
  std::uint64_t last_us_ = 0;
  bool garbled_ = false;
  bool has_content_ = false;  // one of bytes_ is not zero
};

}  // namespace tendril
