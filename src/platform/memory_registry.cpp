#include "platform/memory_registry.h"

#include <algorithm>
#include <string_view>
#include <utility>

#include "platform/ansi_text.h"
#include "platform/unicode.h"

namespace tendril {
namespace {

// Parts of the access masks.
constexpr std::uint32_t kMayQuery = 0x1;
constexpr std::uint32_t kMaySet = 0x2;

std::u16string TextOf(const std::string& ansi) {
  return AnsiText({reinterpret_cast<const std::uint8_t*>(ansi.data()), ansi.size()});
}

std::u16string RootName(RootKey root) {
  switch (root) {
    case RootKey::kClassesRoot:
      return u"HKEY_CLASSES_ROOT";
    case RootKey::kCurrentUser:
      return u"HKEY_CURRENT_USER";
    case RootKey::kLocalMachine:
      return u"HKEY_LOCAL_MACHINE";
    case RootKey::kUsers:
      return u"HKEY_USERS";
    case RootKey::kCurrentConfig:
      return u"HKEY_CURRENT_CONFIG";
  }
  return {};
}

std::u16string Joined(std::u16string path, const std::string& subkey) {
  if (!subkey.empty()) path.append(u"\\").append(TextOf(subkey));
  return path;
}

// Root keys are always there.
bool IsRoot(std::u16string_view path) { return path.find(u'\\') == path.npos; }

bool HoldsText(std::uint32_t type) { return type == kRegSz || type == kRegExpandSz || type == kRegMultiSz; }

// The data as it crosses: text in ANSI.
Bytes Crossing(const RegistryValue& value) {
  return HoldsText(value.type) ? AnsiBytes(Utf16Text(value.data)) : value.data;
}

Bytes Kept(std::uint32_t type, std::span<const std::uint8_t> data) {
  if (HoldsText(type)) return Utf16Bytes(AnsiText(data));
  return {data.begin(), data.end()};
}

}  // namespace

RegistryHandle MemoryRegistry::Opened(std::u16string path, std::uint32_t access) {
  open_keys_.emplace(++last_handle_, OpenedKey{std::move(path), access});
  return last_handle_;
}

RegistryKey* MemoryRegistry::Reach(RegistryHandle handle, std::uint32_t access, std::int32_t& code) {
  const auto found = open_keys_.find(handle);
  if (found == open_keys_.end()) {
    code = kRegInvalidHandle;
    return nullptr;
  }
  if ((found->second.access & access) != access) {
    code = kRegAccessDenied;
    return nullptr;
  }
  const std::u16string& path = found->second.path;
  RegistryKey* key = IsRoot(path) ? tree_.Create(path) : tree_.Find(path);
  code = key != nullptr ? kRegSuccess : kRegKeyDeleted;
  return key;
}

std::int32_t MemoryRegistry::OpenKey(RootKey root, const std::string& path, std::uint32_t access,
                                     RegistryHandle& key) {
  std::u16string whole = Joined(RootName(root), path);
  if (!IsRoot(whole) && tree_.Find(whole) == nullptr) return kRegNotFound;
  key = Opened(std::move(whole), access);
  return kRegSuccess;
}

std::int32_t MemoryRegistry::CreateKey(RootKey root, const std::string& path, RegistryHandle& key) {
  std::u16string whole = Joined(RootName(root), path);
  if (tree_.Create(whole) == nullptr) return kRegBadPath;
  key = Opened(std::move(whole), kKeyAllAccess);
  return kRegSuccess;
}

std::int32_t MemoryRegistry::QueryValue(RegistryHandle key, const std::string& name, std::uint32_t& type,
                                        std::uint8_t* data, std::uint32_t& size) {
  std::int32_t code = kRegSuccess;
  const RegistryKey* reached = Reach(key, kMayQuery, code);
  if (reached == nullptr) return code;
  const auto found = reached->values.find(TextOf(name));
  if (found == reached->values.end()) return kRegNotFound;
  const Bytes crossing = Crossing(found->second);
  const std::uint32_t room = std::exchange(size, static_cast<std::uint32_t>(crossing.size()));
  type = found->second.type;
  if (data == nullptr) return kRegSuccess;
  if (room < crossing.size()) return kRegMoreData;
  std::copy(crossing.begin(), crossing.end(), data);
  return kRegSuccess;
}

std::int32_t MemoryRegistry::SetValue(RegistryHandle key, const std::string& name, std::uint32_t type,
                                      std::span<const std::uint8_t> data) {
  std::int32_t code = kRegSuccess;
  RegistryKey* reached = Reach(key, kMaySet, code);
  if (reached == nullptr) return code;
  reached->values.insert_or_assign(TextOf(name), RegistryValue{type, Kept(type, data)});
  return kRegSuccess;
}

std::int32_t MemoryRegistry::DeleteKey(RegistryHandle key, const std::string& subkey) {
  const auto found = open_keys_.find(key);
  if (found == open_keys_.end()) return kRegInvalidHandle;
  const std::u16string path = Joined(found->second.path, subkey);
  const RegistryKey* doomed = tree_.Find(path);
  if (doomed == nullptr) return kRegNotFound;
  if (IsRoot(path) || !doomed->subkeys.empty()) return kRegAccessDenied;
  tree_.Remove(path);
  return kRegSuccess;
}

std::int32_t MemoryRegistry::CloseKey(RegistryHandle key) {
  return open_keys_.erase(key) != 0 ? kRegSuccess : kRegInvalidHandle;
}

}  // namespace tendril
