// Text in the system's ANSI code: one byte per character, more in some code pages.
#pragma once

#include <cstdint>
#include <span>
#include <string>
#include <string_view>

#include "platform/bytes.h"

namespace tendril {

// The text's characters as bytes of the system's ANSI code page; Windows-1252 where the system has none. A
// character that the code lacks becomes "?".
Bytes AnsiBytes(std::u16string_view text);

// The way back: the characters that the bytes stand for.
std::u16string AnsiText(std::span<const std::uint8_t> bytes);

}  // namespace tendril
