#include "platform/port_names.h"

#include <algorithm>
#include <array>
#include <fstream>
#include <string>
#include <string_view>
#include <system_error>
#include <vector>

#include "platform/paths.h"

namespace tendril {
namespace {

namespace fs = std::filesystem;

// The UART type that the serial drivers of Linux report when they found none.
constexpr int kNoUart = 0;

fs::path PortsFolder() { return ConfigFolder() / "ports"; }

std::string FirstLine(const fs::path& file) {
  std::ifstream stream(file);
  std::string line;
  std::getline(stream, line);
  return line;
}

#ifdef __APPLE__

fs::path DeviceAt(std::int32_t number) {
  std::vector<fs::path> devices;
  std::error_code ignored;
  for (const fs::directory_entry& entry : fs::directory_iterator("/dev", ignored)) {
    if (entry.path().filename().string().starts_with("cu.")) devices.push_back(entry.path());
  }
  std::sort(devices.begin(), devices.end());
  const auto index = static_cast<std::size_t>(number - 1);
  return index < devices.size() ? devices[index] : fs::path();
}

#else

// Port numbers that stand for one driver's devices, counted from 0.
struct DriverRange {
  std::int32_t first_number;
  std::int32_t last_number;
  std::string_view device_prefix;
};

constexpr std::array<DriverRange, 3> kDriverRanges = {{
    {1, 4, "/dev/ttyS"},      // built in
    {5, 14, "/dev/ttyUSB"},   // USB adapters with a chip of their own
    {15, 24, "/dev/ttyACM"},  // USB adapters of the modem class
}};

fs::path DeviceAt(std::int32_t number) {
  for (const DriverRange& range : kDriverRanges) {
    if (number >= range.first_number && number <= range.last_number) {
      return std::string(range.device_prefix) + std::to_string(number - range.first_number);
    }
  }
  return {};
}

#endif

}  // namespace

fs::path DefaultSerialDevice(std::int32_t number) { return number >= 1 ? DeviceAt(number) : fs::path(); }

bool DriverFoundHardware(const fs::path& device, const fs::path& tty_class) {
  std::ifstream file(tty_class / device.filename() / "type");
  int type = kNoUart;
  return !(file >> type) || type != kNoUart;  // only UART drivers give a type
}

DeviceDescription DescribeSerialDevice(const fs::path& device, const fs::path& tty_class) {
  // A USB adapter is described in the first folder above its terminal device that has a vendor's number. Further up are
  // the hubs.
  std::error_code error;
  for (fs::path folder = fs::canonical(tty_class / device.filename(), error);
       !error && folder.has_relative_path(); folder = folder.parent_path()) {
    if (!fs::exists(folder / "idVendor", error)) continue;
    return {FirstLine(folder / "product"), FirstLine(folder / "manufacturer"), device.string()};
  }
  return {.path = device.string()};
}

std::vector<fs::path> SerialDeviceFolders() { return {"/dev", PortsFolder()}; }

std::optional<fs::path> FindSerialDevice(std::int32_t number) {
  std::error_code error;
  fs::path device = PortsFolder() / ("com" + std::to_string(number));
  if (!fs::exists(fs::symlink_status(device, error))) device = DefaultSerialDevice(number);
  if (device.empty()) return std::nullopt;

  device = fs::canonical(device, error);
  if (error || !fs::is_character_file(device, error) || !DriverFoundHardware(device)) return std::nullopt;
  return device;
}

}  // namespace tendril
