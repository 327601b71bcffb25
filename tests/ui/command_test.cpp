// What the window allows and shows while a unit command runs.
#include <QGroupBox>
#include <set>

#include "window_fixture.h"

namespace tendril::test {
namespace {

using testing::HasSubstr;

class DuringCommand : public Window {
 protected:
  std::string Title() { return Find<QGroupBox>("frmProgress").title().toStdString(); }
  // By mouse, key and assistive technology.
  void Try(const char* control) {
    Click(control);
    for (const auto key : {Qt::Key_Space, Qt::Key_Up}) QTest::keyClick(&Find(control), key);
    if (auto* action = Accessible(control).actionInterface()) action->doAction(action->pressAction());
  }
};

TEST_F(DuringCommand, NothingChangesTheRecords) {
  auto& unit = ConnectUnit();
  Click("ServoSimulator2_2");
  TypeOver("spnDefaultPos", "-100");  // typed, and not entered
  Keys("Ctrl+Return");
  const ChannelTable before = window_->WorkingConfiguration();
  world_.time.Advance(1000);
  // All controls, the hidden ones too: assistive technology reaches them.
  const std::set<std::string> usable{"chkSendSlideCommands", "cmdCancel", "cmdShowConfig", "spnSumValue_0",
                                     "spnSumValue_1"};
  for (QWidget* control : window_->findChildren<QWidget*>()) {
    const std::string name = control->objectName().toStdString();
    const bool takes_input = control->inherits("QAbstractButton") || control->inherits("QComboBox") ||
                             control->inherits("QAbstractSpinBox") || control->inherits("QSlider") ||
                             name.starts_with("txtSum");
    if (!takes_input || name.empty() || name.starts_with("qt_") || usable.contains(name)) continue;
    EXPECT_FALSE(control->isEnabled() && !control->isHidden()) << name << " may change records";
  }
  for (const char* control :
       {"spnNeutralTrim", "cmbPresets", "optChannelType_1", "chkUpdate_8", "ServoSimulator2_3",
        "cmdDigitalOutput_5", "cmdShowSummary", "txtSumNeutralPosition_1", "optSumPUNeutral_4"}) {
    Try(control);
    EXPECT_EQ(window_->WorkingConfiguration(), before) << control;
    EXPECT_EQ(ToolTip(control), "Sending to unit 01") << control;
  }
  for (const char* keys : {"Ctrl+4", "F7", "Ctrl+Shift+P"}) Keys(keys);
  EXPECT_TRUE(Dial("ServoSimulator2_2").selected() && Visible("ServoSimulator1"));
  EXPECT_EQ(QApplication::focusWidget(), window_.get());
  RunToTheEnd();
  EXPECT_EQ(window_->WorkingConfiguration(), before);
  EXPECT_EQ(unit.PortOptions(3)[7], 140);
  EXPECT_EQ(QApplication::focusWidget(), &Find("spnDefaultPos"));
  EXPECT_THAT(ToolTip("spnDefaultPos"), HasSubstr("now 1400"));
}

TEST_F(DuringCommand, NothingIsPaintedFromAPollUntilTheLineIsReleased) {
  struct : QObject {
    int count = 0;
    bool eventFilter(QObject*, QEvent* event) override {
      return (count += event->type() == QEvent::Paint, false);
    }
  } paints;
  ConnectUnit();
  Find("frmProgress").installEventFilter(&paints);
  Keys("Ctrl+Return");
  QTest::qWait(0);
  EXPECT_EQ(paints.count, 0);
  world_.time.Advance(20);  // the echo has come
  QTest::qWait(0);
  EXPECT_EQ(paints.count, 1);
}

TEST_F(DuringCommand, SummaryThatIsAboutToBeShown_IsShownBefore) {
  ConnectUnit();
  Press("cmdShowSummary");
  Keys("Ctrl+Return");
  const ChannelTable before = window_->WorkingConfiguration();
  EXPECT_TRUE(Visible("frmSumHeader"));
  RunToTheEnd();
  EXPECT_EQ(window_->WorkingConfiguration(), before);

  Find<QLabel>("lblProgress").clear();
  Click("txtSumNeutralPosition_1");
  QTest::keyClick(&Spin("spnSumValue_0"), Qt::Key_Up);
  Keys("Ctrl+G");
  EXPECT_FALSE(Visible("fraNumberEntry"));
  RunToTheEnd();
  EXPECT_EQ(QApplication::focusWidget(), &Find("txtSumNeutralPosition_1"));
}

TEST_F(DuringCommand, Cancel_EndsItAfterItsPollAndSaysHowTheUnitIsLeft) {
  ConnectUnit();
  Find("Command3_0").setFocus();
  Key(Qt::Key_Space);
  world_.time.Advance(700);
  EXPECT_EQ(Title(), "Sending to unit 01: port 3 of 8");
  Key(Qt::Key_Tab);
  EXPECT_EQ(QApplication::focusWidget(), &Find("cmdCancel")) << "the first that a key reaches";
  while (!link_.PollOutstanding()) world_.time.Advance(1);
  Key(Qt::Key_Space);
  EXPECT_EQ(Title(), "Cancelling: waiting for the unit's last reply");
  EXPECT_FALSE(Find("cmdCancel").isEnabled() || Find("Command3_0").isEnabled());
  EXPECT_EQ(QApplication::focusWidget(), window_.get());
  RunToTheEnd();
  EXPECT_EQ(Title() + "|" + Text("lblProgress"), "Sending to unit 01: cancelled|COMMAND FAILED!");
  EXPECT_THAT(Text("lblStatus"),
              HasSubstr(": Cancelled: COMMAND FAILED! Ports 1 to 4 are written, 5 to 8 are not."));
  EXPECT_EQ(QApplication::focusWidget(), &Find("Command3_0"));
  EXPECT_TRUE(world_.boxes.shown.empty());
}

}  // namespace
}  // namespace tendril::test
