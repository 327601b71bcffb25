// What the fuzz targets have in common: the fuzzer's bytes, taken piece by piece, and what ends a run.
#pragma once

#include <algorithm>
#include <cstddef>
#include <cstdint>
#include <cstdio>
#include <cstdlib>
#include <span>
#include <utility>

#include "platform/bytes.h"

namespace tendril::fuzz {

// Ends the run unless `holds`; the fuzzer then keeps the input. `what` is what should be the case.
inline void Check(bool holds, const char* what) {
  if (holds) return;
  std::fprintf(stderr, "== NOT SO: %s\n", what);
  std::abort();
}

// The input. Beyond its end all is zero, or empty.
class Input {
 public:
  Input(const std::uint8_t* data, std::size_t size) : rest_(data, size) {}

  bool empty() const { return rest_.empty(); }
  Bytes Take(std::size_t count) {
    const auto taken = rest_.first(std::min(count, rest_.size()));
    rest_ = rest_.subspan(taken.size());
    return {taken.begin(), taken.end()};
  }
  std::uint8_t Byte() { return empty() ? std::uint8_t{0} : Take(1).front(); }
  bool Flag() { return Byte() % 2 != 0; }

 private:
  std::span<const std::uint8_t> rest_;
};

// The shape of a target: `Run` takes the input step by step, then ends.
template <typename Run>
int RunSteps(Input input) {
  Run run;
  while (!input.empty()) run.Step(input);
  run.End();
  return 0;
}

}  // namespace tendril::fuzz
