// The serial ports of this computer. Each system compiles its own implementation.
#pragma once

#include <functional>
#include <memory>
#include <string>

#include "platform/qt/fault_handler.h"
#include "platform/serial_device.h"

namespace tendril {

// A device for the ports that FindSerialDevice() finds. `on_fault` gets failures of the event handler, `trace` what
// a support person may want to know.
std::unique_ptr<SerialDevice> CreateSystemSerialDevice(FaultHandler on_fault,
                                                       std::function<void(const std::string&)> trace = {});

}  // namespace tendril
