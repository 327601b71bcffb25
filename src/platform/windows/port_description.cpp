// What Windows' device manager has about a port.
#include <windows.h>
// After windows.h, which these need.
#include <devguid.h>
#include <setupapi.h>
#include <winioctl.h>

#include <array>
#include <optional>
#include <string>
#include <utility>

#include "platform/port_names.h"
#include "platform/windows/wide_text.h"

namespace tendril {
namespace {

using Text = std::array<wchar_t, 512>;

// The devices of one class, or those that offer one interface.
class DeviceList {
 public:
  DeviceList(const GUID& kind, DWORD selection)
      : devices_(SetupDiGetClassDevsW(&kind, nullptr, nullptr, selection | DIGCF_PRESENT)) {}
  ~DeviceList() {
    if (devices_ != INVALID_HANDLE_VALUE) SetupDiDestroyDeviceInfoList(devices_);
  }
  DeviceList(const DeviceList&) = delete;
  DeviceList& operator=(const DeviceList&) = delete;

  std::optional<SP_DEVINFO_DATA> Find(const std::wstring& port) const {
    SP_DEVINFO_DATA device = {};
    device.cbSize = sizeof device;
    for (DWORD index = 0; SetupDiEnumDeviceInfo(devices_, index, &device); ++index) {
      if (EqualNames(PortName(device), port)) return device;
    }
    return std::nullopt;
  }

  // Empty when the device has no such property.
  std::wstring Property(SP_DEVINFO_DATA device, DWORD property) const {
    Text text = {};
    SetupDiGetDeviceRegistryPropertyW(devices_, &device, property, nullptr,
                                      reinterpret_cast<BYTE*>(text.data()), sizeof text - sizeof(wchar_t),
                                      nullptr);
    return text.data();
  }

 private:
  std::wstring PortName(SP_DEVINFO_DATA device) const {
    const HKEY key = SetupDiOpenDevRegKey(devices_, &device, DICS_FLAG_GLOBAL, 0, DIREG_DEV, KEY_QUERY_VALUE);
    if (key == INVALID_HANDLE_VALUE) return {};
    Text text = {};
    DWORD size = sizeof text - sizeof(wchar_t);
    RegQueryValueExW(key, L"PortName", nullptr, nullptr, reinterpret_cast<BYTE*>(text.data()), &size);
    RegCloseKey(key);
    return text.data();
  }

  HDEVINFO devices_;
};

// "USB Serial Port (COM3)" without the port, which is shown beside it.
std::wstring WithoutPort(std::wstring name, const std::wstring& port) {
  const std::wstring end = L" (" + port + L")";
  if (name.ends_with(end)) name.resize(name.size() - end.size());
  return name;
}

}  // namespace

DeviceDescription DescribeSerialDevice(const std::filesystem::path& device) {
  const std::wstring port = device.wstring();
  DeviceDescription description = {.path = device.string()};
  // A driver may do without the class.
  for (const auto& [kind, selection] : {std::pair(GUID_DEVCLASS_PORTS, DWORD{0}),
                                        std::pair(GUID_DEVINTERFACE_COMPORT, DWORD{DIGCF_DEVICEINTERFACE})}) {
    const DeviceList devices(kind, selection);
    const auto found = devices.Find(port);
    if (!found) continue;
    std::wstring name = devices.Property(*found, SPDRP_FRIENDLYNAME);
    if (name.empty()) name = devices.Property(*found, SPDRP_DEVICEDESC);
    description.adapter = NarrowText(WithoutPort(name, port));
    const std::wstring maker = devices.Property(*found, SPDRP_MFG);
    if (!maker.starts_with(L'(')) description.maker = NarrowText(maker);  // "(Standard port types)" is none
    break;
  }
  return description;
}

}  // namespace tendril
