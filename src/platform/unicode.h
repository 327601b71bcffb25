// Unicode text from one form to the other.
#pragma once

#include <string>
#include <string_view>

namespace tendril {

// A byte that is no UTF-8 becomes U+FFFD.
std::u16string Utf16(std::string_view utf8);

// `text` has no half of a character alone: what follows one would be lost.
std::string Utf8(std::u16string_view text);

}  // namespace tendril
