#include "platform/registry_tree.h"

#include <algorithm>
#include <utility>

#include "platform/ascii.h"

namespace tendril {
namespace {

// Cuts the first part off `path`.
std::u16string_view NextPart(std::u16string_view& path) {
  const std::u16string_view part = path.substr(0, path.find(u'\\'));
  path.remove_prefix(std::min(part.size() + 1, path.size()));
  return part;
}

bool CanBeKey(std::u16string_view path) {
  if (path.empty() || path.back() == u'\\') return false;
  std::size_t parts = 0;
  while (!path.empty()) {
    const std::u16string_view part = NextPart(path);
    if (part.empty() || part.size() > RegistryTree::kMostNameUnits) return false;
    // The registry would take them, a line of text would not.
    if (std::any_of(part.begin(), part.end(), [](char16_t unit) { return unit < u' '; })) return false;
    if (++parts > RegistryTree::kMostParts) return false;
  }
  return true;
}

}  // namespace

bool RegistryNameLess::operator()(std::u16string_view a, std::u16string_view b) const {
  return std::lexicographical_compare(a.begin(), a.end(), b.begin(), b.end(),
                                      [](char16_t x, char16_t y) { return AsciiUpper(x) < AsciiUpper(y); });
}

RegistryKey* RegistryTree::Find(std::u16string_view path) {
  RegistryKey* key = &top_;
  while (!path.empty()) {
    const auto found = key->subkeys.find(NextPart(path));
    if (found == key->subkeys.end()) return nullptr;
    key = found->second.get();
  }
  return key;
}

RegistryKey* RegistryTree::Create(std::u16string_view path, std::size_t* made) {
  if (!CanBeKey(path)) return nullptr;
  std::size_t missing = 0;
  RegistryKey* key = &top_;
  while (!path.empty()) {
    const std::u16string_view part = NextPart(path);
    auto found = key->subkeys.find(part);
    if (found == key->subkeys.end()) {
      found = key->subkeys.emplace(part, std::make_unique<RegistryKey>()).first;
      ++missing;
    }
    key = found->second.get();
  }
  if (made != nullptr) *made = missing;
  return key;
}

void RegistryTree::Remove(std::u16string_view path) {
  const std::size_t end_of_parent = path.rfind(u'\\');
  if (end_of_parent == path.npos) {
    top_.subkeys.erase(std::u16string(path));
    return;
  }
  RegistryKey* parent = Find(path.substr(0, end_of_parent));
  if (parent != nullptr) parent->subkeys.erase(std::u16string(path.substr(end_of_parent + 1)));
}

}  // namespace tendril
