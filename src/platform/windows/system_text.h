// The texts that Windows has for its errors.
#pragma once

#include <cstdint>
#include <string>

namespace tendril {

// The reason of `error` in the user's language (UTF-8), to stand inside a sentence: on one line, without a stop at its
// end. An error without a text is given by its number.
std::string SystemText(std::uint32_t error);

}  // namespace tendril
