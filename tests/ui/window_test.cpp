// The real window on the offscreen platform, in simulated time: what a click or a key does.
#include <QAbstractButton>
#include <QAccessible>
#include <QCheckBox>
#include <QGroupBox>
#include <QLineEdit>
#include <QScrollArea>
#include <QSet>
#include <QSlider>
#include <QSpinBox>
#include <QWheelEvent>

#include "bench/faulty_units.h"
#include "simulator/servo_simulator.h"
#include "window_fixture.h"

namespace tendril::test {
namespace {

using testing::IsEmpty;

TEST_F(Window, FreshStart_ShowsTheDefaultConfiguration) {
  EXPECT_EQ(window_->windowTitle().toStdString(), "Kelvane Tendril Utility v3.2.1");
  EXPECT_EQ(Find<QComboBox>("cmbPresets").currentText().toStdString(), "Medium Range (default)");
  EXPECT_EQ(Find<QComboBox>("cmbNYX").currentText().toStdString(), "Select");
  EXPECT_EQ(Find<QComboBox>("cmbNYX").count(), 5);
  EXPECT_EQ(Find<QComboBox>("CmbUnitID_0").itemText(15).toStdString(), "F");
  EXPECT_EQ(Find<QComboBox>("CmbUnitID_1").currentText().toStdString(), "1");
  EXPECT_FALSE(Find("cmdWriteConfig").isEnabled());
  EXPECT_FALSE(Find("cmdReadConfig").isEnabled());
  EXPECT_TRUE(Find("fraApplyChans").isVisible());
  EXPECT_FALSE(Find("frmProgress").isVisible());
  world_.time.Advance(1000);  // the pop-up of physical values hides itself once, shown or not
  EXPECT_EQ(world_.time.RunningTimers(), 0);
  EXPECT_THAT(world_.boxes.shown, IsEmpty());
  EXPECT_EQ(Text("lblPositionValue_0") + " " + Text("lblPositionValue_1") + " " + Text("txtPositionValue"),
            "50 128 1500");

  for (int channel = 0; channel < 8; ++channel) {
    const ChannelConfig& record = window_->WorkingConfiguration().At(static_cast<std::size_t>(channel));
    EXPECT_EQ(record.PortType, kPortServo);
    EXPECT_EQ(record.ActualRange, (PulsePair{600, 2400}));
    EXPECT_EQ(record.VirtualStops, (PulsePair{1000, 2000}));
    EXPECT_EQ(record.LostCommOption, 4);
    EXPECT_EQ(record.PowerUPOpt, 3);
  }

  struct Spin {
    const char* name;
    int minimum, maximum, value;
  };
  for (const Spin& spin : {Spin{"spnActPulseRange", 0, 1000, 900}, Spin{"spnVirtPulseRange", 0, 1000, 800},
                           Spin{"spnLeftVirtStop", -800, 0, -750}, Spin{"spnRightVirtStop", 0, 800, 750},
                           Spin{"spnNeutralTrim", -200, 200, 0}, Spin{"spnDefaultPos", -750, 750, 0}}) {
    const auto& box = Find<QSpinBox>(spin.name);
    EXPECT_EQ(box.minimum(), spin.minimum) << spin.name;
    EXPECT_EQ(box.maximum(), spin.maximum) << spin.name;
    EXPECT_EQ(box.value(), spin.value) << spin.name;
    EXPECT_EQ(box.singleStep(), 10) << spin.name;
  }
  EXPECT_EQ(Text("lblActPulseLeft") + " " + Text("lblActPulseRight"), "600 2400");
  EXPECT_EQ(Text("lblVirtPulseRange"), "800]");
  EXPECT_EQ(Text("lblLeftVirtStop") + " " + Text("lblRightVirtStop"), "-750 +750");
}

TEST_F(Window, Simulators_ShowTheRecordsAndKeepThemOverAResize) {
  const auto expect_shown = [&] {
    for (int channel = 0; channel < 8; ++channel) {
      const auto& simulator = Find<ServoSimulator>(("ServoSimulator2_" + std::to_string(channel)).c_str());
      ServoDial wanted;
      wanted.SetRangeUS(600, 2400);
      wanted.SetLimitUS(1000, 2000);
      wanted.SetStopsUS(1000, 2000);
      EXPECT_EQ(simulator.dial().range().start, wanted.range().start);
      EXPECT_EQ(Find<ServoSimulator>("ServoSimulator1").dial().range().start, wanted.range().start);
      EXPECT_EQ(simulator.dial().limit().end, wanted.limit().end);
      EXPECT_EQ(simulator.dial().stops().start, wanted.stops().start);
    }
  };
  expect_shown();
  window_->resize(1100, 760);
  QTest::qWait(0);
  expect_shown();
}

TEST_F(Window, Send_ByMouse_EndsGreenAndTheUnitHoldsWhatWasSent) {
  auto& unit = world_.bench.Attach<VirtualUnit>(1, std::uint8_t{0x0A});
  for (int port = 1; port <= 8; ++port) unit.SetPortOptions(port, {1, 1, 1, 1, 1, 1, 1, 1, 1});
  ChooseByKeys("cmbNYX", 1);
  EXPECT_TRUE(link_.PortOpen());
  ChooseByKeys("CmbUnitID_1", 10);
  const QPoint servo_before = Find("ServoSimulator2_0").mapTo(window_.get(), QPoint());
  Click("Command3_0");
  QTest::qWait(0);

  EXPECT_TRUE(Find("frmProgress").isVisible());
  EXPECT_EQ(Find("ServoSimulator2_0").mapTo(window_.get(), QPoint()), servo_before) << "the window jumps";
  EXPECT_FALSE(Find("fraApplyChans").isVisible());
  EXPECT_EQ(Find<QGroupBox>("frmProgress").title().toStdString(), "Sending the configuration to unit 0A");
  for (const char* busy : {"cmbNYX", "CmbUnitID_0", "CmbUnitID_1", "Command3_0"}) {
    EXPECT_FALSE(Find(busy).isEnabled()) << busy;
    EXPECT_EQ(Find(busy).toolTip().toStdString(), "Sending the configuration to unit 0A") << busy;
  }
  world_.time.Advance(150);
  EXPECT_GT(Find("ShapeProgress").width(), 50);

  RunToTheEnd();
  EXPECT_EQ(Text("lblProgress"), "SUCCESS: Send Complete!");
  EXPECT_EQ(QAccessible::queryAccessibleInterface(&Find("lblProgress"))->text(QAccessible::Name),
            QStringLiteral("SUCCESS: Send Complete!"));
  const QColor colour = Find("ShapeProgress").palette().color(QPalette::Window);
  EXPECT_GT(colour.green(), colour.red());
  EXPECT_TRUE(Find("Command3_0").isEnabled());
  EXPECT_TRUE(Find("cmbNYX").isEnabled());
  for (int port = 1; port <= 8; ++port) {
    EXPECT_EQ(unit.PortOptions(port), (PortOptionBytes{1, 60, 240, 100, 200, 100, 200, 150, 150}));
  }
  world_.time.Advance(3000);
  EXPECT_TRUE(Find("fraApplyChans").isVisible());
  EXPECT_THAT(world_.boxes.shown, IsEmpty());
}

TEST_F(Window, Send_ByKeyboardAlone_LeavesTheFocusWhereItWas) {
  world_.bench.Attach<VirtualUnit>(1, std::uint8_t{0x01});
  window_->activateWindow();
  ASSERT_TRUE(QTest::qWaitForWindowActive(window_.get()));
  ChooseByKeys("cmbNYX", 1);
  // Tab on to the button, through the two digits of the ID.
  for (int tab = 0; tab < 3; ++tab) QTest::keyClick(QApplication::focusWidget(), Qt::Key_Tab);
  ASSERT_EQ(QApplication::focusWidget(), &Find("Command3_0"));
  QTest::keyClick(QApplication::focusWidget(), Qt::Key_Space);
  EXPECT_EQ(QApplication::focusWidget(), window_.get()) << "on nothing that a key could set off";
  RunToTheEnd();
  EXPECT_EQ(Text("lblProgress"), "SUCCESS: Send Complete!");
  EXPECT_EQ(QApplication::focusWidget(), &Find("Command3_0"));

  // Moved by the person meanwhile, it stays there.
  Find<QLabel>("lblProgress").clear();
  QTest::keyClick(QApplication::focusWidget(), Qt::Key_Space);
  Find("ServoSimulator2_3").setFocus();
  RunToTheEnd();
  EXPECT_EQ(QApplication::focusWidget(), &Find("ServoSimulator2_3"));
}

// What the unit called below holds in all of its ports: neither a preset nor symmetrical.
constexpr PortOptionBytes kOtherOptions = {1, 70, 230, 90, 190, 95, 180, 130, 140};

TEST_F(Window, Get_ShowsTheUnitsPortsAndLoadsTheChosenChannelAgain) {
  auto& unit = world_.bench.Attach<VirtualUnit>(1, std::uint8_t{0x01});
  for (int port = 1; port <= 8; ++port) unit.SetPortOptions(port, kOtherOptions);
  Click("ServoSimulator2_2");
  EXPECT_EQ(Text("lblVirtPulseRange"), "500]");
  ChooseByKeys("cmbNYX", 1);
  Find<QCheckBox>("chkSendSlideCommands").setChecked(true);
  Click("Command3_1");
  for (const char* busy : {"Command3_0", "Command3_2", "cmdTest_0", "HScrollSendServoPosition"}) {
    EXPECT_FALSE(Find(busy).isEnabled()) << busy;
    EXPECT_EQ(Find(busy).toolTip().toStdString(), "Reading the configuration of unit 01") << busy;
  }
  RunToTheEnd();
  EXPECT_EQ(Text("lblProgress"), "SUCCESS: Upload Complete");
  EXPECT_FALSE(unit.LivePosition(3).has_value()) << "a get moves no servo";

  ServoDial wanted;
  wanted.SetNeutralPositionUS(1400);  // all else is measured from it
  wanted.SetRangeUS(700, 2300);
  wanted.SetLimitUS(900, 1900);
  wanted.SetStopsUS(950, 1800);
  for (const char* name : {"ServoSimulator2_0", "ServoSimulator2_7", "ServoSimulator1"}) {
    EXPECT_EQ(Find<ServoSimulator>(name).dial().range().end, wanted.range().end) << name;
    EXPECT_EQ(Find<ServoSimulator>(name).dial().limit().start, wanted.limit().start) << name;
    EXPECT_EQ(Find<ServoSimulator>(name).dial().stops().start, wanted.stops().start) << name;
  }
  EXPECT_EQ(window_->WorkingConfiguration().At(7).NeutralPosition, 1400);
  EXPECT_EQ(Text("lblVirtPulseRange"), "500]");
  EXPECT_EQ(Text("lblNeutralTrim") + " " + Text("lblDefaultPos"), "-100 -100");
  EXPECT_EQ(Text("lblLeftVirtStop") + " " + Text("lblRightVirtStop"), "-450 +400");
  EXPECT_EQ(Text("txtPositionValue"), "1400");

  // The same button in the summary.
  Find<QLabel>("lblProgress").clear();
  unit.SetPortOptions(1, kFreshPortOptions);
  Find<QAbstractButton>("Command3_4").click();
  RunToTheEnd();
  EXPECT_EQ(window_->WorkingConfiguration().At(0).NeutralPosition, 1500);
}

TEST_F(Window, UpdateUnitId_GivesTheFactoryUnitItsIdButNever00) {
  auto& unit = world_.bench.Attach<VirtualUnit>(1, std::uint8_t{0xFF});
  ChooseByKeys("cmbNYX", 1);
  ChooseByKeys("CmbUnitID_1", 0);
  EXPECT_FALSE(Find("Command3_2").isEnabled());
  EXPECT_THAT(Find("Command3_2").toolTip().toStdString(), testing::HasSubstr("cannot have the ID 00"));
  ChooseByKeys("CmbUnitID_1", 5);
  EXPECT_TRUE(Find("Command3_2").isEnabled());
  Click("Command3_2");
  RunToTheEnd();
  EXPECT_EQ(Text("lblProgress"), "SUCCESS: UnitID set to '05'");
  EXPECT_EQ(unit.id(), 0x05);
}

TEST_F(Window, ChoosingAServo_MarksItAndShowsItsRecord) {
  const auto expect_chosen = [&](int chosen) {
    for (int channel = 0; channel < 8; ++channel) {
      const std::string number = std::to_string(channel);
      EXPECT_EQ(Find<ServoSimulator>(("ServoSimulator2_" + number).c_str()).dial().selected(),
                channel == chosen);
      EXPECT_EQ(Find<QCheckBox>(("chkUpdate_" + number).c_str()).isChecked(), channel == chosen);
    }
    EXPECT_EQ(Find<ServoSimulator>("ServoSimulator1").dial().caption(), "CHAN " + std::to_string(chosen + 1));
  };
  Click("ServoSimulator2_6");
  expect_chosen(6);
  EXPECT_EQ(Text("lblActPulseLeft") + " " + Text("lblVirtPulseRange") + " " + Text("lblRightVirtStop"),
            "600 500] +500");
  const QPoint before = Find("cmdTest_0").mapTo(window_.get(), QPoint());
  QTest::keyClick(&Find("ServoSimulator2_1"), Qt::Key_Space);
  QTest::qWait(0);
  expect_chosen(1);
  EXPECT_EQ(Find("cmdTest_0").mapTo(window_.get(), QPoint()), before) << "the window jumps";
}

TEST_F(Window, ChoosingAServo_PutsItsArmWhereTheSliderStands) {
  auto& unit = world_.bench.Attach<VirtualUnit>(1, std::uint8_t{0x01});
  unit.SetPortOptions(2, kOtherOptions);
  ChooseByKeys("cmbNYX", 1);
  Find<QSlider>("HScrollSendServoPosition").setValue(600);
  // Without a channel the editor's own values stand in: 700 to 2300.
  EXPECT_EQ(Text("txtPositionValue"), "1660");
  EXPECT_EQ(Find<ServoSimulator>("ServoSimulator1").dial().arm_pulse(), 1660);
  Click("Command3_1");
  RunToTheEnd();
  Find<QCheckBox>("chkSendSlideCommands").setChecked(true);
  Click("ServoSimulator2_1");
  world_.time.Advance(50);
  EXPECT_EQ(Text("txtPositionValue"), "1500");  // 900 to 1900
  EXPECT_EQ(unit.LivePosition(2), 150);
  EXPECT_EQ(Find<ServoSimulator>("ServoSimulator2_1").dial().arm_pulse(), 1500);
  EXPECT_EQ(Find<ServoSimulator>("ServoSimulator2_2").dial().arm_pulse(), 1660) << "not ticked";
}

TEST_F(Window, TestButtons_SweepTheServoDrawnAndReal) {
  auto& unit = world_.bench.Attach<VirtualUnit>(1, std::uint8_t{0x01});
  ChooseByKeys("cmbNYX", 1);
  Click("ServoSimulator2_3");
  const auto& test = Find<QAbstractButton>("cmdTest_1");
  Click("cmdTest_1");
  EXPECT_EQ(test.text().toStdString(), "Stop");
  world_.time.Advance(470);
  EXPECT_EQ(unit.LivePosition(4), 165);
  EXPECT_FALSE(unit.LivePosition(3).has_value());
  EXPECT_EQ(Find<ServoSimulator>("ServoSimulator1").dial().arm_pulse(), 1650);
  EXPECT_EQ(Find<ServoSimulator>("ServoSimulator2_3").dial().arm_pulse(), 1650);
  EXPECT_EQ(Find<ServoSimulator>("ServoSimulator2_4").dial().arm_pulse(), 1500);
  window_->resize(1100, 760);
  QTest::qWait(0);
  EXPECT_EQ(Find<ServoSimulator>("ServoSimulator2_3").dial().arm_pulse(), 1650) << "after a resize";

  Find<QCheckBox>("chkSendSlideCommands").click();
  EXPECT_EQ(test.text().toStdString(), "Test");
  EXPECT_FALSE(test.isEnabled());
  EXPECT_THAT(test.toolTip().toStdString(), testing::HasSubstr("Use Slider to Test Intensity Values"));
  Find<QCheckBox>("chkSendSlideCommands").click();
  EXPECT_TRUE(test.isEnabled());

  // A unit command ends it.
  Click("cmdTest_1");
  Click("Command3_1");
  EXPECT_EQ(test.text().toStdString(), "Test");
  RunToTheEnd();

  // A closing window takes a running sweep with it, also one that moves the drawing only.
  link_.SetCommPort(0);
  world_.time.Advance(4000);
  Click("cmdTest_0");
  EXPECT_TRUE(window_->close());
  world_.time.Advance(5000);
  EXPECT_EQ(world_.time.RunningTimers(), 0);
  EXPECT_THAT(world_.boxes.shown, IsEmpty());
}

TEST_F(Window, Slider_MovesTheServoByKeysWheelAndMouseAndCanBeRead) {
  auto& unit = world_.bench.Attach<VirtualUnit>(1, std::uint8_t{0x01});
  ChooseByKeys("cmbNYX", 1);
  Click("ServoSimulator2_0");
  auto& slider = Find<QSlider>("HScrollSendServoPosition");
  QTest::keyClick(&slider, Qt::Key_Right);
  world_.time.Advance(50);
  EXPECT_FALSE(unit.LivePosition(1).has_value()) << "the box is not ticked";
  Find<QCheckBox>("chkSendSlideCommands").click();

  const auto expect_at = [&](int value, const std::string& read_outs) {
    world_.time.Advance(50);
    EXPECT_EQ(slider.value(), value);
    EXPECT_EQ(Text("lblPositionValue_0") + " " + Text("lblPositionValue_1") + " " + Text("txtPositionValue"),
              read_outs);
    EXPECT_EQ(unit.LivePosition(1), (1000 + value) / 10);
    EXPECT_EQ(Find<ServoSimulator>("ServoSimulator1").dial().arm_pulse(), 1000 + value);
    const auto* accessible = QAccessible::queryAccessibleInterface(&slider);
    EXPECT_THAT(accessible->text(QAccessible::Description).toStdString(),
                testing::HasSubstr(std::to_string(1000 + value) + " µs"));
  };
  QTest::keyClick(&slider, Qt::Key_Right);
  expect_at(520, "52 133 1520");
  QTest::keyClick(&slider, Qt::Key_PageUp);
  expect_at(620, "62 158 1620");
  QTest::keyClick(&slider, Qt::Key_Home);
  expect_at(0, "0 0 1000");
  const QPoint middle = slider.rect().center();
  QWheelEvent wheel(middle, slider.mapToGlobal(middle), {}, {0, 120}, Qt::NoButton, Qt::NoModifier,
                    Qt::NoScrollPhase, false);
  QApplication::sendEvent(&slider, &wheel);
  world_.time.Advance(50);
  EXPECT_GT(slider.value(), 0);
  EXPECT_EQ(unit.LivePosition(1), (1000 + slider.value()) / 10);
  QTest::keyClick(&slider, Qt::Key_Home);
  QTest::mousePress(&slider, Qt::LeftButton, {}, {2, middle.y()});
  QTest::mouseMove(&slider, {slider.width() - 2, middle.y()});
  QTest::mouseRelease(&slider, Qt::LeftButton, {}, {slider.width() - 2, middle.y()});
  expect_at(1000, "100 255 2000");
}

TEST_F(Window, Failures_AreToldAndTheButtonsWorkAgain) {
  Click("Command3_0");
  ASSERT_EQ(world_.boxes.shown.size(), 1u);
  EXPECT_EQ(world_.boxes.Take()[0].title, "No Port Selected");

  ChooseByKeys("cmbNYX", 4);
  bool button_works_behind_the_box = false;
  world_.boxes.while_open = [&] { button_works_behind_the_box = Find("Command3_0").isEnabled(); };
  Click("Command3_0");
  RunToTheEnd();
  EXPECT_EQ(world_.boxes.Take().at(0).title, "No Repsonse");
  EXPECT_TRUE(button_works_behind_the_box);
  EXPECT_EQ(Text("lblProgress"), "COMMAND FAILED!");
  const QColor colour = Find("ShapeProgress").palette().color(QPalette::Window);
  EXPECT_GT(colour.red(), colour.green());
}

TEST_F(Window, Wheel_ChangesNoClosedList) {
  for (const char* name : {"cmbNYX", "CmbUnitID_0", "CmbUnitID_1", "cmbPresets"}) {
    auto& box = Find<QComboBox>(name);
    const int before = box.currentIndex();
    const QPoint middle = box.rect().center();
    for (const int turn : {120, -120}) {
      QWheelEvent wheel(middle, box.mapToGlobal(middle), {}, {0, turn}, Qt::NoButton, Qt::NoModifier,
                        Qt::NoScrollPhase, false);
      QApplication::sendEvent(&box, &wheel);
      EXPECT_EQ(box.currentIndex(), before) << name;
    }
  }
  EXPECT_FALSE(link_.PortOpen());
}

TEST_F(Window, ClosedInTheMiddleOfASend_StopsAndReleasesThePort) {
  world_.bench.Attach<MuteUnit>(1, std::uint8_t{0x01});
  ChooseByKeys("cmbNYX", 1);
  Click("Command3_0");
  world_.time.Advance(50);
  EXPECT_TRUE(window_->close());
  EXPECT_FALSE(link_.PortOpen());
  world_.time.Advance(60000);
  EXPECT_THAT(world_.boxes.shown, IsEmpty());
  window_.reset();
  world_.time.Advance(1000);
}

TEST_F(Window, SweepOfTheDrawing_DoesNotReachAPortThatIsChosenThen) {
  world_.bench.Attach<VirtualUnit>(1, std::uint8_t{0x01});
  int bytes = 0;
  world_.bench.Line(1).SetTap([&bytes](const LineByte&) { ++bytes; });
  Click("ServoSimulator2_0");
  Click("cmdTest_0");
  world_.time.Advance(600);
  ChooseByKeys("cmbNYX", 1);
  world_.time.Advance(3000);
  EXPECT_EQ(bytes, 0);
}

TEST_F(Window, ClosedWhileABoxIsOpen_EndsQuietly) {
  ChooseByKeys("cmbNYX", 4);
  world_.boxes.while_open = [&] { EXPECT_TRUE(window_->close()); };
  Click("Command3_0");
  RunToTheEnd();
  EXPECT_EQ(world_.boxes.Take().size(), 1u);
  world_.time.Advance(60000);
  EXPECT_THAT(world_.boxes.shown, IsEmpty());
}

TEST_F(Window, EveryControl_HasANameAndSaysWhatItDoes) {
  QSet<QString> names;
  for (QWidget* widget : window_->findChildren<QWidget*>()) {
    const bool control =
        qobject_cast<QAbstractButton*>(widget) != nullptr || qobject_cast<QComboBox*>(widget) != nullptr ||
        qobject_cast<QLineEdit*>(widget) != nullptr || qobject_cast<QAbstractSpinBox*>(widget) != nullptr ||
        qobject_cast<QAbstractSlider*>(widget) != nullptr;
    if (!control || widget->objectName().startsWith(QStringLiteral("qt_")) || widget->inherits("QScrollBar"))
      continue;
    const std::string object = widget->objectName().toStdString();
    EXPECT_NE(object, "");
    EXPECT_FALSE(widget->toolTip().isEmpty()) << object;
    QAccessibleInterface* accessible = QAccessible::queryAccessibleInterface(widget);
    EXPECT_NE(accessible->role(), QAccessible::NoRole) << object;
    EXPECT_NE(accessible->role(), QAccessible::Client) << object;
    const QString name = accessible->text(QAccessible::Name);
    EXPECT_FALSE(name.isEmpty()) << object;
    EXPECT_FALSE(names.contains(name)) << object << " shares the name " << name.toStdString();
    names.insert(name);
  }
  EXPECT_GT(names.size(), 100);
}

TEST_F(Window, At1024x720_ShowsEverythingWithoutScrolling) {
  window_->resize(1024, 720);
  QTest::qWait(0);
  const auto& scroll = *window_->findChild<QScrollArea*>();
  EXPECT_LE(scroll.widget()->minimumSizeHint().width(), 1024);
  EXPECT_LE(scroll.widget()->minimumSizeHint().height(), 720);
}

}  // namespace
}  // namespace tendril::test
