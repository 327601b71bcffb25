// Bytes: what goes over a line.
#pragma once

#include <cstdint>
#include <vector>

namespace tendril {

using Bytes = std::vector<std::uint8_t>;

}  // namespace tendril
