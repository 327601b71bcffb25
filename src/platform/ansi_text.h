// Text in the system's ANSI code: one byte per character.
#pragma once

#include <string_view>

#include "platform/bytes.h"

namespace tendril {

// The text's characters as bytes of the system's ANSI code page; Windows-1252 where the system has none. A
// character that the code lacks becomes "?".
Bytes AnsiBytes(std::u16string_view text);

}  // namespace tendril
