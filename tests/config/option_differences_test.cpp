#include "config/option_differences.h"

#include <gtest/gtest.h>

namespace tendril {
namespace {

TEST(OptionDifferences, EachBitIsInOnePartAndShowsInItsWords) {
  ChannelConfig record;
  SetFromPreset(kPresets[0], record);
  const OptionBytes wanted = std::get<OptionBytes>(EncodeOptions(record));
  EXPECT_TRUE(DifferencesBetween(wanted, wanted).empty());
  for (std::size_t bit = 0; bit < kOptionByteCount * 8; ++bit) {
    OptionBytes held = wanted;
    held[bit / 8] = static_cast<std::uint8_t>(held[bit / 8] ^ (1 << bit % 8));
    const auto differences = DifferencesBetween(wanted, held);
    ASSERT_EQ(differences.size(), 1U) << "bit " << bit;
    EXPECT_NE(differences[0].wanted, differences[0].held) << NameOf(differences[0].part);
    EXPECT_EQ(CountDiffering(record, held, differences[0].part), 1) << "bit " << bit;
  }
}

}  // namespace
}  // namespace tendril
