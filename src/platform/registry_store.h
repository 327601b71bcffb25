// RegistryStore: the registry's calls as the platform has them. The layer above decides which values count and what a
// failure is called.
#pragma once

#include <cstdint>
#include <functional>
#include <span>
#include <string>

namespace tendril {

// Gets what a part of the program skipped: one line, UTF-8. It must not throw.
using WarningSink = std::function<void(const std::string& warning)>;

enum class RootKey { kClassesRoot, kCurrentUser, kLocalMachine, kUsers, kCurrentConfig };

// An open key, until it is closed.
using RegistryHandle = std::uintptr_t;

// Access masks.
inline constexpr std::uint32_t kKeyRead = 0x20019;
inline constexpr std::uint32_t kKeyWrite = 0x20006;
inline constexpr std::uint32_t kKeyAllAccess = 0xF003F;

// Types of values.
inline constexpr std::uint32_t kRegSz = 1;
inline constexpr std::uint32_t kRegExpandSz = 2;
inline constexpr std::uint32_t kRegBinary = 3;
inline constexpr std::uint32_t kRegDword = 4;
inline constexpr std::uint32_t kRegMultiSz = 7;

// The platform's return codes that the program distinguishes or a store returns by itself.
inline constexpr std::int32_t kRegSuccess = 0;
inline constexpr std::int32_t kRegNotFound = 2;
inline constexpr std::int32_t kRegAccessDenied = 5;
inline constexpr std::int32_t kRegInvalidHandle = 6;
inline constexpr std::int32_t kRegLockViolation = 33;
inline constexpr std::int32_t kRegBadPath = 161;
inline constexpr std::int32_t kRegMoreData = 234;
inline constexpr std::int32_t kRegIoFailed = 1016;
inline constexpr std::int32_t kRegKeyDeleted = 1018;

// Names, paths and the data of text values cross as bytes in the system's ANSI code; the names are not
// case-sensitive. Every call returns the platform's code, kRegSuccess (0) when it did what it was asked for.
// A failed call gives no handle.
class RegistryStore {
 public:
  virtual ~RegistryStore() = default;

  // `path` is a key below `root`, its parts separated by "\"; "" is the root itself.
  virtual std::int32_t OpenKey(RootKey root, const std::string& path, std::uint32_t access,
                               RegistryHandle& key) = 0;
  // Opens the key for all access, and creates it and the keys above it where they are missing.
  virtual std::int32_t CreateKey(RootKey root, const std::string& path, RegistryHandle& key) = 0;
  // Gives the value's type and size in bytes (a text's with its terminator), and copies its data to `data`
  // unless that is null. `size` is on entry what `data` can hold; too little gives kRegMoreData.
  virtual std::int32_t QueryValue(RegistryHandle key, const std::string& name, std::uint32_t& type,
                                  std::uint8_t* data, std::uint32_t& size) = 0;
  // A text's data has its terminator.
  virtual std::int32_t SetValue(RegistryHandle key, const std::string& name, std::uint32_t type,
                                std::span<const std::uint8_t> data) = 0;
  // Deletes the key `subkey` below `key` with its values. One that has subkeys stays: kRegAccessDenied.
  virtual std::int32_t DeleteKey(RegistryHandle key, const std::string& subkey) = 0;
  // Fails also if the store writes changes only now and cannot.
  virtual std::int32_t CloseKey(RegistryHandle key) = 0;
};

}  // namespace tendril
