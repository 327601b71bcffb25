// Which program has a serial device open.
#pragma once

#include <filesystem>

#include "platform/serial_device.h"

namespace tendril {

// Another program that has `device`, a path without links, open. An ordinary user's program sees those of the same
// user. A modem manager belongs to the system; it opens each new device for some seconds, so it is a guess.
PortHolder FindPortHolder(const std::filesystem::path& device);

}  // namespace tendril
