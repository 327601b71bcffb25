// The serial ports of this system in the event loop. Each system compiles its own implementation.
#pragma once

#include <cstdint>
#include <filesystem>
#include <functional>
#include <memory>
#include <string>

#include "platform/serial_device.h"
#include "platform/serial_port.h"

namespace tendril {

// Opens `device`, which is comm port `number`, at `baud` bit/s. `on_readable` is called when bytes have arrived or the
// device may have gone, `on_writable` when the system can take more, both from the event loop. Raises what
// SerialDevice::Open() raises.
std::unique_ptr<SerialPort> OpenSerialPort(std::int32_t number, const std::filesystem::path& device,
                                           std::int32_t baud, std::function<void()> on_readable,
                                           std::function<void()> on_writable);

// As SerialDevice::Describe() and SerialDevice::Holder().
DeviceDescription DescribeSerialPort(const std::filesystem::path& device);
PortHolder FindSerialPortHolder(const std::filesystem::path& device);

}  // namespace tendril
