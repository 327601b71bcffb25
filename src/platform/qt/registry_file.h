// RegistryFile: a registry kept in a text file, in the form that the registry editor exports.
#pragma once

#include <QByteArray>
#include <QLockFile>
#include <QString>
#include <cstdint>
#include <functional>
#include <string>

#include "platform/memory_registry.h"
#include "platform/registry_store.h"

namespace tendril {

// The file is read when a key is opened while none is open; changes are written when the last open key is closed. So
// keep a key open around many operations: they then see one state of the file, and it is read and written once.
//
// A file that is missing has no keys; so has one that cannot be read or is larger than kMaxBytes. A change to such a
// one fails, a missing one is created. Changes of several programs do not get lost: from the first change to the
// writing, the lock file `<path>.lock` is held, and what another one wrote before that is read. The file is replaced
// whole or not at all; comments and lines that cannot be read do not stay in it.
class RegistryFile final : public RegistryStore {
 public:
  static constexpr qint64 kMaxBytes = 64 << 20;

  // `warn` gets a file that cannot be read once, as the lines of it that cannot, up to a number.
  RegistryFile(const QString& path, WarningSink warn);
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
  // Reads the file, unless it is what was read last.
  void Refresh();
  void Parse();
  // Makes a change in memory, with the lock held and the newest state of the file read.
  std::int32_t Change(const std::function<std::int32_t()>& call);
  // Writes what was changed and gives the lock back.
  std::int32_t Settle();
  void Warn(const QString& text) const;

  QString path_;
  WarningSink warn_;
  QLockFile lock_;
  MemoryRegistry memory_;
  bool loaded_ = false;    // whether memory has what `bytes_` or `fault_` says, and changes to it
  QByteArray bytes_;       // the file as it was read or written last
  QString fault_;          // why it could not be read; empty when it could
  bool writable_ = false;  // whether all values of the file are known, so that it may be replaced
  bool changed_ = false;   // whether memory has what the file has not
};

}  // namespace tendril
