// Unicode text from one form to the other.
#pragma once

#include <string>
#include <string_view>

namespace tendril {

// The text of UTF-8 bytes. A byte that is no UTF-8 becomes a low surrogate, U+DC00 plus the byte, that stands alone, so
// that nothing is lost on the way there and back.
std::u16string Utf16(std::string_view utf8);

// The text as UTF-8. A lone surrogate that stands for a byte becomes that byte, any other one "?".
std::string Utf8(std::u16string_view text);

}  // namespace tendril
