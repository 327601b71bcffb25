// The text of Windows' wide characters.
#pragma once

#include <windows.h>

#include <string>
#include <string_view>

#include "platform/unicode.h"

namespace tendril {

static_assert(sizeof(wchar_t) == sizeof(char16_t), "wide characters are UTF-16");

inline std::string NarrowText(std::wstring_view text) {
  return Utf8(std::u16string(text.begin(), text.end()));
}

inline std::wstring WideText(std::string_view utf8) {
  const std::u16string text = Utf16(utf8);
  return {text.begin(), text.end()};
}

// Whether Windows takes both for the same name of a file, a port or a program.
inline bool EqualNames(const std::wstring& a, const std::wstring& b) {
  return CompareStringOrdinal(a.c_str(), -1, b.c_str(), -1, TRUE) == CSTR_EQUAL;
}

}  // namespace tendril
