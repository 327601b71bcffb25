// Unicode text from one form to the other.
#pragma once

#include <cstdint>
#include <span>
#include <string>
#include <string_view>

#include "platform/bytes.h"

namespace tendril {

// The text of UTF-8 bytes. A byte that is no UTF-8 becomes a low surrogate, U+DC00 plus the byte, that stands alone, so
// that nothing is lost on the way there and back.
std::u16string Utf16(std::string_view utf8);

// The text as UTF-8. A lone surrogate that stands for a byte becomes that byte, any other one "?".
std::string Utf8(std::u16string_view text);

// The text as bytes in UTF-16, low byte first, without a mark; and the text of such bytes, but for an odd one at their end.
Bytes Utf16Bytes(std::u16string_view text);
std::u16string Utf16Text(std::span<const std::uint8_t> bytes);

}  // namespace tendril
