// Registry: typed reading and writing of registry values.
#pragma once

#include <cstdint>
#include <functional>
#include <string>
#include <string_view>

#include "platform/registry_store.h"
#include "prefs/saved_err.h"

namespace tendril {

// Every operation opens the key it needs, does its work, and closes the key in every case. A failure is a
// RuntimeError with the platform's return code and the description given here; kErrInternal where a number cannot be
// got. Opening a key that is missing fails with "RegOpenKeyEx failure".
//
// Texts and names are UTF-8 here and cross to the platform in the system's ANSI code; a character that the code lacks
// becomes "?".
//
// The get operations do not fail: they return the caller's default instead. A missing key or value is normal; anything
// else gives a warning that names both, up to kMaxWarnings of them.
class Registry {
 public:
  static constexpr std::uint32_t kMaxTextBytes = 1U << 20;  // with the terminator
  static constexpr int kMaxWarnings = 50;

  // `store` must outlive it. `warn` may be empty.
  Registry(RegistryStore& store, WarningSink warn);

  // "RegOpenKeyEx failure". The key stays open until CloseKey().
  RegistryHandle OpenKey(RootKey root, const std::string& path, std::uint32_t access);
  // Fails only if the store cannot keep what was changed: "RegCloseKey failure".
  void CloseKey(RegistryHandle key);

  // Creates the key, and those above it, unless they exist. "RegCreateKeyEx failure".
  void CreateKey(RootKey root, const std::string& path);
  // Deletes the key `subkey` below `path`; it must have no subkeys. "RegDeleteKey failure".
  void DeleteKey(RootKey root, const std::string& path, const std::string& subkey);

  // A value that is no 32-bit number (of 4 bytes) gives the default: "Error getting registry value".
  std::int32_t GetNumber(RootKey root, const std::string& path, const std::string& name,
                         std::int32_t fallback);
  // A number other than 0 is true.
  bool GetBoolean(RootKey root, const std::string& path, const std::string& name, bool fallback);
  // The text without its final terminator, which it may lack. A value that is no text, or of more than kMaxTextBytes,
  // gives the default. "RegQueryValueEx failure (length)", "RegQueryValueEx failure".
  std::string GetString(RootKey root, const std::string& path, const std::string& name,
                        const std::string& fallback);

  // These write a value of a key that exists. "RegSetValueEx failure".
  void SetNumber(RootKey root, const std::string& path, const std::string& name, std::int32_t value);
  void SetBoolean(RootKey root, const std::string& path, const std::string& name, bool value);  // 1 or 0
  void SetString(RootKey root, const std::string& path, const std::string& name, const std::string& value);

  // Runs `operations` with a key held open, so that a store that is a file reads it once before them and writes it
  // once after them. They also run where no key can be held open. Passes on their failures.
  void InOneGo(const std::function<void()>& operations);

 private:
  template <typename Call>
  void WithKey(RegistryHandle key, const char* failure_text, const Call& call);
  template <typename Query>
  void Get(RootKey root, const std::string& path, const std::string& name, const Query& query);
  void Warn(const std::string& where, const SavedErr& failure);
  void Set(RootKey root, const std::string& path, const std::string& name, std::uint32_t type,
           std::string_view data);

  RegistryStore& store_;
  WarningSink warn_;
  int warnings_ = 0;
};

// A key of the current user's hive. The maker's programs keep their values below the company key, and those that they
// share below its key "Shared". Each operation is the Registry's on this key; so are its failures.
class RegistryBranch {
 public:
  // `registry` must outlive the branch.
  static RegistryBranch Company(Registry& registry);  // Software\Kelvane
  static RegistryBranch Shared(Registry& registry);   // Software\Kelvane\Shared

  // The key at the path `subkey` below this one; this one for "".
  RegistryBranch Below(std::string_view subkey) const;

  RegistryHandle OpenKey(std::uint32_t access) const;
  void CreateKey() const;
  void DeleteKey(const std::string& subkey) const;
  std::int32_t GetNumber(const std::string& name, std::int32_t fallback) const;
  bool GetBoolean(const std::string& name, bool fallback) const;
  std::string GetString(const std::string& name, const std::string& fallback) const;
  void SetNumber(const std::string& name, std::int32_t value) const;
  void SetBoolean(const std::string& name, bool value) const;
  void SetString(const std::string& name, const std::string& value) const;

 private:
  RegistryBranch(Registry& registry, std::string path);

  Registry* registry_;
  std::string path_;
};

}  // namespace tendril
