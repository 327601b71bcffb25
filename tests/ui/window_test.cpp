// The real window: start-up, unit commands, live test, closing, and what every control has.
#include <QAccessible>
#include <QGroupBox>
#include <QScrollArea>
#include <QScrollBar>
#include <QSet>
#include <QSlider>
#include <vector>

#include "ui/sign.h"
#include "window_fixture.h"

namespace tendril::test {
namespace {

using testing::HasSubstr;
using testing::IsEmpty;

TEST_F(Window, FreshStart_ShowsTheDefaultConfiguration) {
  EXPECT_EQ(window_->windowTitle().toStdString(), "Kelvane Tendril Utility v3.2.1");
  std::string lists;
  for (const char* list : {"cmbPresets", "cmbNYX", "CmbUnitID_0", "CmbUnitID_1"}) {
    TurnWheel(Find(list), -120);  // changes no closed list
    lists += Find<QComboBox>(list).currentText().toStdString() + "|";
  }
  EXPECT_EQ(lists, "Medium Range (default)|Select|0|1|");
  EXPECT_EQ(Find<QComboBox>("cmbNYX").count(), 5);
  EXPECT_FALSE(Find("cmdWriteConfig").isEnabled() || Find("cmdReadConfig").isEnabled());
  EXPECT_TRUE(Visible("fraApplyChans") && !Visible("frmProgress"));
  EXPECT_EQ(Text("lblPositionValue_0", "lblPositionValue_1", "txtPositionValue"), "50 128 1500");
  EXPECT_EQ(Text("lblActPulseLeft", "lblActPulseRight", "lblVirtPulseRange"), "600 2400 800]");
  EXPECT_EQ(Text("lblLeftVirtStop", "lblRightVirtStop", "lblNeutralTrim", "lblDefaultPos"), "-750 +750 0 0");
  std::vector<int> spins;
  for (const char* name : {"spnActPulseRange", "spnVirtPulseRange", "spnLeftVirtStop", "spnRightVirtStop",
                           "spnNeutralTrim", "spnDefaultPos"}) {
    for (const int value : {Spin(name).minimum(), Spin(name).maximum(), Spin(name).value()})
      spins.push_back(value);
    EXPECT_EQ(Spin(name).singleStep(), 10);
  }
  EXPECT_EQ(spins, (std::vector{0, 1000, 900, 0, 1000, 800, -800, 0, -750, 0, 800, 750, -200, 200, 0, -750,
                                750, 0}));
  for (const QSize& size : {window_->size(), QSize(1024, 720)}) {
    window_->resize(size);
    QTest::qWait(0);
    EXPECT_EQ(Arcs("ServoSimulator2_7"), "-90 90 -50 50 -50 50 ");
    EXPECT_EQ(Arcs("ServoSimulator1"), "-90 90 -80 80 -75 75 ");
  }
  world_.time.Advance(1000);  // the pop-up of physical values hides itself
  EXPECT_EQ(world_.time.RunningTimers(), 0);
  EXPECT_THAT(world_.boxes.shown, IsEmpty());
}

// A laptop's screen without its bars, at 100 % and at 150 %.
TEST_F(Window, SmallScreens_CutNothingOff) {
  const QScrollArea& area = *window_->findChild<QScrollArea*>();
  const auto resize = [this](int width, int height) {
    window_->resize(width, height);
    for (int step = 0; step < 5; ++step) QTest::qWait(0);  // from layout to layout
  };
  for (const char* view : {"simulator", "summary"}) {
    resize(1366, 700);
    EXPECT_EQ(area.verticalScrollBar()->maximum(), 0) << view;
    resize(880, 466);  // and a border
    EXPECT_EQ(area.horizontalScrollBar()->maximum(), 0) << view;
    ShowSummary();
  }
  Find<QAction>("actLine").trigger();
  resize(880, 466);
  EXPECT_EQ(area.horizontalScrollBar()->maximum(), 0) << "with the line";
  EXPECT_TRUE(area.height() > 100 && Find("tblLine").height() > 100);
}

TEST_F(Window, Send_ByMouse_WritesTheRecordsIntoTheUnit) {
  auto& unit = ConnectUnit(0x0A);
  for (int port = 1; port <= 8; ++port) unit.SetPortOptions(port, {1, 1, 1, 1, 1, 1, 1, 1, 1});
  ChooseByKeys("CmbUnitID_1", 10);
  const QPoint servo = PlaceOf("ServoSimulator2_0");
  Click("Command3_0");
  QTest::qWait(0);

  EXPECT_TRUE(Visible("frmProgress") && !Visible("fraApplyChans"));
  EXPECT_EQ(PlaceOf("ServoSimulator2_0"), servo) << "the window jumps";
  EXPECT_EQ(Find<QGroupBox>("frmProgress").title().toStdString(), "Sending to unit 0A: port 1 of 8");
  world_.time.Advance(150);
  EXPECT_GT(Find("ShapeProgress").width(), 50);

  RunToTheEnd();
  EXPECT_EQ(Text("lblProgress"), "SUCCESS: Send Complete!");
  EXPECT_EQ(Find("frmProgress").findChild<Sign*>()->Kind(), SignKind::kSuccess);
  const QColor colour = Find("ShapeProgress").palette().color(QPalette::Window);
  EXPECT_GT(colour.green(), colour.red());
  EXPECT_TRUE(Find("Command3_0").isEnabled() && Find("cmbNYX").isEnabled());
  for (int port = 1; port <= 8; ++port) EXPECT_EQ(unit.PortOptions(port), kFreshPortOptions);
  EXPECT_THAT(world_.boxes.shown, IsEmpty());
}

TEST_F(Window, Send_ByKeyboardAlone_LeavesTheFocusWhereItWas) {
  ConnectUnit();
  // To the button, past the two digits of the ID and the button that finds units.
  for (const Qt::Key key : {Qt::Key_Tab, Qt::Key_Tab, Qt::Key_Tab, Qt::Key_Tab, Qt::Key_Space}) Key(key);
  EXPECT_EQ(QApplication::focusWidget(), window_.get()) << "on nothing that a key could trigger";
  RunToTheEnd();
  EXPECT_EQ(Text("lblProgress"), "SUCCESS: Send Complete!");
  EXPECT_EQ(QApplication::focusWidget(), &Find("Command3_0"));

  // It stays where the user moves it meanwhile.
  Find<QLabel>("lblProgress").clear();
  Key(Qt::Key_Space);
  Find("chkSendSlideCommands").setFocus();
  RunToTheEnd();
  EXPECT_EQ(QApplication::focusWidget(), &Find("chkSendSlideCommands"));
}

TEST_F(Window, Get_ShowsThePortsOfTheUnit) {
  auto& unit = ConnectUnit();
  // Neither a preset nor symmetrical.
  for (int port = 1; port <= 8; ++port) unit.SetPortOptions(port, {1, 70, 230, 90, 190, 95, 180, 130, 140});
  Click("ServoSimulator2_2");
  Press("chkSendSlideCommands");
  Run("Command3_1");
  EXPECT_EQ(Text("lblProgress"), "SUCCESS: Upload Complete");
  EXPECT_FALSE(unit.LivePosition(3).has_value()) << "a get moves no servo";
  for (const char* servo : {"ServoSimulator2_0", "ServoSimulator2_7", "ServoSimulator1"})
    EXPECT_EQ(Arcs(servo), "-90 70 -50 50 -40 45 ") << servo;
  EXPECT_EQ(Record(7).DefaultPosition, 1300);
  EXPECT_EQ(Text("lblVirtPulseRange", "lblNeutralTrim", "lblDefaultPos"), "500] -100 -100");
  EXPECT_EQ(Text("lblLeftVirtStop", "lblRightVirtStop", "txtPositionValue"), "-450 +400 1400");
}

TEST_F(Window, UpdateUnitId_GivesTheFactoryUnitItsIdButNever00) {
  const auto& unit = ConnectUnit(0xFF);
  ChooseByKeys("CmbUnitID_1", 0);
  EXPECT_FALSE(Find("Command3_2").isEnabled());
  EXPECT_THAT(ToolTip("Command3_2"), HasSubstr("cannot have the ID 00"));
  ChooseByKeys("CmbUnitID_1", 5);
  Run("Command3_2");
  EXPECT_EQ(Text("lblProgress"), "SUCCESS: UnitID set to '05'");
  EXPECT_EQ(unit.id(), 0x05);
}

TEST_F(Window, SelectedServo_IsMarkedAndFollowsTheSlider) {
  const auto& unit = ConnectUnit();
  auto& slider = Find<QSlider>("HScrollSendServoPosition");
  slider.setValue(600);
  EXPECT_EQ(Text("txtPositionValue"), "1660") << "of the editor's own values, 700 to 2300";
  Click("ServoSimulator2_6");
  const QPoint test_button = PlaceOf("cmdTest_0");
  QTest::keyClick(&Find("ServoSimulator2_1"), Qt::Key_Space);
  QTest::qWait(0);
  EXPECT_TRUE(Dial("ServoSimulator2_1").selected() && Checked("chkUpdate_1"));
  EXPECT_FALSE(Dial("ServoSimulator2_6").selected() || Checked("chkUpdate_6"));
  EXPECT_EQ(Dial("ServoSimulator1").caption(), "CHAN 2");
  EXPECT_EQ(PlaceOf("cmdTest_0"), test_button) << "the window jumps";
  EXPECT_EQ(Dial("ServoSimulator2_1").arm_pulse(), 1600);
  EXPECT_EQ(Dial("ServoSimulator2_2").arm_pulse(), 1500) << "not ticked";
  world_.time.Advance(50);
  EXPECT_FALSE(unit.LivePosition(2).has_value()) << "the box is not ticked";

  Press("chkSendSlideCommands");
  QTest::keyClick(&slider, Qt::Key_PageUp);
  EXPECT_EQ(slider.value(), 700);
  TurnWheel(slider, 120);
  EXPECT_GT(slider.value(), 700);
  QTest::keyClick(&slider, Qt::Key_Home);
  const QPoint right(slider.width() - 2, slider.height() / 2);
  QTest::mousePress(&slider, Qt::LeftButton, {}, {2, slider.height() / 2});
  QTest::mouseMove(&slider, right);
  QTest::mouseRelease(&slider, Qt::LeftButton, {}, right);
  world_.time.Advance(50);
  EXPECT_EQ(Text("lblPositionValue_0", "lblPositionValue_1", "txtPositionValue"), "100 255 2000");
  EXPECT_EQ(unit.LivePosition(2), 200);
  EXPECT_THAT(Said("HScrollSendServoPosition"), HasSubstr("2000 µs"));
}

TEST_F(Window, TestButtons_SweepTheDrawnAndTheRealServo) {
  Click("ServoSimulator2_3");
  Click("cmdTest_0");
  EXPECT_EQ(Text("cmdTest_0"), "Stop");
  const auto& unit = ConnectUnit();
  EXPECT_EQ(Text("cmdTest_0"), "Test") << "a sweep of the drawing does not reach a port that is chosen later";
  Click("cmdTest_1");
  world_.time.Advance(470);
  EXPECT_EQ(unit.LivePosition(4), 165);
  window_->resize(1100, 760);
  QTest::qWait(0);
  EXPECT_EQ(Dial("ServoSimulator1").arm_pulse(), 1650);
  EXPECT_EQ(Dial("ServoSimulator2_3").arm_pulse(), 1650);
  EXPECT_EQ(Dial("ServoSimulator2_4").arm_pulse(), 1500);

  Press("chkSendSlideCommands");
  EXPECT_EQ(Text("cmdTest_1"), "Test");
  EXPECT_FALSE(Find("cmdTest_1").isEnabled());
  EXPECT_THAT(ToolTip("cmdTest_1"), HasSubstr("Use Slider to Test Intensity Values"));
  Press("chkSendSlideCommands");
  Click("cmdTest_1");
  Click("Command3_1");
  EXPECT_EQ(Text("cmdTest_1"), "Test") << "a unit command ends it";
  RunToTheEnd();
}

TEST_F(Window, Failure_IsReportedAndTheButtonsWorkAgain) {
  Click("Command3_0");
  EXPECT_EQ(world_.boxes.Take().at(0).title, "No Port Selected");
  ChooseByKeys("cmbNYX", 4);
  std::string behind_the_box;
  world_.boxes.while_open = [&] {
    EXPECT_TRUE(Find("Command3_0").isEnabled());
    behind_the_box = Text("lblStatus");
  };
  Run("Command3_0");
  EXPECT_EQ(world_.boxes.Take().at(0).title, "No Repsonse");
  EXPECT_THAT(behind_the_box, HasSubstr(": COMMAND FAILED! Port 1 is perhaps written, 2 to 8 are not."));
  EXPECT_EQ(Text("lblStatus"), behind_the_box);
  EXPECT_EQ(Text("lblProgress"), "COMMAND FAILED!");
  EXPECT_EQ(Find("frmProgress").findChild<Sign*>()->Kind(), SignKind::kFailure);
  const QColor colour = Find("ShapeProgress").palette().color(QPalette::Window);
  EXPECT_GT(colour.red(), colour.green());

  // Closing the window while the box is open ends quietly.
  world_.boxes.while_open = [&] { EXPECT_TRUE(window_->close()); };
  Run("Command3_0");
  world_.time.Advance(60000);
  EXPECT_EQ(world_.boxes.shown.size(), 1u);
}

TEST_F(Window, EveryControl_HasANameAndSaysWhatItDoes) {
  Find<QAction>("actLine").trigger();
  QSet<QString> names;
  for (QWidget* widget : window_->findChildren<QWidget*>()) {
    const bool control = widget->inherits("QAbstractButton") || widget->inherits("QComboBox") ||
                         widget->inherits("QLineEdit") || widget->inherits("QAbstractSpinBox") ||
                         widget->inherits("QSlider");
    if (!control || widget->objectName().startsWith(QStringLiteral("qt_")) ||
        widget->inherits("QTableCornerButton"))
      continue;
    const std::string object = widget->objectName().toStdString();
    EXPECT_NE(object, "");
    EXPECT_FALSE(widget->toolTip().isEmpty()) << object;
    const QAccessibleInterface* accessible = QAccessible::queryAccessibleInterface(widget);
    EXPECT_NE(accessible->role(), QAccessible::NoRole) << object;
    EXPECT_NE(accessible->role(), QAccessible::Client) << object;
    const QString name = accessible->text(QAccessible::Name);
    EXPECT_FALSE(name.isEmpty()) << object;
    if (const auto* box = qobject_cast<QComboBox*>(widget)) {
      EXPECT_EQ(name, box->accessibleName()) << object;
      EXPECT_EQ(accessible->text(QAccessible::Value), box->currentText()) << object;
    }
    EXPECT_FALSE(names.contains(name)) << object << " shares the name " << name.toStdString();
    names.insert(name);
  }
  EXPECT_GT(names.size(), 100);
}

TEST_F(Window, AccessibleActions_DoWhatClicksDo) {
  const auto act = [](QAccessibleInterface& control) {
    control.actionInterface()->doAction(control.actionInterface()->actionNames().first());
  };
  act(Accessible("ServoSimulator2_2"));
  EXPECT_TRUE(Dial("ServoSimulator2_2").selected());
  QTest::keyClick(&Spin("spnNeutralTrim"), Qt::Key_Up);
  act(Accessible("chkUpdate_5"));
  EXPECT_EQ(Record(5).NeutralPosition, 1510);
  act(Accessible("optLostComm_0"));
  EXPECT_EQ(Record(5).LostCommOption, kLostCommHold);

  auto& box = Find<QComboBox>("cmbPresets");
  QAccessibleInterface& list = *Accessible("cmbPresets").child(0);
  for (int line = 1; line < 3; ++line) {  // line 1 is the current one
    Accessible("cmbPresets").actionInterface()->doAction(QAccessibleActionInterface::showMenuAction());
    EXPECT_TRUE(box.view()->isVisible());
    EXPECT_EQ(list.child(line)->text(QAccessible::Name), box.itemText(line));
    EXPECT_EQ(list.indexOfChild(list.child(line)), line);
    act(*list.child(line));
    EXPECT_FALSE(box.view()->isVisible());
    EXPECT_EQ(Record(5).VirtualRange, kPresets.at(static_cast<std::size_t>(line)).virtual_range);
    EXPECT_EQ(Record(5).NeutralPosition, 1500);
  }

  ShowSummary();
  act(Accessible("txtSumStopRange_4"));
  EXPECT_EQ(Text("lblDisplay"), "Channel 5 Stops");
}

}  // namespace
}  // namespace tendril::test
