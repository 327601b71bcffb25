// The summary as a person meets it.
#include <QAbstractButton>
#include <QAccessible>
#include <QGroupBox>
#include <QLineEdit>
#include <QRadioButton>
#include <QSpinBox>

#include "window_fixture.h"

namespace tendril::test {
namespace {

class Summary : public Window {
 protected:
  const ChannelConfig& Record(std::size_t channel) { return window_->WorkingConfiguration().At(channel); }
  void ShowSummary() {
    Find<QAbstractButton>("cmdShowSummary").click();
    world_.time.Advance(20);
    QTest::qWait(0);
    ASSERT_TRUE(Find("frmSumHeader").isVisible());
  }
  std::string Cell(const char* name) { return Find<QLineEdit>(name).text().toStdString(); }
  bool EntryShown() { return Find("fraNumberEntry").isVisible(); }
  std::string EntryLabels() {
    return Text("lblDisplay") + ": " + Text("lblSumValue_0") + " " + Text("lblSumValue_1");
  }
};

TEST_F(Summary, Rows_ShowEveryChannel) {
  Click("ServoSimulator2_5");
  Find<QRadioButton>("optChannelType_1").click();
  Find<QRadioButton>("optPowerUp_0").click();
  Click("ServoSimulator2_6");
  Find<QRadioButton>("optChannelType_2").click();
  Click("ServoSimulator2_0");
  Find<QRadioButton>("optPowerUp_1").click();
  Find<QRadioButton>("optLostComm_2").click();
  Click("cmdTest_0");
  ShowSummary();
  EXPECT_EQ(Find<QAbstractButton>("cmdTest_0").text().toStdString(), "Test") << "the sweep has ended";
  EXPECT_FALSE(Find("ServoSimulator1").isVisible());
  EXPECT_EQ(Text("lblSumChannel_0"), "CHAN 1");
  EXPECT_EQ(
      Cell("txtSumActualRange_0") + " " + Cell("txtSumVirtualRange_0") + " " + Cell("txtSumStopRange_0"),
      "600-2400 1000-2000 1000-2000");
  EXPECT_EQ(Cell("txtSumNeutralPosition_7") + " " + Cell("txtSumDefaultPosition_7"), "1500 1500");
  EXPECT_TRUE(Find<QRadioButton>("optSumPUNeutral_0").isChecked());
  EXPECT_TRUE(Find<QRadioButton>("optSumLCneutral_0").isChecked());
  EXPECT_TRUE(Find<QRadioButton>("optSumPUFirstCmd_1").isChecked());
  EXPECT_TRUE(Find<QRadioButton>("optSumLCfirstcmd_1").isChecked());
  for (const auto& [word, label, text] : {std::tuple("Digital", "lblSumDIOPWM_5", "txtSumStopRange_5"),
                                          {"PWM", "lblSumDIOPWM_6", "txtSumStopRange_6"}}) {
    EXPECT_EQ(Text(label), word);
    EXPECT_TRUE(Find(label).isVisible());
    EXPECT_FALSE(Find(text).isVisible());
  }
  EXPECT_FALSE(Find("optSumPUDefault_5").isVisible());
  EXPECT_FALSE(Find("lblSumDIOPWM_0").isVisible());
  // The table's columns stand under each other, whatever a row shows.
  const auto middle = [&](const char* name) {
    return Find(name).mapTo(window_.get(), Find(name).rect().center()).x();
  };
  EXPECT_EQ(middle("txtSumStopRange_0"), middle("txtSumStopRange_7"));
  EXPECT_LE(std::abs(middle("lblParameters_0") - middle("optSumPUDefault_0")), 1);
  EXPECT_LE(std::abs(middle("lblParameters_6") - middle("optSumLCfirstcmd_7")), 1);
}

TEST_F(Summary, NumberEntry_ByMouse) {
  ShowSummary();
  Click("txtSumNeutralPosition_3");
  ASSERT_TRUE(EntryShown());
  auto& spin = Find<QSpinBox>("spnSumValue_0");
  EXPECT_EQ(Text("lblDisplay"), "Channel 4 Neutral Trim");
  EXPECT_EQ(spin.minimum(), -800);
  EXPECT_FALSE(Find("spnSumValue_1").isVisible());
  world_.time.Advance(60000);
  EXPECT_TRUE(EntryShown()) << "until the first change";
  QTest::keyClick(&spin, Qt::Key_Up);
  EXPECT_EQ(spin.minimum(), -400);
  EXPECT_EQ(EntryLabels(), "Channel 4 Neutral Trim: 10 1510");
  EXPECT_EQ(
      Cell("txtSumNeutralPosition_3") + " " + Cell("txtSumVirtualRange_3") + " " + Cell("txtSumStopRange_3"),
      "1510 1010-2010 1010-2000");
  EXPECT_EQ(Record(3).NeutralPosition, 1510);
  EXPECT_EQ(Record(4).NeutralPosition, 1500);

  world_.time.Advance(3000);
  QTest::keyClick(&spin, Qt::Key_Up);
  world_.time.Advance(3499);
  EXPECT_TRUE(EntryShown());
  world_.time.Advance(1);
  EXPECT_FALSE(EntryShown());

  // Moved to another value, it waits for a change again.
  Click("txtSumStopRange_7");
  QTest::keyClick(&spin, Qt::Key_Up);
  Click("txtSumActualRange_0");
  world_.time.Advance(10000);
  EXPECT_TRUE(EntryShown());
  // An option button closes it.
  Find<QRadioButton>("optSumLCcurrent_2").click();
  EXPECT_FALSE(EntryShown());
  EXPECT_EQ(Record(2).LostCommOption, kLostCommHold);
  Click("txtSumActualRange_0");
  Find<QRadioButton>("optSumPUDefault_2").click();
  EXPECT_FALSE(EntryShown());
  EXPECT_EQ(Record(2).PowerUPOpt, kPowerUpDefault);
  EXPECT_FALSE(Find("chkUpdate_0").isEnabled()) << "each change goes to its own channel";
}

TEST_F(Summary, TypedNumber_IsNotLostWhenTheEntryCloses) {
  ShowSummary();
  Click("txtSumNeutralPosition_0");
  auto& spin = Find<QSpinBox>("spnSumValue_0");
  QTest::keyClick(&spin, Qt::Key_Up);
  world_.time.Advance(3000);
  spin.selectAll();
  QTest::keyClicks(&spin, QStringLiteral("250"));
  world_.time.Advance(500);
  EXPECT_EQ(Record(0).NeutralPosition, 1750);
  world_.time.Advance(3500);
  EXPECT_FALSE(EntryShown());

  Click("txtSumNeutralPosition_0");
  spin.selectAll();
  QTest::keyClicks(&spin, QStringLiteral("50"));
  Find<QAbstractButton>("cmdShowConfig").click();
  EXPECT_EQ(Record(0).NeutralPosition, 1550);
}

TEST_F(Summary, DoubleClickAndEscape_LeaveNoPanelBehind) {
  ShowSummary();
  QTest::mouseDClick(&Find("txtSumStopRange_4"), Qt::LeftButton);
  EXPECT_TRUE(EntryShown());
  EXPECT_EQ(window_->focusWidget(), &Find("spnSumValue_0"));
  Find("txtSumActualRange_1").setFocus();
  QTest::keyClick(&Find("txtSumActualRange_1"), Qt::Key_Escape);
  EXPECT_FALSE(EntryShown());
  QTest::mouseClick(&Find("txtSumStopRange_4"), Qt::RightButton);
  EXPECT_FALSE(EntryShown());
}

TEST_F(Summary, PressedAtOnce_IsThere) {
  SimulatedControlPanel panel(world_);
  frmNewServoConfig window(link_, world_.time, world_.boxes, panel.control_panel, Version{1, 0, 0});
  FindControl<QAbstractButton>(window, "cmdShowSummary").click();
  world_.time.Advance(20);
  EXPECT_FALSE(FindControl(window, "frmSumHeader").isHidden());
}

TEST_F(Summary, NumberEntry_ByKeyboardAlone) {
  window_->activateWindow();
  ASSERT_TRUE(QTest::qWaitForWindowActive(window_.get()));
  ShowSummary();
  auto& stops = Find<QLineEdit>("txtSumStopRange_1");
  Find("txtSumVirtualRange_1").setFocus();
  QTest::keyClick(QApplication::focusWidget(), Qt::Key_Tab);
  ASSERT_EQ(QApplication::focusWidget(), &stops);
  QTest::keyClick(&stops, Qt::Key_Return);
  ASSERT_TRUE(EntryShown());
  QTest::keyClick(QApplication::focusWidget(), Qt::Key_Up);
  QTest::keyClick(QApplication::focusWidget(), Qt::Key_Tab);
  ASSERT_EQ(QApplication::focusWidget(), &Find("spnSumValue_1"));
  QTest::keyClick(QApplication::focusWidget(), Qt::Key_Down);
  EXPECT_EQ(EntryLabels(), "Channel 2 Stops: -490 +490");
  EXPECT_EQ(stops.text().toStdString(), "1010-1990");
  QTest::keyClick(QApplication::focusWidget(), Qt::Key_Escape);
  EXPECT_FALSE(EntryShown());
  EXPECT_EQ(QApplication::focusWidget(), &stops);
  world_.time.Advance(4000);
  EXPECT_EQ(world_.time.RunningTimers(), 0);
}

TEST_F(Summary, NumberEntry_LiesWhollyInsideTheWindow) {
  ShowSummary();
  for (const QSize& size : {QSize(1024, 720), QSize(700, 430)}) {
    window_->resize(size);
    QTest::qWait(0);
    for (const char* text : {"txtSumActualRange_0", "txtSumDefaultPosition_7", "txtSumStopRange_7"}) {
      Find(text).setFocus();
      QTest::keyClick(&Find(text), Qt::Key_Return);
      const QWidget& entry = Find("fraNumberEntry");
      EXPECT_TRUE(window_->rect().contains(entry.geometry())) << text;
      EXPECT_TRUE(entry.rect().contains(Find("spnSumValue_0").geometry()));
      EXPECT_GE(entry.height(), entry.sizeHint().height());
    }
  }
}

TEST_F(Summary, BackToTheSimulator_TheChannelIsTheEditorsAgain) {
  Click("ServoSimulator2_1");
  const auto simulator_values = [&] {
    return Text("lblActPulseLeft") + " " + Text("lblVirtPulseRange") + " " + Text("lblNeutralTrim") + " " +
           Text("lblLeftVirtStop") + " " + Text("lblDefaultPos");
  };
  const std::string before = simulator_values();
  const ChannelTable records = window_->WorkingConfiguration();
  ShowSummary();
  Find<QAbstractButton>("cmdShowConfig").click();
  EXPECT_TRUE(Find("ServoSimulator1").isVisible());
  EXPECT_EQ(simulator_values(), before);
  EXPECT_TRUE(window_->WorkingConfiguration() == records) << "nothing stored on the way";
  EXPECT_EQ(window_->focusWidget(), &Find("ServoSimulator2_1"));

  ShowSummary();
  Click("txtSumActualRange_1");
  QTest::keyClick(&Find("spnSumValue_0"), Qt::Key_Down);
  Find<QAbstractButton>("cmdShowConfig").click();
  EXPECT_EQ(Text("lblActPulseLeft"), "610");
  EXPECT_FALSE(EntryShown());
  // Leaving the channel stores what the summary made of it.
  Click("ServoSimulator2_2");
  EXPECT_EQ(Record(1).ActualRange, (PulsePair{610, 2390}));
}

TEST_F(Summary, Get_FillsTheTableAndAnUnknownKindShowsNothing) {
  auto& unit = world_.bench.Attach<VirtualUnit>(1, std::uint8_t{0x01});
  unit.SetPortOptions(2, {1, 70, 230, 90, 190, 95, 180, 130, 140});
  unit.SetPortOptions(4, {1, 10, 249, 100, 200, 100, 200, 150, 150});
  unit.SetPortOptions(3, {0, 60, 240, 100, 200, 100, 200, 150, 150});
  ChooseByKeys("cmbNYX", 1);
  ShowSummary();
  Click("txtSumStopRange_0");
  Click("Command3_4");
  // A flag byte of 0 ends the reply before its port: such a kind can only come with other flags.
  unit.SetPortOptions(3, {4, 60, 240, 100, 200, 100, 200, 150, 150});
  RunToTheEnd();
  EXPECT_EQ(Text("lblProgress"), "SUCCESS: Upload Complete");
  EXPECT_EQ(Cell("txtSumActualRange_1") + " " + Cell("txtSumNeutralPosition_1"), "700-2300 1400");
  EXPECT_EQ(Cell("txtSumActualRange_3"), "305-2695");
  EXPECT_EQ(
      Text("lblRemarks_1"),
      "⚠ Channel 3: output kind -1 cannot be sent\n⚠ Channel 4: 305 to 2695 cannot be sent\nand 1 more");
  EXPECT_THAT(Find("lblRemarks_1").toolTip().toStdString(),
              testing::HasSubstr("Channel 4: 100 to 2490 is shown as 305 to 2695"));
  EXPECT_FALSE(EntryShown());
  EXPECT_EQ(Record(2).PortType, -1);
  EXPECT_FALSE(Find("txtSumActualRange_2").isVisible());
  EXPECT_EQ(Text("lblSumDIOPWM_2"), "");
  Find<QAbstractButton>("cmdShowConfig").click();
  Click("ServoSimulator2_2");
  for (const char* kind : {"optChannelType_0", "optChannelType_1", "optChannelType_2"}) {
    EXPECT_FALSE(Find<QRadioButton>(kind).isChecked());
  }
  // A send stops at a record that cannot be sent, and says where.
  Find<QRadioButton>("optChannelType_0").click();
  EXPECT_EQ(Text("lblRemarks_0"),
            "⚠ Channel 4: 305 to 2695 cannot be sent\n⚠ Channel 4: 100 to 2490 is shown as 305 to 2695");
  const QPoint servo = Find("ServoSimulator2_0").mapTo(window_.get(), QPoint());
  Click("Command3_0");
  ASSERT_TRUE(world_.time.AdvanceUntil([&] { return !world_.boxes.shown.empty(); }, 20000));
  EXPECT_EQ(world_.boxes.Take()[0].text, "Internal Error - Invalid ActualRange(1)=2695");
  EXPECT_EQ(Find<QGroupBox>("frmProgress").title().toStdString(),
            "Stopped: channel 4: 305 to 2695 cannot be sent");
  ChooseByKeys("cmbPresets", 2);
  EXPECT_EQ(Text("lblRemarks_0"), "");
  EXPECT_EQ(Find("ServoSimulator2_0").mapTo(window_.get(), QPoint()), servo) << "the window jumps";
}

TEST_F(Summary, HeldArrow_GoesOnSteppingAndIsLetGoOfBehindABox) {
  ShowSummary();
  Click("txtSumNeutralPosition_3");
  auto& spin = Find<QSpinBox>("spnSumValue_0");
  const QPoint down(spin.width() - 5, spin.height() - 5);
  QTest::mousePress(&spin, Qt::LeftButton, {}, down);
  EXPECT_TRUE(QTest::qWaitFor([&] { return spin.value() <= -30; }, 5000));
  spin.clearFocus();  // a box opens, and gets the release
  QTest::mouseRelease(window_.get(), Qt::LeftButton);
  QTest::keyClick(&spin, Qt::Key_Up);
  EXPECT_EQ(spin.minimum(), -400);
}

}  // namespace
}  // namespace tendril::test
