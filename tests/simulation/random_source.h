// RandomSource: chance that a seed repeats exactly.
#pragma once

#include <cstddef>
#include <cstdint>
#include <random>

namespace tendril::test {

// The standard's distributions differ from library to library; its engine does not.
class RandomSource {
 public:
  explicit RandomSource(std::uint64_t seed) : engine_(seed) {}

  // 0 to `limit` - 1; `limit` is at least 1.
  std::size_t Below(std::size_t limit) { return static_cast<std::size_t>(engine_() % limit); }
  // `low` to `high`, both included.
  int Between(int low, int high) {
    return low + static_cast<int>(Below(static_cast<std::size_t>(high - low) + 1));
  }
  // True `percent` times in a hundred.
  bool Chance(int percent) { return Between(1, 100) <= percent; }
  // True once in `n` times; never for 0.
  bool OneIn(std::uint32_t n) { return n != 0 && Below(n) == 0; }
  std::uint8_t Byte() { return static_cast<std::uint8_t>(Below(256)); }
  // One of the elements of something that is not empty.
  template <typename Range>
  decltype(auto) Pick(Range&& range) {
    return range[Below(range.size())];
  }

 private:
  std::mt19937_64 engine_;
};

}  // namespace tendril::test
