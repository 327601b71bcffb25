#include "platform/system_registry.h"

#include <windows.h>

namespace tendril {
namespace {

HKEY PredefinedKey(RootKey root) {
  switch (root) {
    case RootKey::kClassesRoot:
      return HKEY_CLASSES_ROOT;
    case RootKey::kCurrentUser:
      return HKEY_CURRENT_USER;
    case RootKey::kLocalMachine:
      return HKEY_LOCAL_MACHINE;
    case RootKey::kUsers:
      return HKEY_USERS;
    case RootKey::kCurrentConfig:
      return HKEY_CURRENT_CONFIG;
  }
  return nullptr;
}

HKEY KeyOf(RegistryHandle handle) { return reinterpret_cast<HKEY>(handle); }

std::int32_t Opened(LSTATUS code, HKEY opened, RegistryHandle& key) {
  if (code == ERROR_SUCCESS) key = reinterpret_cast<RegistryHandle>(opened);
  return code;
}

class SystemRegistry final : public RegistryStore {
 public:
  std::int32_t OpenKey(RootKey root, const std::string& path, std::uint32_t access,
                       RegistryHandle& key) override {
    HKEY opened = nullptr;
    const LSTATUS code = RegOpenKeyExA(PredefinedKey(root), path.c_str(), 0, access, &opened);
    return Opened(code, opened, key);
  }

  std::int32_t CreateKey(RootKey root, const std::string& path, RegistryHandle& key) override {
    HKEY opened = nullptr;
    const LSTATUS code = RegCreateKeyExA(PredefinedKey(root), path.c_str(), 0, nullptr,
                                         REG_OPTION_NON_VOLATILE, kKeyAllAccess, nullptr, &opened, nullptr);
    return Opened(code, opened, key);
  }

  std::int32_t QueryValue(RegistryHandle key, const std::string& name, std::uint32_t& type,
                          std::uint8_t* data, std::uint32_t& size) override {
    DWORD type_there = 0;
    DWORD size_there = size;
    const LSTATUS code = RegQueryValueExA(KeyOf(key), name.c_str(), nullptr, &type_there, data, &size_there);
    type = type_there;
    size = size_there;
    return code;
  }

  std::int32_t SetValue(RegistryHandle key, const std::string& name, std::uint32_t type,
                        std::span<const std::uint8_t> data) override {
    return RegSetValueExA(KeyOf(key), name.c_str(), 0, type, data.data(), static_cast<DWORD>(data.size()));
  }

  std::int32_t DeleteKey(RegistryHandle key, const std::string& subkey) override {
    return RegDeleteKeyA(KeyOf(key), subkey.c_str());
  }

  std::int32_t CloseKey(RegistryHandle key) override { return RegCloseKey(KeyOf(key)); }
};

}  // namespace

std::unique_ptr<RegistryStore> OpenSystemRegistry(const WarningSink& /*warn*/) {
  return std::make_unique<SystemRegistry>();
}

}  // namespace tendril
