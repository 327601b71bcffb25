// MemoryRegistry: a registry of this process alone.
#pragma once

#include <cstdint>
#include <map>
#include <string>
#include <utility>

#include "platform/registry_store.h"
#include "platform/registry_tree.h"

namespace tendril {

// Behaves as the platform's registry does, access masks and the ANSI crossing of texts included. All that can be
// refused is refused with the platform's code.
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

  const RegistryTree& tree() const { return tree_; }
  // Open keys stay open: they are then those of the same path, or deleted ones.
  void SetTree(RegistryTree tree) { tree_ = std::move(tree); }
  bool HasOpenKeys() const { return !open_keys_.empty(); }

 private:
  // Not a pointer to the key: that may be deleted meanwhile.
  struct OpenedKey {
    std::u16string path;
    std::uint32_t access = 0;
  };

  // The key that `handle` has open for `access`; null with the reason in `code` otherwise.
  RegistryKey* Reach(RegistryHandle handle, std::uint32_t access, std::int32_t& code);
  RegistryHandle Opened(std::u16string path, std::uint32_t access);

  RegistryTree tree_;
  std::map<RegistryHandle, OpenedKey> open_keys_;
  RegistryHandle last_handle_ = 0;
};

}  // namespace tendril
