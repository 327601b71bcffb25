// The text of Windows' wide characters.
#pragma once

#include <string>
#include <string_view>

#include "platform/unicode.h"

namespace tendril {

static_assert(sizeof(wchar_t) == sizeof(char16_t), "wide characters are UTF-16");

inline std::string NarrowText(std::wstring_view text) {
  return Utf8(std::u16string(text.begin(), text.end()));
}

}  // namespace tendril
