// The real window on the offscreen platform, in simulated time: what a click or a key does.
#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <QAbstractButton>
#include <QAccessible>
#include <QComboBox>
#include <QGroupBox>
#include <QLabel>
#include <QScrollArea>
#include <QSet>
#include <QSpinBox>
#include <QTest>
#include <QWheelEvent>
#include <memory>
#include <string>

#include "bench/faulty_units.h"
#include "simulator/servo_simulator.h"
#include "support/simulated_world.h"
#include "ui/frm_new_servo_config.h"

namespace tendril::test {
namespace {

using testing::IsEmpty;

class Window : public testing::Test {
 protected:
  Window() {
    window_->show();
    [[maybe_unused]] const bool exposed = QTest::qWaitForWindowExposed(window_.get());
    QTest::qWait(0);  // what is not seen at first is made after the first paint
  }

  template <typename Widget = QWidget>
  Widget& Find(const char* name) {
    auto* widget = window_->findChild<Widget*>(QString::fromUtf8(name));
    if (widget == nullptr) throw std::logic_error(std::string("no control named ") + name);
    return *widget;
  }
  std::string Text(const char* label) { return Find<QLabel>(label).text().toStdString(); }
  void Click(const char* button) { QTest::mouseClick(&Find(button), Qt::LeftButton); }
  // Chooses a line of a list with the keyboard, as a person without a mouse does.
  void ChooseByKeys(const char* list, int line) {
    auto& box = Find<QComboBox>(list);
    box.setFocus();
    while (box.currentIndex() < line) QTest::keyClick(&box, Qt::Key_Down);
    while (box.currentIndex() > line) QTest::keyClick(&box, Qt::Key_Up);
  }
  void RunToTheEnd() {
    ASSERT_TRUE(world_.time.AdvanceUntil([&] { return !Text("lblProgress").empty(); }, 20000));
  }

  SimulatedWorld world_;
  HwSerial link_{*world_.device, world_.time, world_.time, world_.log};
  std::unique_ptr<frmNewServoConfig> window_ =
      std::make_unique<frmNewServoConfig>(link_, world_.time, world_.boxes, Version{3, 2, 1});
};

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
  EXPECT_EQ(world_.time.RunningTimers(), 0);
  EXPECT_THAT(world_.boxes.shown, IsEmpty());

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
      EXPECT_EQ(simulator.dial().range_start(), wanted.range_start());
      EXPECT_EQ(simulator.dial().limit_end(), wanted.limit_end());
      EXPECT_EQ(simulator.dial().stops_start(), wanted.stops_start());
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
  RunToTheEnd();
  EXPECT_EQ(Text("lblProgress"), "SUCCESS: Send Complete!");
  EXPECT_EQ(QApplication::focusWidget(), &Find("Command3_0"));
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
    const bool control = qobject_cast<QAbstractButton*>(widget) != nullptr ||
                         qobject_cast<QComboBox*>(widget) != nullptr ||
                         qobject_cast<QAbstractSpinBox*>(widget) != nullptr ||
                         qobject_cast<QAbstractSlider*>(widget) != nullptr;
    if (!control || widget->objectName().startsWith(QStringLiteral("qt_")) || widget->inherits("QScrollBar"))
      continue;
    const std::string object = widget->objectName().toStdString();
    EXPECT_NE(object, "");
    EXPECT_FALSE(widget->toolTip().isEmpty()) << object;
    const QString name = QAccessible::queryAccessibleInterface(widget)->text(QAccessible::Name);
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
