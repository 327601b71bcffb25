#include "ui/model/unstored.h"

#include <gtest/gtest.h>

namespace tendril {
namespace {

TEST(Unstored, NamesWhatAnEditChangedBeyondItsOwnFields) {
  ChannelTable working;
  ChannelEditor editor(working);
  const auto sentence = [&] { return Unstored(editor, working).Sentence(); };
  editor.Change(Parameter::kNeutralTrim, 100);
  EXPECT_EQ(sentence(), "") << "without a channel nothing is stored";
  for (std::size_t channel = 0; channel < kPortCount; ++channel)
    SetFromPreset(kPresets[1], working.At(channel));
  editor.SelectChannel(2);
  EXPECT_EQ(sentence(), "");
  editor.Change(Parameter::kNeutralTrim, 100);
  EXPECT_EQ(sentence(),
            "Shown, not stored yet: virtual range, stops, default. SEND would write what is stored.");
  editor.Change(Parameter::kLeftStop, -450);
  EXPECT_EQ(sentence(),
            "Shown, not stored yet: virtual range, right stop, default. SEND would write what is stored.");
  editor.ClickApplyBox(4, true);
  EXPECT_EQ(sentence(), "");
  EXPECT_EQ(StoreCaption(editor), "Store to 3, 5");
  editor.ClickAllBox(true);
  EXPECT_EQ(StoreCaption(editor), "Store to all eight");
  editor.Change(Parameter::kActualRange, 300);
  EXPECT_EQ(
      sentence(),
      "Shown, not stored yet: virtual range, neutral, stops, default. SEND would write what is stored.");
}

}  // namespace
}  // namespace tendril
