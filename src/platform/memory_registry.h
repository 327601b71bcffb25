// MemoryRegistry: a registry of this process alone.
#pragma once

#include <cstdint>
#include <map>
#include <string>
#include <string_view>
#include <utility>

#include "platform/bytes.h"
#include "platform/registry_store.h"

namespace tendril {

// Orders names of keys and values without regard to the case of ASCII letters.
struct RegistryNameLess {
  bool operator()(std::u16string_view a, std::u16string_view b) const;
};

// A value as the registry keeps it: text in UTF-16, low byte first, with its terminator if it has one.
struct RegistryValue {
  std::uint32_t type = 0;
  Bytes data;
  bool operator==(const RegistryValue&) const = default;
};

using RegistryValues = std::map<std::u16string, RegistryValue, RegistryNameLess>;

// Keys by their complete path, such as "HKEY_CURRENT_USER\Software". The keys above a key exist, listed or not.
using RegistryKeys = std::map<std::u16string, RegistryValues, RegistryNameLess>;

// Whether a key can have this path: one that has no empty part and no control characters.
bool IsRegistryPath(std::u16string_view path);

// Behaves as the platform's registry does, access masks and the ANSI crossing of texts included. What it refuses, it
// refuses with the platform's code.
class MemoryRegistry final : public RegistryStore {
 public:
  std::int32_t OpenKey(RootKey root, const std::string& path, std::uint32_t access,
                       RegistryHandle& key) override;
  std::int32_t CreateKey(RootKey root, const std::string& path, RegistryHandle& key) override;
  std::int32_t QueryValue(RegistryHandle key, const std::string& name, std::uint32_t& type,
                          std::uint8_t* data, std::uint32_t& size) override;
  std::int32_t SetValue(RegistryHandle key, const std::string& name, std::uint32_t type,
                        std::span<const std::uint8_t> data) override;
  std::int32_t DeleteKey(RegistryHandle key, const std::string& subkey) override;
  std::int32_t CloseKey(RegistryHandle key) override;

  const RegistryKeys& keys() const { return keys_; }
  // Open keys stay open: each is then the new key of its path, or a deleted one.
  void SetKeys(RegistryKeys keys);
  bool HasOpenKeys() const { return !open_keys_.empty(); }

 private:
  struct OpenedKey {
    std::u16string path;
    std::uint32_t access = 0;
    RegistryValues* values = nullptr;  // null once the key is deleted
  };

  bool HasSubkeys(const std::u16string& path) const;
  // The values of the key at `path`; null when there is none.
  RegistryValues* Find(const std::u16string& path);
  // Gives the values of the key that `handle` has open for `access`.
  std::int32_t Reach(RegistryHandle handle, std::uint32_t access, RegistryValues*& values);

  RegistryKeys keys_;
  std::map<RegistryHandle, OpenedKey> open_keys_;
  RegistryHandle last_handle_ = 0;
};

}  // namespace tendril
