// Registries for tests: one that can be made to fail, and on Windows the system's own with nothing in it.
#pragma once

#include <gtest/gtest.h>

#include <cstdint>
#include <memory>
#include <string>
#include <vector>

#include "platform/memory_registry.h"
#include "platform/system_registry.h"
#include "prefs/registry.h"

#ifdef _WIN32
#include <windows.h>
#endif

namespace tendril::test {

#ifdef _WIN32

// While it lives, the current user's hive is an empty key, which goes with it.
class EmptyHive {
 public:
  EmptyHive() {
    RegCreateKeyExA(HKEY_CURRENT_USER, path_.c_str(), 0, nullptr, REG_OPTION_NON_VOLATILE, KEY_ALL_ACCESS,
                    nullptr, &key_, nullptr);
    RegOverridePredefKey(HKEY_CURRENT_USER, key_);
  }
  ~EmptyHive() {
    RegOverridePredefKey(HKEY_CURRENT_USER, nullptr);
    RegCloseKey(key_);
    RegDeleteTreeA(HKEY_CURRENT_USER, path_.c_str());
  }
  EmptyHive(const EmptyHive&) = delete;
  EmptyHive& operator=(const EmptyHive&) = delete;

 private:
  // Tests that run at the same time have a key each.
  const std::string path_ = "Software\\Tendril test " + std::to_string(GetCurrentProcessId());
  HKEY key_ = nullptr;
};

#endif

// Passes every call on, counts calls and open keys, and fails where it is told to.
class UnreliableStore final : public RegistryStore {
 public:
  std::int32_t OpenKey(RootKey root, const std::string& path, std::uint32_t access,
                       RegistryHandle& key) override {
    return Opened(Fails() ? code : store_.OpenKey(root, path, access, key));
  }
  std::int32_t CreateKey(RootKey root, const std::string& path, RegistryHandle& key) override {
    return Opened(Fails() ? code : store_.CreateKey(root, path, key));
  }
  std::int32_t QueryValue(RegistryHandle key, const std::string& name, std::uint32_t& type,
                          std::uint8_t* data, std::uint32_t& size) override {
    return Fails() ? code : store_.QueryValue(key, name, type, data, size);
  }
  std::int32_t SetValue(RegistryHandle key, const std::string& name, std::uint32_t type,
                        std::span<const std::uint8_t> data) override {
    return Fails() ? code : store_.SetValue(key, name, type, data);
  }
  std::int32_t DeleteKey(RegistryHandle key, const std::string& subkey) override {
    return Fails() ? code : store_.DeleteKey(key, subkey);
  }
  std::int32_t CloseKey(RegistryHandle key) override {
    --open_keys;
    const std::int32_t closed = store_.CloseKey(key);
    return Fails() ? code : closed;
  }

  int failing_call = 0;  // the number of the call that fails, counted from 1; -1 for all of them
  int calls = 0;
  int open_keys = 0;

 private:
  static constexpr std::int32_t code = kRegIoFailed;

  bool Fails() { return ++calls == failing_call || failing_call < 0; }
  std::int32_t Opened(std::int32_t result) {
    if (result == kRegSuccess) ++open_keys;
    return result;
  }

  MemoryRegistry store_;
};

// What every registry must do alike. The parameter says whether it is the system's.
class EveryRegistry : public testing::TestWithParam<bool> {
 protected:
#ifdef _WIN32
  std::unique_ptr<EmptyHive> hive = GetParam() ? std::make_unique<EmptyHive>() : nullptr;
  std::unique_ptr<RegistryStore> store =
      GetParam() ? OpenSystemRegistry({}) : std::make_unique<MemoryRegistry>();
#else
  std::unique_ptr<RegistryStore> store = std::make_unique<MemoryRegistry>();
#endif
  std::vector<std::string> warnings;
  Registry registry{*store, [this](const std::string& warning) { warnings.push_back(warning); }};
};

#ifdef _WIN32
inline const auto kEveryStore = testing::Bool();
#else
inline const auto kEveryStore = testing::Values(false);
#endif

}  // namespace tendril::test
