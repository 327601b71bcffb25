#include "ui/model/record_remarks.h"

#include <gmock/gmock.h>

namespace tendril {
namespace {

using testing::ElementsAre;
using testing::IsEmpty;

TEST(RecordRemarks, NameWhatCannotBeSentAndWhatShowingChanges) {
  ChannelTable working;
  ChannelEditor editor(working);
  RecordRemarks remarks(working, editor);
  editor.ApplyPreset(kPresets[kStartPreset]);
  remarks.AcceptRecords();
  working.At(2).ActualRange = {600, 2410};
  working.At(2).DefaultPosition = 2100;
  working.At(4).DefaultPosition = 5;
  remarks.AcceptRecords();
  EXPECT_THAT(remarks.Sentences(true), ElementsAre("Channel 5: default position 5 cannot be sent"));
  working.At(4).DefaultPosition = 1500;
  remarks.AcceptRecord(4);
  const auto changed = ElementsAre("Channel 3: 600 to 2410 is shown as 595 to 2405",
                                   "Channel 3: default position 2100 is shown as 2000");
  editor.SelectChannel(2);
  EXPECT_THAT(remarks.Sentences(true), changed) << "while it is edited";
  EXPECT_THAT(remarks.Sentences(false), IsEmpty()) << "the record is unchanged";
  editor.SelectChannel(0);
  EXPECT_THAT(remarks.Sentences(true), changed) << "stored";

  // An edit is accepted as shown, in the edited and in the ticked channels.
  editor.SelectChannel(1);
  editor.ClickApplyBox(2, true);
  editor.Change(Parameter::kNeutralTrim, 100);
  EXPECT_FALSE(remarks.Sentences(true).empty());
  remarks.AcceptEdit();
  EXPECT_THAT(remarks.Sentences(true), IsEmpty());
  editor.SelectChannel(2);
  working.At(0).NeutralPosition = 5;
  EXPECT_THAT(remarks.Sentences(true),
              ElementsAre("Channel 1: neutral position 5 cannot be sent",
                          "Channel 3: virtual range 1000 to 2000 is shown as 1100 to 2100",
                          "Channel 3: stop range 1000 to 2000 is shown as 1100 to 2000",
                          "Channel 1: neutral position 1500 is shown as 5"));
}

}  // namespace
}  // namespace tendril
