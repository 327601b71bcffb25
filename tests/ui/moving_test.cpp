// What moves, how it is stopped, and which pictures are marked.
#include <functional>

#include "window_fixture.h"

namespace tendril::test {
namespace {

class Moving : public Window {
 protected:
  bool Sweeps() { return Text("cmdTest_0") == "Stop"; }
  // Whether `act` ends a sweep and leaves the servo at the centre.
  bool Ends(const VirtualUnit& unit, const std::function<void()>& act) {
    Press("cmdTest_0");
    world_.time.Advance(470);
    act();
    world_.time.Advance(500);
    return !Sweeps() && unit.LivePosition(3) == 150;
  }
};

TEST_F(Moving, Sweep_EndsFromEveryControlByEscapeAndByItsButton) {
  const auto& unit = ConnectUnit();
  Click("ServoSimulator2_2");
  Find<QAction>("actLine").trigger();
  for (QWidget* control : window_->findChildren<QWidget*>()) {
    if (!control->isVisible() || !control->isEnabled() || control->focusPolicy() == Qt::NoFocus) continue;
    EXPECT_TRUE(Ends(unit, [&] {
      control->setFocus();
      Key(Qt::Key_Escape);
    })) << control->objectName().toStdString();
  }
  const QPoint servo = PlaceOf("ServoSimulator1");
  EXPECT_TRUE(Ends(unit, [&] {
    EXPECT_EQ(Text("lblMoving", "cmdStop"), "Moving channel 3 of unit 01 Stop (goes to 1500 µs)");
    EXPECT_EQ(PlaceOf("ServoSimulator1"), servo);
    Find("cmdStop").setFocus();
    Key(Qt::Key_Space);
  }));
  EXPECT_EQ(window_->focusWidget(), window_.get()) << "not on a control that the user did not choose";
  EXPECT_TRUE(!Visible("cmdStop") && Text("lblMoving") == "Nothing moves");
}

TEST_F(Moving, Line_FollowsTheChannelTheSliderAndThePort) {
  Click("ServoSimulator2_2");
  Press("cmdTest_0");
  EXPECT_EQ(Text("lblMoving"), "Drawing only: no port chosen");
  ConnectUnit();
  Press("cmdTest_0");
  Click("ServoSimulator2_6");
  EXPECT_EQ(Text("lblMoving"), "Moving channel 7 of unit 01");
  Press("chkSendSlideCommands");
  EXPECT_EQ(Text("lblMoving", "cmdStop"), "The slider moves channel 7 of unit 01 Clear the slider's box");
  ChooseByKeys("CmbUnitID_1", 10);
  EXPECT_EQ(Text("lblMoving", "lblUnit"), "The slider moves channel 7 of unit 0A Unit 0A: not asked yet");
  link_.SetPortOpen(false);
  EXPECT_EQ(Text("lblMoving"), "The slider's next move opens Comm 1");
  Key(Qt::Key_Escape);
  EXPECT_TRUE(Checked("chkSendSlideCommands")) << "Escape ends what goes on by itself";
  Click("cmdStop");
  EXPECT_FALSE(Checked("chkSendSlideCommands"));
}

TEST_F(Moving, Escape_EndsOneThingForEachPress) {
  ConnectUnit();
  Click("ServoSimulator2_2");
  auto& presets = Find<QComboBox>("cmbPresets");
  Press("cmdTest_0");
  presets.showPopup();
  QTest::keyClick(presets.view(), Qt::Key_Escape);
  EXPECT_TRUE(!presets.view()->isVisible() && Sweeps());
  TypeOver("spnNeutralTrim", "5");
  Key(Qt::Key_Escape);
  EXPECT_TRUE(Spin("spnNeutralTrim").value() == 0 && Sweeps());
  Press("cmdShowSummary");
  Press("cmdTest_0");  // before the summary is shown
  world_.time.Advance(20);
  Click("txtSumStopRange_0");
  Find("cmdShowConfig").setFocus();
  Key(Qt::Key_Escape);
  EXPECT_TRUE(!Visible("fraNumberEntry") && Sweeps());
  Key(Qt::Key_Escape);
  EXPECT_FALSE(Sweeps());
  Press("Command3_1");
  world_.time.Advance(5);
  Key(Qt::Key_Escape);
  RunToTheEnd();
  EXPECT_EQ(Text("lblProgress"), "COMMAND FAILED!");
  EXPECT_TRUE(world_.boxes.Take().empty());
}

TEST_F(Moving, Pictures_AreMarkedWhenTheirRecordsHaveChanged) {
  Click("ServoSimulator2_2");
  const auto dots = [this] {
    std::string changed;
    for (const char* picture : {"ServoSimulator2_1", "ServoSimulator2_2", "cmdDigitalOutput_2"}) {
      changed += Said(picture).find("Changed since") != std::string::npos ? '1' : '0';
    }
    return changed;
  };
  const auto before = Find("ServoSimulator2_2").grab().toImage();
  Press("optLostComm_0");  // which no servo shows otherwise
  EXPECT_EQ(dots(), "011");
  for (int press = 0; press < 2; ++press) Press("cmdTest_0");  // disables and enables controls
  EXPECT_THAT(ToolTip("ServoSimulator2_2"), testing::HasSubstr("Changed since"));
  EXPECT_NE(Find("ServoSimulator2_2").grab().toImage(), before);
  Press("optLostComm_3");
  EXPECT_EQ(dots(), "000");
  EXPECT_EQ(Find("ServoSimulator2_2").grab().toImage(), before);
}

}  // namespace
}  // namespace tendril::test
