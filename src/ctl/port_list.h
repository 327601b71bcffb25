// The serial ports of this computer.
#pragma once

#include <cstdint>
#include <string>
#include <vector>

#include "platform/serial_device.h"

namespace tendril::ctl {

// The numbers of the ports that exist, of those that --port can name.
std::vector<std::int16_t> ListedPorts(const SerialDevice& device);

// "Comm 1", "Comm 1 and Comm 5", "Comm 1, Comm 5 and Comm 6". There is at least one. `joined`: "and", "or".
std::string PortNames(const std::vector<std::int16_t>& numbers, const std::string& joined);

// "minicom (process 4321)", "another program".
std::string HolderName(const PortHolder& holder);

}  // namespace tendril::ctl
