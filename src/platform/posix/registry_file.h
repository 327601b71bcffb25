// RegistryFile: a registry kept in a text file, in the form that the registry editor exports.
#pragma once

#include <sys/types.h>

#include <cstdint>
#include <filesystem>
#include <functional>
#include <optional>
#include <string>

#include "platform/memory_registry.h"
#include "platform/registry_store.h"
#include "platform/registry_text.h"

namespace tendril {

// The file is read when a key is opened while none is open, unless it is still what was read last; changes are
// written when the last open key is closed. So keep a key open around many operations: they then see one state of
// the file, and it is read and written once.
//
// A file that is missing has no keys; so has one that cannot be read or is larger than kMostBytes. A change to such a
// one fails, a missing one is made. Changes of several programs do not get lost: from the first change to the writing,
// the lock file `<path>.lock` is held, and what another one wrote before that is read. The file is replaced whole or
// not at all, and stays in its encoding; keys, values and lines that this program does not know stay in it.
class RegistryFile final : public RegistryStore {
 public:
  static constexpr std::uintmax_t kMostBytes = 64U << 20;

  // A file that cannot be read is told to `warn` once, as are the lines of it that cannot, up to a number.
  RegistryFile(std::filesystem::path path, WarningSink warn);
  ~RegistryFile() override;
  RegistryFile(const RegistryFile&) = delete;
  RegistryFile& operator=(const RegistryFile&) = delete;

  std::int32_t OpenKey(RootKey root, const std::string& path, std::uint32_t access,
                       RegistryHandle& key) override;
  std::int32_t CreateKey(RootKey root, const std::string& path, RegistryHandle& key) override;
  std::int32_t QueryValue(RegistryHandle key, const std::string& name, std::uint32_t& type,
                          std::uint8_t* data, std::uint32_t& size) override;
  std::int32_t SetValue(RegistryHandle key, const std::string& name, std::uint32_t type,
                        std::span<const std::uint8_t> data) override;
  std::int32_t DeleteKey(RegistryHandle key, const std::string& subkey) override;
  std::int32_t CloseKey(RegistryHandle key) override;

 private:
  // What tells one state of the file from another.
  struct Stamp {
    bool exists = false;
    dev_t device = 0;
    ino_t inode = 0;
    off_t size = 0;
    std::int64_t modified_ns = 0;
    std::int64_t changed_ns = 0;
    bool operator==(const Stamp&) const = default;
  };

  Stamp CurrentStamp() const;
  void Refresh();
  void Load();
  void Parse(const Bytes& bytes);
  // Holds the lock, with the file's newest state read, from the first change to the last close.
  std::int32_t BeginChange();
  // Makes a change in memory.
  std::int32_t Change(const std::function<std::int32_t()>& call);
  // Keeps what was changed once no key is open.
  std::int32_t Settle();
  std::int32_t Lock();
  void Unlock();
  void Warn(const std::string& text) const;

  std::filesystem::path path_;
  WarningSink warn_;
  MemoryRegistry memory_;
  RegistryForm form_;
  std::optional<Stamp> stamp_;  // of the state in memory; none when the file must be read in any case
  bool writable_ = false;       // whether all that the file says is known, so that it may be replaced
  bool changed_ = false;        // whether memory has what the file has not
  int lock_ = -1;               // descriptor of the lock file while it is held
};

}  // namespace tendril
