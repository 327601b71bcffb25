// Input: nine option bytes.
#include "config/option_bytes.h"

#include "fuzz/fuzz_input.h"

namespace {

// The flags without those that mean nothing: an action without its bit 2 or 3, or two actions at once.
int Meaning(int flags) {
  const int power_up = flags & 0xC8;
  const int lost_comm = flags & 0x34;
  return (flags & 0x03) | (power_up == 0x88 || power_up == 0x48 ? power_up : 0) |
         (lost_comm == 0x04 || lost_comm == 0x24 || lost_comm == 0x14 ? lost_comm : 0);
}

}  // namespace

extern "C" int LLVMFuzzerTestOneInput(const std::uint8_t* data, std::size_t size) {
  using namespace tendril;
  using namespace tendril::fuzz;
  OptionBytes bytes{};
  std::copy_n(data, std::min(size, bytes.size()), bytes.begin());
  const ChannelConfig record = DecodeOptions(bytes);
  const auto encoded = EncodeOptions(record);
  const bool valid = bytes[0] % 4 != 0 && std::find(bytes.begin() + 1, bytes.end(), 0) == bytes.end();
  Check(std::holds_alternative<OptionBytes>(encoded) == valid,
        "what has a kind and no width of 0 can be sent");
  if (!valid) return 0;
  bytes[0] = static_cast<std::uint8_t>(Meaning(bytes[0]));
  Check(std::get<OptionBytes>(encoded) == bytes, "bytes come back as they were");
  Check(DecodeOptions(bytes) == record, "flags without a meaning change nothing");
  return 0;
}
