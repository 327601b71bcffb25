#include "platform/port_names.h"

#include <windows.h>

#include <array>
#include <string>

namespace tendril {

std::optional<std::filesystem::path> FindSerialDevice(std::int32_t number) {
  if (number < 1) return std::nullopt;
  const std::wstring name = L"COM" + std::to_wstring(number);
  std::array<wchar_t, 1024> target;  // its content is not used
  if (QueryDosDeviceW(name.c_str(), target.data(), static_cast<DWORD>(target.size())) == 0 &&
      GetLastError() != ERROR_INSUFFICIENT_BUFFER) {
    return std::nullopt;
  }
  return name;
}

}  // namespace tendril
