// The editor as a person meets it: what clicks and keys do to records, captions and servos.
#include <QAbstractButton>
#include <QCheckBox>
#include <QGroupBox>
#include <QRadioButton>
#include <QSpinBox>
#include <vector>

#include "simulator/servo_simulator.h"
#include "window_fixture.h"

namespace tendril::test {
namespace {

class Editor : public Window {
 protected:
  const ChannelConfig& Record(std::size_t channel) { return window_->WorkingConfiguration().At(channel); }
  QSpinBox& Spin(const char* name) { return Find<QSpinBox>(name); }
  // Types over the value, and leaves it unfinished.
  void TypeOver(const char* spin, const char* text) {
    Spin(spin).setFocus();
    Spin(spin).selectAll();
    QTest::keyClicks(&Spin(spin), QString::fromLatin1(text));
  }
  void Type(const char* spin, const char* text) {
    TypeOver(spin, text);
    QTest::keyClick(&Spin(spin), Qt::Key_Return);
  }
  bool Checked(const char* button) { return Find<QAbstractButton>(button).isChecked(); }
  const ServoDial& Dial(const char* name) { return Find<ServoSimulator>(name).dial(); }
};

TEST_F(Editor, Stepping_MovesCaptionsRecordAndServos) {
  Click("ServoSimulator2_2");
  QTest::keyClick(&Spin("spnNeutralTrim"), Qt::Key_Up);
  EXPECT_EQ(Text("lblNeutralTrim"), "+10");
  EXPECT_EQ(Record(2).NeutralPosition, 1510);
  EXPECT_EQ(Record(2).VirtualStops[0], 1000) << "stored when the channel is left";
  QTest::keyClick(&Spin("spnRightVirtStop"), Qt::Key_Down);
  EXPECT_EQ(Text("lblRightVirtStop"), "+490");
  EXPECT_EQ(Record(2).VirtualStops[1], 2000);  // 1500 + 10 + 490
  Type("spnRightVirtStop", "0");
  EXPECT_EQ(Text("lblRightVirtStop"), "+0");
  Type("spnDefaultPos", "-20");
  EXPECT_EQ(Text("lblDefaultPos"), "-20");
  Type("spnActPulseRange", "300");
  EXPECT_EQ(Text("lblActPulseLeft") + " " + Text("lblActPulseRight"), "1200 1800");
  EXPECT_EQ(Text("lblVirtPulseRange"), "300]");
  EXPECT_EQ(Text("lblNeutralTrim"), "0");
  EXPECT_EQ(Spin("spnVirtPulseRange").maximum(), 300);
  ServoDial wanted;
  wanted.SetNeutralPositionUS(1510);  // the record's still
  wanted.SetRangeUS(1200, 1800);
  for (const char* servo : {"ServoSimulator2_2", "ServoSimulator1"})
    EXPECT_EQ(Dial(servo).range().start, wanted.range().start) << servo;

  Click("ServoSimulator2_0");
  EXPECT_EQ(Dial("ServoSimulator2_2").limit().start, Dial("ServoSimulator2_2").range().start)
      << "drawn when it is left";
  EXPECT_EQ(Record(2).VirtualRange, (PulsePair{1200, 1800}));
  EXPECT_EQ(Text("lblActPulseLeft"), "600");
}

TEST_F(Editor, TypedValue_CountsWhenItIsWhole) {
  auto& unit = world_.bench.Attach<VirtualUnit>(1, std::uint8_t{0x01});
  ChooseByKeys("cmbNYX", 1);
  Click("ServoSimulator2_0");
  TypeOver("spnDefaultPos", "25");
  EXPECT_EQ(Record(0).DefaultPosition, 1500);
  QTest::keyClicks(&Spin("spnDefaultPos"), QStringLiteral("5"));
  QTest::keyClick(&Spin("spnDefaultPos"), Qt::Key_Tab);
  EXPECT_EQ(Record(0).DefaultPosition, 1755);
  // A shortcut leaves the focus where it is: what has been typed is sent all the same.
  TypeOver("spnActPulseRange", "880");
  Find<QAbstractButton>("Command3_0").click();
  RunToTheEnd();
  EXPECT_EQ(unit.PortOptions(1), (PortOptionBytes{1, 62, 238, 100, 200, 100, 200, 175, 150}));

  // Closing takes it over too, and opens no port for it.
  Find<QCheckBox>("chkSendSlideCommands").click();
  TypeOver("spnRightVirtStop", "123");
  EXPECT_TRUE(window_->close());
  world_.time.Advance(5000);
  EXPECT_FALSE(link_.PortOpen());
  EXPECT_EQ(Record(0).VirtualStops[1], 1623);
}

TEST_F(Editor, WindowThatGoesWhileSomethingIsTyped_GoesQuietly) {
  Click("ServoSimulator2_0");
  Find<QCheckBox>("chkSendSlideCommands").click();
  TypeOver("spnRightVirtStop", "123");
  window_.reset();
  EXPECT_EQ(world_.time.RunningTimers(), 0);
}

TEST_F(Editor, ApplyBoxes_LetOtherChannelsFollow) {
  Click("ServoSimulator2_0");
  EXPECT_TRUE(Checked("chkUpdate_0"));
  Find<QCheckBox>("chkUpdate_3").click();
  Type("spnDefaultPos", "100");
  EXPECT_EQ(Record(3).DefaultPosition, 1600);
  EXPECT_EQ(Record(4).DefaultPosition, 1500);

  Find<QCheckBox>("chkUpdate_0").click();
  EXPECT_TRUE(Checked("chkUpdate_0")) << "the edited channel's own box";
  Find<QCheckBox>("chkUpdate_8").click();
  EXPECT_TRUE(Checked("chkUpdate_7"));
  EXPECT_TRUE(Checked("chkUpdate_8"));
  EXPECT_EQ(Record(7).DefaultPosition, 1600);
  EXPECT_EQ(Dial("ServoSimulator2_7").default_angle(), ServoDial::Convert(-10));
  Find<QRadioButton>("optPowerUp_1").click();
  Find<QRadioButton>("optLostComm_0").click();
  EXPECT_EQ(Record(7).PowerUPOpt, kPowerUpNeutral);
  EXPECT_EQ(Record(7).LostCommOption, kLostCommHold);

  Click("ServoSimulator2_1");
  EXPECT_FALSE(Checked("chkUpdate_8"));
  EXPECT_FALSE(Checked("chkUpdate_0"));
  EXPECT_TRUE(Checked("optPowerUp_1"));
  // The Tab key stops at the button that is checked.
  EXPECT_EQ(Find("optPowerUp_1").focusPolicy() & Qt::TabFocus, Qt::TabFocus);
  EXPECT_EQ(Find("optPowerUp_0").focusPolicy() & Qt::TabFocus, 0);
}

TEST_F(Editor, WithoutAChannel_TheChoicesAreInert) {
  for (const char* name : {"optChannelType_0", "optPowerUp_2", "optLostComm_3"}) {
    EXPECT_FALSE(Find(name).isEnabled()) << name;
    EXPECT_FALSE(Checked(name)) << name;
  }
  const ChannelTable before = window_->WorkingConfiguration();
  QTest::keyClick(&Spin("spnActPulseRange"), Qt::Key_Up);
  EXPECT_EQ(Text("lblActPulseRight"), "2410");
  Find<QCheckBox>("chkUpdate_8").click();
  EXPECT_TRUE(Checked("chkUpdate_5"));
  EXPECT_TRUE(window_->WorkingConfiguration() == before);
}

TEST_F(Editor, OutputKinds_StandInTheServosPlace) {
  Click("ServoSimulator2_4");
  Find<QCheckBox>("chkUpdate_5").click();
  for (const auto& [option, text, kind] : {std::tuple("optChannelType_1", "DIGITAL\nPORT", kPortDigital),
                                           {"optChannelType_2", "PWM\nPORT", kPortPwm}}) {
    Find<QRadioButton>(option).click();
    EXPECT_EQ(Record(4).PortType, kind);
    EXPECT_EQ(Record(5).PortType, kPortServo) << "the edited channel's alone";
    EXPECT_FALSE(Find("ServoSimulator2_4").isVisible());
    EXPECT_EQ(Find<QAbstractButton>("cmdDigitalOutput_4").text().toStdString(), text);
    EXPECT_TRUE(Find("cmdDigitalOutput_4").isVisible());
    EXPECT_THAT(Text("lblOutput"), testing::HasSubstr(text));
  }
  Click("ServoSimulator2_0");
  EXPECT_TRUE(Checked("optChannelType_0"));
  EXPECT_TRUE(Find("ServoSimulator1").isVisible());
  const auto background = [&] { return Find("cmdDigitalOutput_4").grab().toImage().pixelColor(8, 8); };
  EXPECT_NE(background(), QColor(Qt::blue));
  Click("cmdDigitalOutput_4");
  EXPECT_EQ(background(), QColor(Qt::blue));
  EXPECT_TRUE(Checked("optChannelType_2"));
  Find<QCheckBox>("chkUpdate_5").click();
  Find<QRadioButton>("optChannelType_0").click();
  EXPECT_FALSE(Checked("chkUpdate_5")) << "the channel is chosen again";
  EXPECT_TRUE(Find("ServoSimulator2_4").isVisible());
  EXPECT_EQ(Record(4).PortType, kPortServo);
}

TEST_F(Editor, Presets_GoToAllChannelsAndCanBeChosenAgain) {
  auto& unit = world_.bench.Attach<VirtualUnit>(1, std::uint8_t{0x01});
  ChooseByKeys("cmbNYX", 1);
  Click("ServoSimulator2_6");
  Find<QCheckBox>("chkSendSlideCommands").click();
  Find<QRadioButton>("optLostComm_0").click();
  ChooseByKeys("cmbPresets", 2);
  world_.time.Advance(100);
  EXPECT_FALSE(unit.LivePosition(7).has_value()) << "a preset moves no servo";
  for (std::size_t channel = 0; channel < 8; ++channel) {
    EXPECT_EQ(Record(channel).ActualRange, (PulsePair{500, 2500}));
    EXPECT_EQ(Record(channel).LostCommOption, kLostCommStopPulse);
  }
  EXPECT_EQ(Text("lblActPulseLeft") + " " + Text("lblVirtPulseRange"), "500 800]");
  EXPECT_TRUE(Checked("optLostComm_3"));
  EXPECT_EQ(Dial("ServoSimulator2_0").range().start, Dial("ServoSimulator1").range().start);

  Type("spnActPulseRange", "900");
  auto& presets = Find<QComboBox>("cmbPresets");
  Q_EMIT presets.activated(presets.currentIndex());  // the same line, chosen again
  EXPECT_EQ(Record(6).ActualRange, (PulsePair{500, 2500}));
  EXPECT_EQ(Spin("spnActPulseRange").value(), 1000);
  EXPECT_EQ(QGuiApplication::overrideCursor(), nullptr);
}

TEST_F(Editor, PhysicalValues_PopUpForASecondInsideTheWindow) {
  world_.time.Advance(1000);
  Click("ServoSimulator2_1");
  Type("spnNeutralTrim", "100");
  window_->resize(700, 500);
  for (const char* label :
       {"Label13", "lblVirtPulseRange", "lblLeftVirtStop", "lblRightVirtStop", "lblDefaultPos"}) {
    EXPECT_FALSE(Find("fraActuals").isVisible());
    QTest::mousePress(&Find(label), Qt::LeftButton);
    ASSERT_TRUE(Find("fraActuals").isVisible()) << label;
    EXPECT_TRUE(window_->rect().contains(Find("fraActuals").geometry())) << label;
    EXPECT_EQ(
        Text("lblVirtPulseLeftAct") + " " + Text("lblVirtPulseRightAct") + " " + Text("lblNeutralTrimAct"),
        "1100 2100 1600");
    EXPECT_EQ(Text("lblLeftVirtStopAct") + " " + Text("lblRightVirtStopAct") + " " + Text("lblDefaultPosAct"),
              "1100 2100 1600");
    world_.time.Advance(999);
    EXPECT_TRUE(Find("fraActuals").isVisible());
    world_.time.Advance(1);
  }
  EXPECT_EQ(world_.time.RunningTimers(), 0);
}

TEST_F(Editor, TabKey_GoesThroughTheParametersFromTopToBottom) {
  window_->activateWindow();
  ASSERT_TRUE(QTest::qWaitForWindowActive(window_.get()));
  Spin("spnActPulseRange").setFocus();
  for (const char* next :
       {"cmdTest_3", "spnVirtPulseRange", "cmdTest_0", "spnNeutralTrim", "cmdTest_4", "spnLeftVirtStop",
        "spnRightVirtStop", "cmdTest_1", "spnDefaultPos", "cmdTest_2"}) {
    QTest::keyClick(QApplication::focusWidget(), Qt::Key_Tab);
    EXPECT_EQ(QApplication::focusWidget()->objectName().toStdString(), next);
  }
}

}  // namespace
}  // namespace tendril::test
