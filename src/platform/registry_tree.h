// RegistryTree: keys and values in memory, as a registry has them.
#pragma once

#include <cstdint>
#include <map>
#include <memory>
#include <string>
#include <string_view>
#include <vector>

#include "platform/bytes.h"

namespace tendril {

// Orders names of keys and values without regard to case. Letters beyond ASCII count as they are written.
struct RegistryNameLess {
  using is_transparent = void;
  bool operator()(std::u16string_view a, std::u16string_view b) const;
};

// A value as the registry keeps it: text in UTF-16, low byte first, with its terminator if it has one.
struct RegistryValue {
  std::uint32_t type = 0;
  Bytes data;
};

struct RegistryKey {
  std::map<std::u16string, std::unique_ptr<RegistryKey>, RegistryNameLess> subkeys;
  std::map<std::u16string, RegistryValue, RegistryNameLess> values;
  std::vector<std::u16string> other_lines;  // of the key's text form: comments, and what cannot be read
};

// All paths are complete: they begin with the name of a root key, such as "HKEY_CURRENT_USER", and have their parts
// separated by "\".
class RegistryTree {
 public:
  // The limits of the registry itself.
  static constexpr std::size_t kMostParts = 512;
  static constexpr std::size_t kMostNameUnits = 255;

  // The key at `path`; null when there is none.
  RegistryKey* Find(std::u16string_view path);
  // The key at `path`, made with the keys above it where they are missing. Null, with nothing made, for a path that no
  // key can have: an empty part, one that is too long or has control characters, or too many of them. `made`, unless
  // null, becomes the number of keys that were missing.
  RegistryKey* Create(std::u16string_view path, std::size_t* made = nullptr);
  // Removes the key at `path` with all that is in it and below it.
  void Remove(std::u16string_view path);

  // The nameless key that has the root keys as subkeys.
  const RegistryKey& top() const { return top_; }

 private:
  RegistryKey top_;
};

}  // namespace tendril
