#include "platform/memory_registry.h"

#include <algorithm>

#include "platform/ansi_text.h"
#include "platform/ascii.h"

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

bool IsRoot(std::u16string_view path) { return path.find(u'\\') == path.npos; }

bool HoldsText(std::uint32_t type) { return type == kRegSz || type == kRegExpandSz || type == kRegMultiSz; }

// The data as the caller gets it: text in ANSI.
Bytes Crossing(const RegistryValue& value) {
  if (!HoldsText(value.type)) return value.data;
  std::u16string text(value.data.size() / 2, u'\0');
  for (std::size_t i = 0; i < text.size(); ++i) {
    text[i] = static_cast<char16_t>(value.data[2 * i] | value.data[2 * i + 1] << 8);
  }
  return AnsiBytes(text);
}

// The data as it is kept.
Bytes Kept(std::uint32_t type, std::span<const std::uint8_t> data) {
  if (!HoldsText(type)) return {data.begin(), data.end()};
  Bytes bytes;
  for (const char16_t unit : AnsiText(data)) {
    bytes.push_back(static_cast<std::uint8_t>(unit & 0xFF));
    bytes.push_back(static_cast<std::uint8_t>(unit >> 8));
  }
  return bytes;
}

}  // namespace

bool RegistryNameLess::operator()(std::u16string_view a, std::u16string_view b) const {
  // Most names are spelled alike: what is equal as it stands needs no folding.
  const auto [x, y] = std::mismatch(a.begin(), a.end(), b.begin(), b.end());
  return std::lexicographical_compare(x, a.end(), y, b.end(), [](char16_t left, char16_t right) {
    return AsciiUpper(left) < AsciiUpper(right);
  });
}

bool IsRegistryPath(std::u16string_view path) {
  return !path.empty() && path.front() != u'\\' && path.back() != u'\\' && path.find(u"\\\\") == path.npos &&
         std::none_of(path.begin(), path.end(), [](char16_t unit) { return unit < u' '; });
}

bool MemoryRegistry::HasSubkeys(const std::u16string& path) const {
  const std::u16string above = path + u"\\";
  const auto next = keys_.lower_bound(above);
  return next != keys_.end() && !RegistryNameLess()(above, next->first.substr(0, above.size()));
}

RegistryValues* MemoryRegistry::Find(const std::u16string& path) {
  const auto found = keys_.find(path);
  if (found != keys_.end()) return &found->second;
  return IsRoot(path) || HasSubkeys(path) ? &keys_[path] : nullptr;
}

void MemoryRegistry::SetKeys(RegistryKeys keys) {
  keys_ = std::move(keys);
  for (auto& [handle, key] : open_keys_) key.values = Find(key.path);
}

std::int32_t MemoryRegistry::Reach(RegistryHandle handle, std::uint32_t access, RegistryValues*& values) {
  const auto opened = open_keys_.find(handle);
  if (opened == open_keys_.end()) return kRegInvalidHandle;
  if ((opened->second.access & access) != access) return kRegAccessDenied;
  values = opened->second.values;
  return values != nullptr ? kRegSuccess : kRegKeyDeleted;
}

std::int32_t MemoryRegistry::OpenKey(RootKey root, const std::string& path, std::uint32_t access,
                                     RegistryHandle& key) {
  const std::u16string whole = Joined(RootName(root), path);
  RegistryValues* values = Find(whole);
  if (values == nullptr) return kRegNotFound;
  key = ++last_handle_;
  open_keys_.emplace(key, OpenedKey{whole, access, values});
  return kRegSuccess;
}

std::int32_t MemoryRegistry::CreateKey(RootKey root, const std::string& path, RegistryHandle& key) {
  const std::u16string whole = Joined(RootName(root), path);
  if (!IsRegistryPath(whole)) return kRegBadPath;
  keys_.try_emplace(whole);
  return OpenKey(root, path, kKeyAllAccess, key);
}

std::int32_t MemoryRegistry::QueryValue(RegistryHandle key, const std::string& name, std::uint32_t& type,
                                        std::uint8_t* data, std::uint32_t& size) {
  RegistryValues* values = nullptr;
  const std::int32_t code = Reach(key, kMayQuery, values);
  if (code != kRegSuccess) return code;
  const auto found = values->find(TextOf(name));
  if (found == values->end()) return kRegNotFound;
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
  RegistryValues* values = nullptr;
  const std::int32_t code = Reach(key, kMaySet, values);
  if (code == kRegSuccess) values->insert_or_assign(TextOf(name), RegistryValue{type, Kept(type, data)});
  return code;
}

std::int32_t MemoryRegistry::DeleteKey(RegistryHandle key, const std::string& subkey) {
  const auto opened = open_keys_.find(key);
  if (opened == open_keys_.end()) return kRegInvalidHandle;
  const std::u16string path = Joined(opened->second.path, subkey);
  const RegistryValues* doomed = Find(path);
  if (doomed == nullptr) return kRegNotFound;
  if (IsRoot(path) || HasSubkeys(path)) return kRegAccessDenied;
  for (auto& [handle, open] : open_keys_) {
    if (open.values == doomed) open.values = nullptr;
  }
  keys_.erase(path);
  keys_.try_emplace(path.substr(0, path.rfind(u'\\')));  // which may have been there for this key alone
  return kRegSuccess;
}

std::int32_t MemoryRegistry::CloseKey(RegistryHandle key) {
  return open_keys_.erase(key) != 0 ? kRegSuccess : kRegInvalidHandle;
}

}  // namespace tendril
