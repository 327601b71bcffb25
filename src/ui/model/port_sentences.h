// The sentences about the comm port.
#pragma once

#include <string>

#include "unitops/port_facts.h"

namespace tendril {

// Whether the chosen port is open, and why not: "Comm 3 open: FT232R USB UART (FTDI), /dev/ttyUSB0", "Comm 3 is not
// open: it was unplugged".
std::string PortSentence(const PortFacts& facts);

// What became of the port that was asked of the Control Panel; empty while there is nothing to say of one.
std::string BorrowedPortSentence(const PortFacts& facts);

}  // namespace tendril
