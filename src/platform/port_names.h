// The device of a comm port number. Each system compiles its own implementation: posix/ or windows/.
//
//   Windows        COM<n>
//   Linux, macOS   the link com<n> in the folder `ports` of the configuration folder, if there is one; else
//     Linux        1-4 /dev/ttyS0-3, 5-14 /dev/ttyUSB0-9, 15-24 /dev/ttyACM0-9
//     macOS        the /dev/cu.* devices in order of name
#pragma once

#include <cstdint>
#include <filesystem>
#include <optional>
#include <string>
#include <vector>

#include "platform/serial_device.h"

namespace tendril {

// The device of port `number` (1 = the first), links resolved; nothing when there is none. A link whose device is gone
// is no port, and hides the number's own device. Never opens a device: that would change its control lines.
std::optional<std::filesystem::path> FindSerialDevice(std::int32_t number);

#ifdef _WIN32
// Whether there is a port of this name ("COM3").
bool SerialDeviceExists(const std::filesystem::path& device);

// As SerialDevice::Describe().
DeviceDescription DescribeSerialDevice(const std::filesystem::path& device);
#else
// The folders whose entries decide which devices the ports have. They need not exist.
std::vector<std::filesystem::path> SerialDeviceFolders();

// The device of port `number` without a link; empty when the number has none. It need not exist.
std::filesystem::path DefaultSerialDevice(std::int32_t number);

// False when the driver found no hardware for `device`: Linux has /dev/ttyS nodes for UARTs that a machine could have.
// `tty_class` is the folder in which the drivers describe their devices.
bool DriverFoundHardware(const std::filesystem::path& device,
                         const std::filesystem::path& tty_class = "/sys/class/tty");

// As SerialDevice::Describe(). `tty_class` as above.
DeviceDescription DescribeSerialDevice(const std::filesystem::path& device,
                                       const std::filesystem::path& tty_class = "/sys/class/tty");
#endif

}  // namespace tendril
