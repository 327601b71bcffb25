// The summary in the real window.
#include <QAccessible>
#include <QGroupBox>
#include <tuple>

#include "window_fixture.h"

namespace tendril::test {
namespace {

class Summary : public Window {
 protected:
  bool EntryVisible() { return Visible("fraNumberEntry"); }
};

TEST_F(Summary, Rows_ShowEveryChannel) {
  Click("ServoSimulator2_5");
  Press("optChannelType_1");
  Click("ServoSimulator2_6");
  Press("optChannelType_2");
  Click("ServoSimulator2_0");
  Press("optPowerUp_1");
  Press("optLostComm_2");
  Click("cmdTest_0");
  ShowSummary();
  EXPECT_EQ(Text("cmdTest_0"), "Test") << "the sweep has ended";
  EXPECT_FALSE(Visible("ServoSimulator1"));
  EXPECT_EQ(Text("lblSumChannel_0", "txtSumActualRange_0", "txtSumVirtualRange_0", "txtSumStopRange_0"),
            "CHAN 1 600-2400 1000-2000 1000-2000");
  EXPECT_EQ(Text("txtSumNeutralPosition_7", "txtSumDefaultPosition_7"), "1500 1500");
  for (const char* option :
       {"optSumPUNeutral_0", "optSumLCneutral_0", "optSumPUFirstCmd_1", "optSumLCfirstcmd_1"})
    EXPECT_TRUE(Checked(option)) << option;
  for (const auto& [word, label, text] : {std::tuple("Digital", "lblSumDIOPWM_5", "txtSumStopRange_5"),
                                          {"PWM", "lblSumDIOPWM_6", "optSumPUDefault_6"}}) {
    EXPECT_EQ(Text(label), word);
    EXPECT_TRUE(Visible(label) && !Visible(text)) << word;
  }
}

TEST_F(Summary, NumberEntry_ByMouse) {
  ShowSummary();
  Click("txtSumNeutralPosition_3");
  auto& spin = Spin("spnSumValue_0");
  EXPECT_FALSE(Visible("spnSumValue_1"));
  world_.time.Advance(60000);
  EXPECT_TRUE(EntryVisible()) << "until the first change";
  QTest::keyClick(&spin, Qt::Key_Up);
  EXPECT_EQ(spin.minimum(), -400);
  EXPECT_EQ(Text("lblDisplay", "lblSumValue_0", "lblSumValue_1"), "Channel 4 Neutral Trim 10 1510");
  EXPECT_EQ(Text("txtSumNeutralPosition_3", "txtSumVirtualRange_3", "txtSumStopRange_3"),
            "1510 1010-2010 1010-2000");
  world_.time.Advance(3000);
  QTest::keyClick(&spin, Qt::Key_Up);
  world_.time.Advance(3499);
  EXPECT_TRUE(EntryVisible());
  world_.time.Advance(1);
  EXPECT_FALSE(EntryVisible());

  // Moved to another value, it waits for a change again. A second click of a double click does not matter.
  QTest::mouseDClick(&Find("txtSumStopRange_7"), Qt::LeftButton);
  QTest::keyClick(&spin, Qt::Key_Up);
  Click("txtSumActualRange_0");
  world_.time.Advance(10000);
  EXPECT_TRUE(EntryVisible());
  // An option button closes it.
  Press("optSumLCcurrent_2");
  EXPECT_FALSE(EntryVisible());
  Press("optSumPUDefault_2");
  EXPECT_EQ(Record(2).LostCommOption, kLostCommHold);
  EXPECT_EQ(Record(2).PowerUPOpt, kPowerUpDefault);
  EXPECT_FALSE(Find("chkUpdate_0").isEnabled()) << "each change goes to its own channel";
}

TEST_F(Summary, TypedNumber_IsStoredWhenTheEntryCloses) {
  ShowSummary();
  Click("txtSumNeutralPosition_0");
  QTest::keyClick(&Spin("spnSumValue_0"), Qt::Key_Up);
  world_.time.Advance(3000);
  TypeOver("spnSumValue_0", "250");
  world_.time.Advance(500);
  EXPECT_EQ(Record(0).NeutralPosition, 1750);
  world_.time.Advance(3500);
  EXPECT_FALSE(EntryVisible());
}

TEST_F(Summary, NumberEntry_ByKeyboardAlone) {
  ShowSummary();
  Find("txtSumVirtualRange_1").setFocus();
  Key(Qt::Key_Tab);
  ASSERT_EQ(window_->focusWidget(), &Find("txtSumStopRange_1"));
  for (const Qt::Key key : {Qt::Key_Return, Qt::Key_Up, Qt::Key_Tab, Qt::Key_Down}) Key(key);
  EXPECT_EQ(Text("lblDisplay", "lblSumValue_0", "lblSumValue_1"), "Channel 2 Stops -490 +490");
  EXPECT_EQ(Text("txtSumStopRange_1"), "1010-1990");
  Key(Qt::Key_Escape);
  EXPECT_FALSE(EntryVisible());
  EXPECT_EQ(window_->focusWidget(), &Find("txtSumStopRange_1"));
}

TEST_F(Summary, BackToTheSimulator_LoadsTheChannelAgain) {
  Click("ServoSimulator2_1");
  const ChannelTable records = window_->WorkingConfiguration();
  ShowSummary();
  Press("cmdShowConfig");
  EXPECT_TRUE(Visible("ServoSimulator1"));
  EXPECT_TRUE(window_->WorkingConfiguration() == records) << "nothing is stored";
  EXPECT_EQ(window_->focusWidget(), &Find("ServoSimulator2_1"));

  ShowSummary();
  Click("txtSumActualRange_1");
  TypeOver("spnSumValue_0", "890");
  Press("cmdShowConfig");
  EXPECT_EQ(Text("lblActPulseLeft", "lblVirtPulseRange"), "610 500]");
  EXPECT_FALSE(EntryVisible());
  // Selecting another channel stores the change that the summary made.
  Click("ServoSimulator2_2");
  EXPECT_EQ(Record(1).ActualRange, (PulsePair{610, 2390}));
}

TEST_F(Summary, Get_FillsTheTableAndNamesWhatCannotBeSent) {
  auto& unit = ConnectUnit();
  unit.SetPortOptions(2, {1, 70, 230, 90, 190, 95, 180, 130, 140});
  unit.SetPortOptions(4, {1, 10, 249, 100, 200, 100, 200, 150, 150});
  ShowSummary();
  Click("txtSumStopRange_0");
  Click("Command3_4");
  unit.SetPortOptions(3, {4, 60, 240, 100, 200, 100, 200, 150, 150});  // an unknown output kind
  RunToTheEnd();
  EXPECT_EQ(Text("lblProgress"), "SUCCESS: Upload Complete");
  EXPECT_EQ(Text("txtSumActualRange_1", "txtSumNeutralPosition_1", "txtSumActualRange_3"),
            "700-2300 1400 305-2695");
  EXPECT_EQ(
      Text("lblRemarks_1"),
      "⚠ Channel 3: output kind -1 cannot be sent\n⚠ Channel 4: 305 to 2695 cannot be sent\nand 1 more");
  EXPECT_THAT(ToolTip("lblRemarks_1"), testing::HasSubstr("Channel 4: 100 to 2490 is shown as 305 to 2695"));
  EXPECT_FALSE(EntryVisible() || Visible("txtSumActualRange_2"));
  Press("cmdShowConfig");
  Click("ServoSimulator2_2");
  for (const char* kind : {"optChannelType_0", "optChannelType_1", "optChannelType_2"})
    EXPECT_FALSE(Checked(kind));

  // A send stops at a record that cannot be sent, and names it.
  Press("optChannelType_0");
  const QPoint servo = PlaceOf("ServoSimulator2_0");
  Click("Command3_0");
  ASSERT_TRUE(world_.time.AdvanceUntil([&] { return !world_.boxes.shown.empty(); }, 20000));
  EXPECT_EQ(world_.boxes.Take()[0].text, "Internal Error - Invalid ActualRange(1)=2695");
  EXPECT_EQ(Find<QGroupBox>("frmProgress").title().toStdString(),
            "Stopped: channel 4: 305 to 2695 cannot be sent");
  ChooseByKeys("cmbPresets", 2);
  EXPECT_EQ(Text("lblRemarks_0"), "");
  EXPECT_EQ(PlaceOf("ServoSimulator2_0"), servo) << "the window jumps";
}

TEST_F(Summary, HeldArrow_RepeatsAndEndsWhenABoxOpens) {
  ShowSummary();
  Click("txtSumNeutralPosition_3");
  auto& spin = Spin("spnSumValue_0");
  QTest::mousePress(&spin, Qt::LeftButton, {}, {spin.width() - 5, spin.height() - 5});
  EXPECT_TRUE(QTest::qWaitFor([&] { return spin.value() <= -30; }, 5000));
  spin.clearFocus();  // a box opens, and gets the release
  QTest::mouseRelease(window_.get(), Qt::LeftButton);
  QTest::keyClick(&spin, Qt::Key_Up);
  EXPECT_EQ(spin.minimum(), -400);
}

}  // namespace
}  // namespace tendril::test
