// Tables of preferences. What is read, written, compared and copied all goes by the one table that a class has, so that
// a value cannot be left out of one of them, or land in another's place.
#pragma once

#include <array>
#include <cstdint>
#include <limits>
#include <string>
#include <type_traits>
#include <variant>

#include "prefs/registry.h"

namespace tendril {

// A value's name in the registry and the member that holds it. The member's type is the value's: a number, a number
// kept as a byte, a Boolean or a string; what a fresh `Owner` holds is its default.
template <typename Owner>
struct Preference {
  const char* name;
  std::variant<std::int32_t Owner::*, std::uint8_t Owner::*, bool Owner::*, std::string Owner::*> member;
};

// One value. A number that does not fit into a byte counts as missing.
inline std::int32_t ReadPreference(const RegistryBranch& key, const char* name, std::int32_t fallback) {
  return key.GetNumber(name, fallback);
}
inline std::uint8_t ReadPreference(const RegistryBranch& key, const char* name, std::uint8_t fallback) {
  const std::int32_t number = key.GetNumber(name, fallback);
  const bool fits = number >= 0 && number <= std::numeric_limits<std::uint8_t>::max();
  return fits ? static_cast<std::uint8_t>(number) : fallback;
}
inline bool ReadPreference(const RegistryBranch& key, const char* name, bool fallback) {
  return key.GetBoolean(name, fallback);
}
inline std::string ReadPreference(const RegistryBranch& key, const char* name, const std::string& fallback) {
  return key.GetString(name, fallback);
}

inline void WritePreference(const RegistryBranch& key, const char* name, std::int32_t value) {
  key.SetNumber(name, value);
}
inline void WritePreference(const RegistryBranch& key, const char* name, bool value) {
  key.SetBoolean(name, value);
}
inline void WritePreference(const RegistryBranch& key, const char* name, const std::string& value) {
  key.SetString(name, value);
}

template <typename Owner, std::size_t kRows>
using PreferenceTable = std::array<Preference<Owner>, kRows>;

// Reads all values of the table; a missing one becomes what `defaults` holds.
template <typename Owner, std::size_t kRows>
void ReadPreferences(const PreferenceTable<Owner, kRows>& table, const RegistryBranch& key,
                     const Owner& defaults, Owner& owner) {
  for (const auto& row : table) {
    std::visit([&](auto member) { owner.*member = ReadPreference(key, row.name, defaults.*member); },
               row.member);
  }
}

// Makes the key where it is missing, and writes all values of the table.
template <typename Owner, std::size_t kRows>
void WritePreferences(const PreferenceTable<Owner, kRows>& table, const RegistryBranch& key,
                      const Owner& owner) {
  key.CreateKey();
  for (const auto& row : table) {
    std::visit([&](auto member) { WritePreference(key, row.name, owner.*member); }, row.member);
  }
}

template <typename Owner, std::size_t kRows>
void CopyPreferences(const PreferenceTable<Owner, kRows>& table, const Owner& from, Owner& to) {
  for (const auto& row : table) {
    std::visit([&](auto member) { to.*member = from.*member; }, row.member);
  }
}

template <typename Owner, std::size_t kRows>
bool PreferencesDiffer(const PreferenceTable<Owner, kRows>& table, const Owner& a, const Owner& b) {
  for (const auto& row : table) {
    if (std::visit([&](auto member) { return a.*member != b.*member; }, row.member)) return true;
  }
  return false;
}

}  // namespace tendril
