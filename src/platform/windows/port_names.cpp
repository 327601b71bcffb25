#include "platform/port_names.h"

#include <windows.h>

#include <array>
#include <string>

#include "platform/windows/wide_text.h"

namespace tendril {
namespace {

// Drivers list their ports here. A value's name is the driver's for the device, its text the port.
bool Listed(const std::wstring& port) {
  HKEY list = nullptr;
  if (RegOpenKeyExW(HKEY_LOCAL_MACHINE, L"HARDWARE\\DEVICEMAP\\SERIALCOMM", 0, KEY_QUERY_VALUE, &list) != 0) {
    return false;
  }
  bool found = false;
  LSTATUS result = ERROR_SUCCESS;
  for (DWORD index = 0; !found && result != ERROR_NO_MORE_ITEMS; ++index) {
    std::array<wchar_t, 256> device;
    std::array<wchar_t, 64> name = {};
    DWORD device_size = static_cast<DWORD>(device.size());
    DWORD name_bytes = sizeof name - sizeof(wchar_t);  // the text may come without an end
    result = RegEnumValueW(list, index, device.data(), &device_size, nullptr, nullptr,
                           reinterpret_cast<BYTE*>(name.data()), &name_bytes);
    found = result == ERROR_SUCCESS && EqualNames(name.data(), port);
  }
  RegCloseKey(list);
  return found;
}

// A port of another computer, of which this is the remote desktop, is not listed.
bool CanBeOpened(const std::wstring& port) {
  std::array<wchar_t, 1024> target;  // its content is not used
  return QueryDosDeviceW(port.c_str(), target.data(), static_cast<DWORD>(target.size())) != 0 ||
         GetLastError() == ERROR_INSUFFICIENT_BUFFER;
}

}  // namespace

bool SerialDeviceExists(const std::filesystem::path& device) {
  return CanBeOpened(device.wstring()) || Listed(device.wstring());
}

std::optional<std::filesystem::path> FindSerialDevice(std::int32_t number) {
  const std::filesystem::path device = L"COM" + std::to_wstring(number);
  if (number < 1 || !SerialDeviceExists(device)) return std::nullopt;
  return device;
}

}  // namespace tendril
