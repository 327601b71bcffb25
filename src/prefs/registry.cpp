#include "prefs/registry.h"

#include <algorithm>
#include <array>
#include <optional>
#include <utility>
#include <vector>

#include "platform/ansi_text.h"
#include "platform/bytes.h"
#include "platform/runtime_error.h"
#include "platform/unicode.h"
#include "prefs/saved_err.h"

namespace tendril {
namespace {

constexpr char kSource[] = "Registry";
constexpr char kOpenFailure[] = "RegOpenKeyEx failure";
constexpr char kCreateFailure[] = "RegCreateKeyEx failure";
constexpr char kCloseFailure[] = "RegCloseKey failure";
constexpr char kNumberFailure[] = "Error getting registry value";
constexpr char kLengthFailure[] = "RegQueryValueEx failure (length)";
constexpr char kQueryFailure[] = "RegQueryValueEx failure";
constexpr char kSetFailure[] = "RegSetValueEx failure";
constexpr char kDeleteFailure[] = "RegDeleteKey failure";

// The platform's codes for a value that cannot be used.
constexpr std::int32_t kUnsupportedType = 1630;
constexpr std::int32_t kTooLong = kRegMoreData;

void Check(std::int32_t code, const char* failure_text) {
  if (code != kRegSuccess) throw RuntimeError(code, failure_text, kSource);
}

bool IsAscii(std::string_view text) {
  return std::all_of(text.begin(), text.end(), [](char c) { return static_cast<unsigned char>(c) < 0x80; });
}

std::string Ansi(const std::string& utf8) {
  if (IsAscii(utf8)) return utf8;
  const Bytes bytes = AnsiBytes(Utf16(utf8));
  return {bytes.begin(), bytes.end()};
}

std::string TextOf(const Bytes& ansi) {
  std::string text(ansi.begin(), ansi.end());
  return IsAscii(text) ? text : Utf8(AnsiText(ansi));
}

}  // namespace

Registry::Registry(RegistryStore& store, WarningSink warn) : store_(store), warn_(std::move(warn)) {}

// Does `call` and closes `key`, and only then passes on a failure.
template <typename Call>
void Registry::WithKey(RegistryHandle key, const char* failure_text, const Call& call) {
  std::optional<SavedErr> failure;
  try {
    call();
  } catch (...) {
    failure.emplace();
  }
  const std::int32_t closing_code = store_.CloseKey(key);
  if (failure) failure->Raise();
  Check(closing_code, failure_text);  // what was changed could not be kept
}

void Registry::Warn(const std::string& where, const SavedErr& failure) {
  if (!warn_ || ++warnings_ > kMaxWarnings) return;
  warn_(where + ": " + failure.description() + " (error " + std::to_string(failure.number()) + ").");
}

template <typename Query>
void Registry::Get(RootKey root, const std::string& path, const std::string& name, const Query& query) {
  try {
    RegistryHandle key = 0;
    const std::int32_t code = store_.OpenKey(root, Ansi(path), kKeyRead, key);
    if (code == kRegNotFound) return;
    Check(code, kOpenFailure);
    WithKey(key, kCloseFailure, [&] { query(key); });
  } catch (...) {
    Warn("Registry key \"" + path + "\", value \"" + name + "\"", SavedErr());
  }
}

void Registry::Set(RootKey root, const std::string& path, const std::string& name, std::uint32_t type,
                   std::string_view data) {
  const RegistryHandle key = OpenKey(root, path, kKeyWrite);
  WithKey(key, kSetFailure, [&] {
    const auto* bytes = reinterpret_cast<const std::uint8_t*>(data.data());
    Check(store_.SetValue(key, Ansi(name), type, {bytes, data.size()}), kSetFailure);
  });
}

RegistryHandle Registry::OpenKey(RootKey root, const std::string& path, std::uint32_t access) {
  RegistryHandle key = 0;
  Check(store_.OpenKey(root, Ansi(path), access, key), kOpenFailure);
  return key;
}

void Registry::CloseKey(RegistryHandle key) { Check(store_.CloseKey(key), kCloseFailure); }

void Registry::CreateKey(RootKey root, const std::string& path) {
  RegistryHandle key = 0;
  Check(store_.CreateKey(root, Ansi(path), key), kCreateFailure);
  Check(store_.CloseKey(key), kCreateFailure);
}

void Registry::DeleteKey(RootKey root, const std::string& path, const std::string& subkey) {
  const RegistryHandle key = OpenKey(root, path, kKeyAllAccess);
  WithKey(key, kDeleteFailure, [&] { Check(store_.DeleteKey(key, Ansi(subkey)), kDeleteFailure); });
}

std::int32_t Registry::GetNumber(RootKey root, const std::string& path, const std::string& name,
                                 std::int32_t fallback) {
  std::int32_t number = fallback;
  Get(root, path, name, [&](RegistryHandle key) {
    std::array<std::uint8_t, 4> data{};
    std::uint32_t type = 0;
    std::uint32_t size = data.size();
    const std::int32_t code = store_.QueryValue(key, Ansi(name), type, data.data(), size);
    if (code == kRegNotFound) return;
    if (code != kRegSuccess || type != kRegDword || size != data.size()) {
      throw RuntimeError(kErrInternal, kNumberFailure, kSource);
    }
    // Low byte first.
    number = static_cast<std::int32_t>(data[0] | data[1] << 8U | data[2] << 16U |
                                       static_cast<std::uint32_t>(data[3]) << 24U);
  });
  return number;
}

bool Registry::GetBoolean(RootKey root, const std::string& path, const std::string& name, bool fallback) {
  return GetNumber(root, path, name, fallback ? 1 : 0) != 0;
}

std::string Registry::GetString(RootKey root, const std::string& path, const std::string& name,
                                const std::string& fallback) {
  std::string text = fallback;
  Get(root, path, name, [&](RegistryHandle key) {
    const std::string ansi_name = Ansi(name);
    std::uint32_t type = 0;
    std::uint32_t size = 0;
    const std::int32_t code = store_.QueryValue(key, ansi_name, type, nullptr, size);
    if (code == kRegNotFound) return;
    Check(code, kLengthFailure);
    Check(type == kRegSz ? kRegSuccess : kUnsupportedType, kLengthFailure);
    Check(size <= kMaxTextBytes ? kRegSuccess : kTooLong, kLengthFailure);
    Bytes data(size);
    Check(store_.QueryValue(key, ansi_name, type, data.data(), size), kQueryFailure);
    data.resize(size);
    if (!data.empty() && data.back() == '\0') data.pop_back();
    text = TextOf(data);
  });
  return text;
}

void Registry::SetNumber(RootKey root, const std::string& path, const std::string& name, std::int32_t value) {
  const auto bits = static_cast<std::uint32_t>(value);
  std::string data;
  for (const unsigned shift : {0U, 8U, 16U, 24U}) data += static_cast<char>(bits >> shift & 0xFFU);
  Set(root, path, name, kRegDword, data);
}

void Registry::SetBoolean(RootKey root, const std::string& path, const std::string& name, bool value) {
  SetNumber(root, path, name, value ? 1 : 0);
}

void Registry::SetString(RootKey root, const std::string& path, const std::string& name,
                         const std::string& value) {
  const std::string ansi = Ansi(value);
  Set(root, path, name, kRegSz, {ansi.c_str(), ansi.size() + 1});
}

void Registry::InOneGo(const std::function<void()>& operations) {
  RegistryHandle root = 0;
  if (store_.OpenKey(RootKey::kCurrentUser, "", kKeyRead, root) != kRegSuccess) return operations();
  WithKey(root, kCloseFailure, operations);
}

RegistryBranch::RegistryBranch(Registry& registry, std::string path)
    : registry_(&registry), path_(std::move(path)) {}

RegistryBranch RegistryBranch::Company(Registry& registry) { return {registry, "Software\\Kelvane"}; }

RegistryBranch RegistryBranch::Shared(Registry& registry) { return Company(registry).Below("Shared"); }

RegistryBranch RegistryBranch::Below(std::string_view subkey) const {
  std::string path = path_;
  if (!subkey.empty()) path.append("\\").append(subkey);
  return {*registry_, std::move(path)};
}

RegistryHandle RegistryBranch::OpenKey(std::uint32_t access) const {
  return registry_->OpenKey(RootKey::kCurrentUser, path_, access);
}

void RegistryBranch::CreateKey() const { registry_->CreateKey(RootKey::kCurrentUser, path_); }

void RegistryBranch::DeleteKey(const std::string& subkey) const {
  registry_->DeleteKey(RootKey::kCurrentUser, path_, subkey);
}

std::int32_t RegistryBranch::GetNumber(const std::string& name, std::int32_t fallback) const {
  return registry_->GetNumber(RootKey::kCurrentUser, path_, name, fallback);
}

bool RegistryBranch::GetBoolean(const std::string& name, bool fallback) const {
  return registry_->GetBoolean(RootKey::kCurrentUser, path_, name, fallback);
}

std::string RegistryBranch::GetString(const std::string& name, const std::string& fallback) const {
  return registry_->GetString(RootKey::kCurrentUser, path_, name, fallback);
}

void RegistryBranch::SetNumber(const std::string& name, std::int32_t value) const {
  registry_->SetNumber(RootKey::kCurrentUser, path_, name, value);
}

void RegistryBranch::SetBoolean(const std::string& name, bool value) const {
  registry_->SetBoolean(RootKey::kCurrentUser, path_, name, value);
}

void RegistryBranch::SetString(const std::string& name, const std::string& value) const {
  registry_->SetString(RootKey::kCurrentUser, path_, name, value);
}

}  // namespace tendril
