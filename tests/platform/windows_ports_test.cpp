// The serial ports of Windows, as far as they need no device.
#include <gtest/gtest.h>
#include <windows.h>
// After windows.h, which these need.
#include <devguid.h>
#include <setupapi.h>

#include <filesystem>
#include <string>

#include "platform/port_names.h"
#include "platform/runtime_error.h"
#include "platform/windows/serial_handle.h"
#include "platform/windows/system_text.h"
#include "support/failure_of.h"

namespace tendril {
namespace {

// A driver's entry for a port; gone with the object.
class ListedPort {
 public:
  explicit ListedPort(const std::wstring& port) {
    RegCreateKeyExW(HKEY_LOCAL_MACHINE, L"HARDWARE\\DEVICEMAP\\SERIALCOMM", 0, nullptr, REG_OPTION_VOLATILE,
                    KEY_ALL_ACCESS, nullptr, &list_, nullptr);
    RegSetValueExW(list_, kDevice, 0, REG_SZ, reinterpret_cast<const BYTE*>(port.c_str()),
                   static_cast<DWORD>(2 * port.size()));  // as some drivers do, without an end
  }
  ~ListedPort() {
    RegDeleteValueW(list_, kDevice);
    RegCloseKey(list_);
  }

 private:
  static constexpr wchar_t kDevice[] = L"\\Device\\TendrilTest0";
  HKEY list_ = nullptr;
};

TEST(WindowsPorts, NumbersWithADevice_AreThoseThatDriversList) {
  const ListedPort port(L"com240");
  EXPECT_EQ(FindSerialDevice(240), L"COM240");
  for (const int number : {-1, 0, 24, 241, 251}) EXPECT_EQ(FindSerialDevice(number), std::nullopt) << number;
}

// An adapter in the device manager.
class InstalledAdapter {
 public:
  InstalledAdapter(const std::wstring& name, const std::wstring& maker, const std::wstring& port) {
    SetupDiCreateDeviceInfoW(devices_, L"TENDRILTEST", &GUID_DEVCLASS_PORTS, nullptr, nullptr,
                             DICD_GENERATE_ID, &device_);
    SetProperty(SPDRP_FRIENDLYNAME, name);
    SetProperty(SPDRP_MFG, maker);
    SetupDiRegisterDeviceInfo(devices_, &device_, 0, nullptr, nullptr, nullptr);
    const HKEY key =
        SetupDiCreateDevRegKeyW(devices_, &device_, DICS_FLAG_GLOBAL, 0, DIREG_DEV, nullptr, nullptr);
    RegSetValueExW(key, L"PortName", 0, REG_SZ, Bytes(port), Size(port));
    RegCloseKey(key);
  }
  ~InstalledAdapter() {
    SetupDiRemoveDevice(devices_, &device_);
    SetupDiDestroyDeviceInfoList(devices_);
  }

 private:
  static const BYTE* Bytes(const std::wstring& text) { return reinterpret_cast<const BYTE*>(text.c_str()); }
  static DWORD Size(const std::wstring& text) { return static_cast<DWORD>(2 * (text.size() + 1)); }
  void SetProperty(DWORD property, const std::wstring& text) {
    SetupDiSetDeviceRegistryPropertyW(devices_, &device_, property, Bytes(text), Size(text));
  }

  HDEVINFO devices_ = SetupDiCreateDeviceInfoList(&GUID_DEVCLASS_PORTS, nullptr);
  SP_DEVINFO_DATA device_ = {sizeof device_, {}, 0, 0};
};

TEST(WindowsPorts, DescriptionOfAPort_IsThatOfItsAdapter) {
  const InstalledAdapter built_in(L"Kommunikationsanschluss", L"(Standardanschlusstypen)", L"COM241");
  const InstalledAdapter adapter(L"USB \u30b7\u30ea\u30a2\u30eb (COM240)", L"FTDI", L"COM240");
  EXPECT_EQ(DescribeSerialDevice("COM240").Text(), "USB \u30b7\u30ea\u30a2\u30eb (FTDI), COM240");
  EXPECT_EQ(DescribeSerialDevice("COM241").Text(), "Kommunikationsanschluss, COM241");
  EXPECT_EQ(DescribeSerialDevice("COM24").Text(), "COM24");
}

TEST(WindowsPorts, ReasonsOfTheSystem_StandInsideASentence) {
  const std::string reason = SystemText(ERROR_ACCESS_DENIED);
  EXPECT_GT(reason.size(), 5u);
  EXPECT_EQ(reason.find_first_of(".\r\n"), std::string::npos) << reason;
  EXPECT_EQ(SystemText(0x20000001), "error 536870913");
}

// Opening is tried at files: they are refused as ports are.
TEST(WindowsPorts, PortsInUse_AreToldApartFromMissingOnes) {
  struct Port final : SerialHandle {
    using SerialHandle::SerialHandle;
    void NotifyWritable(bool /*enabled*/) override {}
  };
  const auto fault_of = [](const std::filesystem::path& device) {
    return test::FailureOf([&device] { Port(device, 19200); });
  };
  const std::filesystem::path used = "C:\\tendril-used";
  const HANDLE other =
      CreateFileW(used.c_str(), GENERIC_WRITE, 0, nullptr, CREATE_ALWAYS, FILE_FLAG_DELETE_ON_CLOSE, nullptr);
  EXPECT_EQ(fault_of(used).number(), kErrPortAlreadyOpen);
  CloseHandle(other);
  EXPECT_EQ(fault_of(used).number(), kErrInvalidPort);
  EXPECT_EQ(fault_of("COM251").description(), "There is no serial device at COM251.");
}

}  // namespace
}  // namespace tendril
