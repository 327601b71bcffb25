// The editor in the real window: what clicks and keys do to records, captions and servos.
#include <QAbstractSlider>
#include <tuple>

#include "window_fixture.h"

namespace tendril::test {
namespace {

class Editor : public Window {
 protected:
  void Type(const char* spin, const char* text) {
    TypeOver(spin, text);
    Key(Qt::Key_Return);
  }
};

TEST_F(Editor, Edit_UpdatesCaptionsRecordAndServos) {
  Click("ServoSimulator2_2");
  QTest::keyClick(&Spin("spnNeutralTrim"), Qt::Key_Up);
  EXPECT_EQ(Text("lblNeutralTrim"), "+10");
  EXPECT_EQ(Record(2).NeutralPosition, 1510);
  EXPECT_EQ(Record(2).DefaultPosition, 1500) << "stored when another channel is selected";
  Type("spnRightVirtStop", "0");
  Type("spnDefaultPos", "-20");
  Type("spnActPulseRange", "300");
  EXPECT_EQ(Text("lblActPulseLeft", "lblActPulseRight", "lblVirtPulseRange", "lblNeutralTrim"),
            "1200 1800 300] 0");
  EXPECT_EQ(Text("lblLeftVirtStop", "lblRightVirtStop", "lblDefaultPos"), "-300 +0 -20");
  for (const char* servo : {"ServoSimulator2_2", "ServoSimulator1"})
    EXPECT_EQ(Arcs(servo), "-29 31 -49 51 0 51 ") << servo;

  Click("ServoSimulator2_0");
  EXPECT_EQ(Arcs("ServoSimulator2_2"), "-30 30 -30 30 0 30 ");
  EXPECT_EQ(Text("lblActPulseLeft"), "600");
}

TEST_F(Editor, TypedValue_IsStoredWhenTypingEnds) {
  const auto& unit = ConnectUnit();
  Click("ServoSimulator2_0");
  TypeOver("spnDefaultPos", "255");
  EXPECT_EQ(Record(0).DefaultPosition, 1500);
  Key(Qt::Key_Tab);
  EXPECT_EQ(Record(0).DefaultPosition, 1755);
  // A shortcut does not move the focus: the typed value is sent nevertheless.
  TypeOver("spnActPulseRange", "880");
  Run("Command3_0");
  EXPECT_EQ(unit.PortOptions(1), (PortOptionBytes{1, 62, 238, 100, 200, 100, 200, 175, 150}));

  // Closing stores it too, and opens no port for the slider.
  Press("chkSendSlideCommands");
  TypeOver("spnRightVirtStop", "123");
  EXPECT_TRUE(window_->close());
  world_.time.Advance(5000);
  EXPECT_FALSE(link_.PortOpen());
  EXPECT_EQ(Record(0).VirtualStops[1], 1623);
}

TEST_F(Editor, WindowDestroyedDuringTyping_EndsQuietly) {
  Click("ServoSimulator2_0");
  Press("chkSendSlideCommands");
  TypeOver("spnRightVirtStop", "123");
  window_.reset();
  EXPECT_EQ(world_.time.RunningTimers(), 0);
}

TEST_F(Editor, ApplyBoxes_ApplyEditsToOtherChannels) {
  Click("ServoSimulator2_0");
  Press("chkUpdate_3");
  Type("spnDefaultPos", "100");
  EXPECT_EQ(Record(3).DefaultPosition, 1600);
  EXPECT_EQ(Record(4).DefaultPosition, 1500);
  Press("chkUpdate_0");
  EXPECT_TRUE(Checked("chkUpdate_0")) << "the edited channel's own box";
  Press("chkUpdate_8");
  EXPECT_TRUE(Checked("chkUpdate_7") && Checked("chkUpdate_8"));
  EXPECT_EQ(Dial("ServoSimulator2_7").default_angle(), ServoDial::Convert(-10));
  Press("optPowerUp_1");
  EXPECT_EQ(Record(7).PowerUPOpt, kPowerUpNeutral);

  Click("ServoSimulator2_1");
  EXPECT_FALSE(Checked("chkUpdate_8") || Checked("chkUpdate_0"));
  EXPECT_TRUE(Checked("optPowerUp_1"));
  // The Tab key stops at the button that is checked.
  EXPECT_TRUE(Find("optPowerUp_1").focusPolicy() & Qt::TabFocus);
  EXPECT_FALSE(Find("optPowerUp_0").focusPolicy() & Qt::TabFocus);
}

TEST_F(Editor, WithoutAChannel_StoresNothing) {
  for (const char* name : {"optChannelType_0", "optPowerUp_2", "optLostComm_3"})
    EXPECT_FALSE(Find(name).isEnabled() || Checked(name)) << name;
  const ChannelTable before = window_->WorkingConfiguration();
  QTest::keyClick(&Spin("spnActPulseRange"), Qt::Key_Up);
  EXPECT_EQ(Text("lblActPulseRight"), "2410");
  Press("chkUpdate_8");
  EXPECT_TRUE(Checked("chkUpdate_5"));
  EXPECT_TRUE(window_->WorkingConfiguration() == before);
}

TEST_F(Editor, PulseScale_ShowsTheEditedValuesAndTheArm) {
  const auto words = [&] { return Said("PulseScale"); };
  const auto title = [&] { return Find("fraChosenServo").property("title").toString().toStdString(); };
  EXPECT_EQ(title(), "Channel");
  EXPECT_EQ(Text("lblNoChannel"), "Choose a channel: click a servo, or Ctrl+1");
  EXPECT_TRUE(Visible("lblNoChannel"));
  EXPECT_EQ(words(), "No channel is chosen.");

  Click("ServoSimulator2_2");
  EXPECT_EQ(title(), "CHAN 3");
  EXPECT_FALSE(Visible("lblNoChannel"));
  const QImage before = Find("PulseScale").grab().toImage();
  Type("spnNeutralTrim", "100");
  Find<QAbstractSlider>("HScrollSendServoPosition").setValue(600);
  EXPECT_THAT(words(),
              testing::HasSubstr("virtual range 1100 to 2100 µs, stop range 1100 to 2100 µs, "
                                 "default position 1600 µs, neutral position 1600 µs, arm at 1600 µs"));
  Press("cmdTest_2");  // to the record's default position, which only leaving the channel changes
  EXPECT_THAT(words(), testing::HasSubstr("arm at 1500 µs"));
  EXPECT_NE(Find("PulseScale").grab().toImage(), before);

  // In the smallest window nothing of the editor is cut off.
  const QSize needed = Spin("spnNeutralTrim").parentWidget()->minimumSizeHint();
  EXPECT_EQ(needed.boundedTo({440, 330}), needed);
}

TEST_F(Editor, ShownButNotStored_IsSaidUntilItIsStored) {
  window_->resize(1280, 800);
  const auto& unit = ConnectUnit();
  Click("ServoSimulator2_2");
  Press("chkUpdate_6");
  EXPECT_FALSE(Visible("lblUnstored") || Visible("cmdStore"));
  const QPoint scale = PlaceOf("PulseScale");
  const auto stored = [&] { return Find("PulseScale").grab().toImage(); };
  const auto described = [&](const char* spin) {
    return Said(spin).find("not stored yet") != std::string::npos;
  };
  Type("spnNeutralTrim", "100");
  const std::string sentence =
      "Shown, not stored yet: virtual range, stops, default. SEND would write what is stored.";
  EXPECT_EQ(Text("lblUnstored", "cmdStore"), sentence + " Store to 3, 7");
  EXPECT_EQ(Accessible("lblUnstored").text(QAccessible::Name).toStdString(), sentence);
  EXPECT_THAT(Said("PulseScale"), testing::HasSubstr(sentence));
  EXPECT_TRUE(described("spnVirtPulseRange") && described("spnDefaultPos"));
  EXPECT_FALSE(described("spnActPulseRange") || described("spnNeutralTrim"));
  Run("Command3_0");
  EXPECT_EQ(unit.PortOptions(3), (PortOptionBytes{1, 60, 240, 100, 200, 100, 200, 150, 160}))
      << "what is stored";
  Press("chkUpdate_7");
  EXPECT_FALSE(Visible("cmdStore")) << "an apply box stores it, too";

  // By its key, and from the keyboard; the focus then stays in the editor.
  Type("spnNeutralTrim", "50");
  const QImage hatched = stored();
  Keys("Ctrl+S");
  EXPECT_FALSE(Visible("cmdStore") || described("spnDefaultPos"));
  EXPECT_NE(stored(), hatched);
  EXPECT_EQ(PlaceOf("PulseScale"), scale) << "the editor jumps";
  for (const std::size_t channel : {2u, 6u, 7u})
    EXPECT_EQ(Record(channel).VirtualRange, (PulsePair{1050, 2050}));
  EXPECT_EQ(Record(3).VirtualRange, (PulsePair{1000, 2000}));
  Type("spnNeutralTrim", "0");
  Find("cmdStore").setFocus();
  Key(Qt::Key_Space);
  EXPECT_EQ(Record(7).VirtualRange, (PulsePair{1000, 2000}));
  EXPECT_EQ(window_->focusWidget(), &Spin("spnVirtPulseRange"));
}

TEST_F(Editor, OutputKind_ReplacesTheServo) {
  Click("ServoSimulator2_4");
  Press("chkUpdate_5");
  for (const auto& [option, text, kind] : {std::tuple("optChannelType_1", "DIGITAL\nPORT", kPortDigital),
                                           {"optChannelType_2", "PWM\nPORT", kPortPwm}}) {
    Press(option);
    EXPECT_EQ(Record(4).PortType, kind);
    EXPECT_EQ(Record(5).PortType, kPortServo) << "of the edited channel alone";
    EXPECT_EQ(Text("cmdDigitalOutput_4"), text);
    EXPECT_TRUE(Visible("cmdDigitalOutput_4") && !Visible("ServoSimulator2_4"));
    EXPECT_THAT(Text("lblOutput"), testing::HasSubstr(text));
  }
  Click("ServoSimulator2_0");
  EXPECT_TRUE(Checked("optChannelType_0") && Visible("ServoSimulator1"));
  const auto background = [&] { return Find("cmdDigitalOutput_4").grab().toImage().pixelColor(8, 8); };
  Click("cmdDigitalOutput_4");
  EXPECT_EQ(background(), QColor(Qt::blue));
  EXPECT_TRUE(Checked("optChannelType_2"));
  Press("chkUpdate_5");
  Press("optChannelType_0");
  EXPECT_FALSE(Checked("chkUpdate_5")) << "the channel is selected again";
  EXPECT_TRUE(Visible("ServoSimulator2_4"));
}

TEST_F(Editor, Preset_GoesToAllChannelsAndMovesNoServo) {
  const auto& unit = ConnectUnit();
  Click("ServoSimulator2_6");
  Press("chkSendSlideCommands");
  Press("optLostComm_0");
  ChooseByKeys("cmbPresets", 2);
  world_.time.Advance(100);
  EXPECT_FALSE(unit.LivePosition(7).has_value());
  for (std::size_t channel = 0; channel < kPortCount; ++channel)
    EXPECT_EQ(Record(channel).ActualRange, (PulsePair{500, 2500}));
  EXPECT_EQ(Text("lblActPulseLeft", "lblVirtPulseRange"), "500 800]");
  EXPECT_TRUE(Checked("optLostComm_3"));
  EXPECT_EQ(Arcs("ServoSimulator2_0"), "-100 100 -80 80 -80 80 ");
  EXPECT_EQ(QGuiApplication::overrideCursor(), nullptr);
}

TEST_F(Editor, PhysicalValues_PopUpForASecondInsideTheWindow) {
  world_.time.Advance(1000);
  Click("ServoSimulator2_1");
  Type("spnNeutralTrim", "100");
  window_->resize(700, 500);
  for (const char* label :
       {"Label13", "lblVirtPulseRange", "lblLeftVirtStop", "lblRightVirtStop", "lblDefaultPos"}) {
    QTest::mousePress(&Find(label), Qt::LeftButton);
    ASSERT_TRUE(Visible("fraActuals")) << label;
    EXPECT_TRUE(window_->rect().contains(Find("fraActuals").geometry())) << label;
    EXPECT_EQ(Text("lblVirtPulseLeftAct", "lblVirtPulseRightAct", "lblNeutralTrimAct"), "1100 2100 1600");
    EXPECT_EQ(Text("lblLeftVirtStopAct", "lblRightVirtStopAct", "lblDefaultPosAct"), "1100 2100 1600");
    world_.time.Advance(999);
    EXPECT_TRUE(Visible("fraActuals"));
    world_.time.Advance(1);
    EXPECT_FALSE(Visible("fraActuals"));
  }
  EXPECT_EQ(world_.time.RunningTimers(), 0);
}

TEST_F(Editor, TabKey_GoesThroughTheParametersFromTopToBottom) {
  Spin("spnActPulseRange").setFocus();
  for (const char* next :
       {"cmdTest_3", "spnVirtPulseRange", "cmdTest_0", "spnNeutralTrim", "cmdTest_4", "spnLeftVirtStop",
        "spnRightVirtStop", "cmdTest_1", "spnDefaultPos", "cmdTest_2"}) {
    Key(Qt::Key_Tab);
    EXPECT_EQ(window_->focusWidget(), &Find(next)) << next;
  }
}

}  // namespace
}  // namespace tendril::test
