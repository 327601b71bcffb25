// What crosses a connection to the Control Panel, for a person to read.
#pragma once

#include <cstdint>
#include <span>
#include <string>

#include "bench/virtual_control_panel.h"

namespace tendril {

// One line of text, as a LinePrinter writes it for a serial line: the time in seconds, who sent it, the bytes in
// hexadecimal, and what they mean.
//
//     3.284375  program  43 31 30 30 30 30 32 03 00                      request 1: give up Comm 3
//     3.284402  panel    31 31 30 30 30 30 30                            reply to 1: done
std::string PrintPanelBytes(std::uint64_t at_us, PanelSide from, std::span<const std::uint8_t> bytes);

}  // namespace tendril
