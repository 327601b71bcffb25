// The comparison with a unit in the real window.
#include <functional>

#include "window_fixture.h"

namespace tendril::test {
namespace {

using testing::EndsWith;
using testing::HasSubstr;
using testing::MatchesRegex;
using testing::Not;

class Compared : public Window {
 protected:
  Compared() { Activate(); }

  void Run(const char* button) {
    Find<QLabel>("lblProgress").clear();
    Press(button);
    RunToTheEnd();
  }

  VirtualUnit& unit_ = ConnectUnit();
};

TEST_F(Compared, EveryPlaceSignsWhatDiffers) {
  unit_.SetPortOptions(3, {1, 60, 240, 100, 200, 100, 200, 150, 151});
  unit_.SetPortOptions(5, {1 | kFlagLostComm, 60, 240, 100, 200, 100, 200, 150, 150});
  unit_.SetPortOptions(6, {2, 60, 240, 100, 190, 100, 200, 150, 150});
  const ChannelTable before = window_->WorkingConfiguration();
  Click("ServoSimulator2_4");
  const QPoint test = PlaceOf("cmdTest_0");
  Run("cmdCompare_0");
  QTest::qWait(0);
  EXPECT_TRUE(window_->WorkingConfiguration() == before);
  EXPECT_EQ(PlaceOf("cmdTest_0"), test) << "the window jumps";
  EXPECT_EQ(Text("lblCompared"), "Unit 01 differs: 4 values of 3 channels");
  EXPECT_THAT(
      Accessible("lblStatus").text(QAccessible::Name).toStdString(),
      EndsWith("SUCCESS: Compare Complete. No record has changed. Unit 01 differs: 4 values of 3 channels"));
  const char* lost_comm = "\n≠ here Stop Pulse / Start on First Command, unit Hold at Current Position";
  EXPECT_THAT(Said("optLostComm_2"), EndsWith(lost_comm));
  EXPECT_THAT(Said("spnNeutralTrim"), Not(HasSubstr("≠")));
  EXPECT_EQ(Said("ServoSimulator2_5"), "Differs from unit 01: 2 values");
  const QImage signed_picture = Find("ServoSimulator2_2").grab().toImage();
  Click("ServoSimulator2_2");
  EXPECT_THAT(Said("spnNeutralTrim"), EndsWith("now 1500 µs.\n≠ here 1500, unit 1510"));
  EXPECT_EQ(Text("lblRemarks_0"), "≠ Neutral position: here 1500, unit 1510");

  ShowSummary();
  const QImage row = Find("frmSumTable_2").grab().toImage();
  EXPECT_THAT(Said("txtSumNeutralPosition_2"), EndsWith("\n≠ here 1500, unit 1510"));
  EXPECT_THAT(Said("optSumLCfirstcmd_4"), EndsWith(lost_comm));
  EXPECT_EQ(Said("lblSumChannel_5"), "≠ here Servo, unit Digital");
  EXPECT_THAT(Text("lblRemarks_1"), MatchesRegex("≠ Channel 3: Neutral position: here 1500, unit 1510\n"
                                                 "≠ Channel 5: Lost communications: .*\nand 2 more"));
  Click("txtSumNeutralPosition_2");
  QTest::keyClick(&Spin("spnSumValue_0"), Qt::Key_Up);  // takes the virtual range and the stops with it
  EXPECT_EQ(Text("lblCompared"), "Unit 01 differs: 6 values of 3 channels");
  EXPECT_THAT(Said("txtSumNeutralPosition_2"), Not(HasSubstr("≠")));
  Keys("Ctrl+Z");
  EXPECT_EQ(Text("lblCompared"), "Unit 01 differs: 4 values of 3 channels");
  EXPECT_EQ(Find("frmSumTable_2").grab().toImage(), row);

  window_->resize(880, 600);
  EXPECT_LE(Find("lblCompared").parentWidget()->width(), 352) << "the sentence beside it matters more";
  Press("cmdDismiss");
  EXPECT_EQ(Text("lblRemarks_1"), "");
  EXPECT_FALSE(Visible("cmdDismiss") || Visible("lblCompared"));
  EXPECT_NE(Find("frmSumTable_2").grab().toImage(), row);
  Press("cmdShowConfig");
  Click("ServoSimulator2_0");
  EXPECT_NE(Find("ServoSimulator2_2").grab().toImage(), signed_picture);
  for (const char* control : {"optSumLCfirstcmd_4", "lblSumChannel_5", "spnNeutralTrim", "ServoSimulator2_5"})
    EXPECT_THAT(ToolTip(control), Not(HasSubstr("≠"))) << control;
}

TEST_F(Compared, AfterASendItIsOfferedAndEqual) {
  Click("ServoSimulator2_2");
  TypeOver("spnActPulseRange", "905");
  Key(Qt::Key_Return);
  ASSERT_EQ(Record(2).ActualRange, (PulsePair{595, 2405}));
  Run("Command3_0");
  Run("cmdCompareSent");
  EXPECT_EQ(Text("lblCompared"), "Unit 01 holds exactly this");
  Run("Command3_0");
  EXPECT_FALSE(Visible("lblCompared")) << "it was sent to since";
  struct Case {
    const char* what;
    std::function<void()> act;
  };
  for (const auto& [what, act] :
       std::initializer_list<Case>{{"an edit", [&] { QTest::keyClick(&Spin("spnDefaultPos"), Qt::Key_Up); }},
                                   {"undo", [&] { Keys("Ctrl+Z"); }},
                                   {"another unit", [&] { ChooseByKeys("CmbUnitID_1", 2); }},
                                   {"a command", [&] { Run("Command3_1"); }}}) {
    ChooseByKeys("CmbUnitID_1", 1);
    Run("Command3_0");
    EXPECT_EQ(Text("cmdCompareSent"), "Sent to 01: compare?");
    EXPECT_TRUE(Visible("cmdCompareSent")) << what;
    act();
    EXPECT_FALSE(Visible("cmdCompareSent")) << what;
  }
}

TEST_F(Compared, StaysAboutItsUnitUntilThatIsReadAnew) {
  world_.bench.Attach<VirtualUnit>(1, std::uint8_t{0x02});
  Run("cmdCompare_0");
  Run("Command3_0");
  EXPECT_THAT(Text("lblStatus"), EndsWith("Ports 1 to 8 are written.")) << "what it held before is known";
  Run("cmdCompare_0");
  ChooseByKeys("CmbUnitID_1", 2);
  Run("Command3_1");
  EXPECT_EQ(Text("lblCompared"), "Unit 01, not the chosen one, holds exactly this");
  ChooseByKeys("CmbUnitID_1", 3);
  Run("cmdCompare_0");  // no device
  EXPECT_EQ(world_.boxes.Take().at(0).title, "Compare");
  EXPECT_EQ(Text("lblCompared"), "Unit 01, not the chosen one, holds exactly this");
  ChooseByKeys("CmbUnitID_1", 1);
  world_.bench.Detach(1, unit_);
  Run("cmdCompare_0");
  EXPECT_THAT(Text("lblCompared"),
              MatchesRegex("What unit 01 held at .* is exactly this; reading it again failed"));
  ConnectUnit();
  Run("Command3_1");
  EXPECT_FALSE(Visible("lblCompared"));
}

TEST_F(Compared, UnitAtFF_IsAnyUnitThatIsSentToOrRead) {
  const auto choose = [&](int id) {
    ChooseByKeys("CmbUnitID_0", id / 16);
    ChooseByKeys("CmbUnitID_1", id % 16);
  };
  const std::string fresh = "Unit FF, not the chosen one, holds exactly this";
  for (const char* button : {"Command3_0", "Command3_1"}) {
    choose(0xFF);
    Run("cmdCompare_0");
    choose(0x01);
    EXPECT_EQ(Text("lblCompared"), fresh);
    Run(button);
    EXPECT_FALSE(Visible("lblCompared")) << button;
  }
  choose(0xFF);
  Run("cmdCompare_0");
  choose(0x01);
  world_.bench.Unplug(1);
  world_.time.Advance(1000);
  Press("Command3_0");
  EXPECT_THAT(Text("lblStatus"), EndsWith("Nothing is written."));
  EXPECT_EQ(Text("lblCompared"), fresh);
  world_.bench.Replug(1);
  link_.cmdPollStation(0x02, '*');  // a send cannot poll now
  Press("Command3_0");
  EXPECT_THAT(Text("lblStatus"), HasSubstr("Stopped. Port 1 is perhaps written, 2 to 8 are not."));
  EXPECT_THAT(Text("lblCompared"), EndsWith("; sent to since"));
  world_.time.Advance(1000);
  choose(0xFF);
  Run("cmdCompare_0");
  Press("cmdCompare_0");
  Press("cmdCancel");
  RunToTheEnd();
  EXPECT_THAT(Text("lblCompared"), EndsWith("; reading it again was cancelled"));
}

}  // namespace
}  // namespace tendril::test
