// What the window allows and shows while a unit command runs.
#include <QGroupBox>
#include <set>

#include "bench/faulty_units.h"
#include "window_fixture.h"

namespace tendril::test {
namespace {

using testing::HasSubstr;

class DuringCommand : public Window {
 protected:
  std::string Title() { return Find<QGroupBox>("frmProgress").title().toStdString(); }
  void Keys(const char* keys) { QTest::keySequence(window_.get(), QKeySequence(QString::fromLatin1(keys))); }
  QAction& MenuItem(const char* text) {
    for (QAction* action : window_->findChildren<QAction*>())
      if (action->text() == QString::fromLatin1(text)) return *action;
    throw std::logic_error(text);
  }
  // By mouse, key and assistive technology.
  void Try(const char* control) {
    Find(control).setFocus();
    Click(control);
    for (const auto key : {Qt::Key_Space, Qt::Key_Up, Qt::Key_Down}) QTest::keyClick(&Find(control), key);
    if (auto* action = Accessible(control).actionInterface())
      for (const QString& name : {action->pressAction(), action->toggleAction(), action->increaseAction()})
        action->doAction(name);
  }
};

TEST_F(DuringCommand, NothingChangesTheRecords) {
  Activate();
  auto& unit = ConnectUnit();
  Click("ServoSimulator2_2");
  TypeOver("spnActPulseRange", "700");
  Key(Qt::Key_Return);
  TypeOver("spnDefaultPos", "-100");  // typed, and not entered
  const ChannelConfig others = Record(0);
  Keys("Ctrl+Return");
  const ChannelTable before = window_->WorkingConfiguration();
  EXPECT_EQ(before.At(2).DefaultPosition, 1400);
  world_.time.Advance(1000);
  // All controls, the hidden ones too: assistive technology reaches them.
  const std::set<std::string> usable{"chkSendSlideCommands", "cmdCancel", "cmdShowConfig", "spnSumValue_0",
                                     "spnSumValue_1"};
  for (QWidget* control : window_->findChildren<QWidget*>()) {
    const std::string name = control->objectName().toStdString();
    const bool takes_input = control->inherits("QAbstractButton") || control->inherits("QComboBox") ||
                             control->inherits("QAbstractSpinBox") || name.starts_with("txtSum");
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
  EXPECT_EQ(Text("lblProgress"), "SUCCESS: Send Complete!");
  EXPECT_EQ(window_->WorkingConfiguration(), before);
  EXPECT_EQ(unit.PortOptions(3)[7], 140);
  EXPECT_EQ(Record(0), others);
  EXPECT_EQ(QApplication::focusWidget(), &Find("spnDefaultPos"));
  EXPECT_THAT(ToolTip("spnDefaultPos"), HasSubstr("now 1400"));
  for (const char* control :
       {"cmbPresets", "optPowerUp_1", "chkUpdate_8", "ServoSimulator2_3", "cmdShowSummary"})
    EXPECT_TRUE(Find(control).isEnabled()) << control;
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
  EXPECT_EQ(QApplication::focusWidget(), window_.get());
  RunToTheEnd();
  EXPECT_EQ(QApplication::focusWidget(), &Find("txtSumNeutralPosition_1"));
  EXPECT_EQ(Text("txtSumNeutralPosition_1"), "1500") << "read from the unit";
}

TEST_F(DuringCommand, Cancel_EndsItAfterItsPollAndSaysHowTheUnitIsLeft) {
  Activate();
  ConnectUnit();
  EXPECT_FALSE(MenuItem("&Cancel Command").isEnabled());
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

  Click("Command3_1");
  MenuItem("&Cancel Command").trigger();
  world_.time.Advance(200);
  EXPECT_THAT(Text("lblStatus"), HasSubstr("Nothing has changed."));
}

TEST_F(DuringCommand, Failure_StaysInTheStatusBarBehindTheBoxAndAfterIt) {
  ConnectUnit(0x0A);  // another one than the chosen
  std::string behind;
  world_.boxes.while_open = [&] { behind = Text("lblStatus"); };
  Click("Command3_0");
  RunToTheEnd();
  EXPECT_THAT(behind, HasSubstr(": COMMAND FAILED! Port 1 is perhaps written, 2 to 8 are not."));
  world_.time.Advance(5000);
  EXPECT_EQ(Text("lblStatus"), behind);
}

}  // namespace
}  // namespace tendril::test
