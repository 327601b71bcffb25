#include "platform/serial_hold.h"

#include <windows.h>

#include <array>

namespace tendril {

SerialHold::SerialHold(const std::filesystem::path& device) : device_(device) {}

SerialHold::~SerialHold() = default;

// The driver takes the port's name away with the device, even while the port is open.
bool SerialHold::DeviceGone() const {
  std::array<wchar_t, 1024> target;
  return QueryDosDeviceW(device_.c_str(), target.data(), static_cast<DWORD>(target.size())) == 0 &&
         GetLastError() == ERROR_FILE_NOT_FOUND;
}

// A write counts as pending in the port itself until the driver has sent it.
std::size_t SerialHold::QueuedOutput() const { return 0; }

void SerialHold::AskForLowLatency() const {}

}  // namespace tendril
