// Bytes: data that is sent or received.
#pragma once

#include <cstdint>
#include <vector>

namespace tendril {

using Bytes = std::vector<std::uint8_t>;

}  // namespace tendril
