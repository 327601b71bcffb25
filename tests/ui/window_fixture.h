// Window: the real window on the offscreen platform, in simulated time, used by mouse and keyboard.
#pragma once

#include <gmock/gmock.h>

#include <QAbstractButton>
#include <QAbstractItemView>
#include <QAccessible>
#include <QApplication>
#include <QClipboard>
#include <QComboBox>
#include <QLabel>
#include <QSpinBox>
#include <QTest>
#include <QWheelEvent>
#include <cmath>
#include <memory>
#include <string>

#include "simulator/servo_simulator.h"
#include "support/find_control.h"
#include "support/simulated_control_panel.h"
#include "ui/frm_new_servo_config.h"

namespace tendril::test {

// No channel is selected yet. The lines of Comm 1 to 4 have no units until a test attaches some.
class Window : public testing::Test {
 protected:
  Window() {
    window_->show();
    Activate();
    world_.time.Advance(10);  // the comm listener client has connected and identified itself
    QTest::qWait(0);          // the parts that are hidden at first are made after the first paint
  }

  template <typename Widget = QWidget>
  Widget& Find(const char* name) {
    return FindControl<Widget>(*window_, name);
  }
  QSpinBox& Spin(const char* name) { return Find<QSpinBox>(name); }
  bool Checked(const char* button) { return Find<QAbstractButton>(button).isChecked(); }
  bool Visible(const char* name) { return Find(name).isVisible(); }
  QAccessibleInterface& Accessible(const char* name) {
    return *QAccessible::queryAccessibleInterface(&Find(name));
  }
  QPoint PlaceOf(const char* name) { return Find(name).mapTo(window_.get(), QPoint()); }
  // What a screen reader says of a control besides its name.
  std::string Said(const char* name) { return Accessible(name).text(QAccessible::Description).toStdString(); }
  std::string ToolTip(const char* name) { return Find(name).toolTip().toStdString(); }
  // The texts of labels, buttons and fields, joined by spaces.
  template <typename... Names>
  std::string Text(const char* name, const Names*... more) {
    std::string text = Find(name).property("text").toString().toStdString();
    ((text += " " + Text(more)), ...);
    return text;
  }
  const ChannelConfig& Record(std::size_t channel) { return window_->WorkingConfiguration().At(channel); }
  const ServoDial& Dial(const char* servo) { return Find<ServoSimulator>(servo).dial(); }
  // The ends of range, limit and stops of a servo, in servo degrees: "-90 90 -50 50 -45 45 ".
  std::string Arcs(const char* servo) {
    std::string text;
    for (const ServoDial::Arc* arc : {&Dial(servo).range(), &Dial(servo).limit(), &Dial(servo).stops()}) {
      for (const double angle : {arc->start, arc->end})
        text += std::to_string(std::lround(std::remainder(90 - angle / kDialPi * 180, 360))) + " ";
    }
    return text;
  }

  void Click(const char* control) { QTest::mouseClick(&Find(control), Qt::LeftButton); }
  // Clicks a button whose box may be smaller than the button.
  void Press(const char* button) { Find<QAbstractButton>(button).click(); }
  // Presses a key, or keys as "Ctrl+3", on the control that has the focus.
  void Key(Qt::Key key) { QTest::keyClick(window_->focusWidget(), key); }
  void Keys(const char* keys) { QTest::keySequence(window_.get(), QKeySequence(QString::fromLatin1(keys))); }
  static std::string Copied() { return QGuiApplication::clipboard()->text().toStdString(); }
  // Selects the value of a spin button and types `text`, without Enter.
  void TypeOver(const char* spin, const char* text) {
    Spin(spin).setFocus();
    Spin(spin).selectAll();
    QTest::keyClicks(&Spin(spin), QString::fromLatin1(text));
  }
  void TurnWheel(QWidget& widget, int angle) {
    const QPoint middle = widget.rect().center();
    QWheelEvent wheel(middle, widget.mapToGlobal(middle), {}, {0, angle}, Qt::NoButton, Qt::NoModifier,
                      Qt::NoScrollPhase, false);
    QApplication::sendEvent(&widget, &wheel);
  }
  // Chooses a line of a list with the arrow keys and Enter.
  void ChooseByKeys(const char* list, int line) {
    auto& box = Find<QComboBox>(list);
    box.setFocus();
    box.showPopup();
    while (box.view()->currentIndex().row() < line) QTest::keyClick(box.view(), Qt::Key_Down);
    while (box.view()->currentIndex().row() > line) QTest::keyClick(box.view(), Qt::Key_Up);
    QTest::keyClick(box.view(), Qt::Key_Return);
  }
  // Attaches a unit to Comm 1 and chooses that port.
  VirtualUnit& ConnectUnit(std::uint8_t id = 0x01) {
    auto& unit = world_.bench.Attach<VirtualUnit>(1, std::uint8_t{id});
    ChooseByKeys("cmbNYX", 1);
    return unit;
  }
  // Focus and keys of the application need an active window.
  void Activate() {
    window_->activateWindow();
    ASSERT_TRUE(QTest::qWaitForWindowActive(window_.get()));
  }
  void RunToTheEnd() {
    ASSERT_TRUE(world_.time.AdvanceUntil([&] { return !Text("lblProgress").empty(); }, 20000));
  }
  // Presses the button of a command and lets the command end.
  void Run(const char* button) {
    Find<QLabel>("lblProgress").clear();
    Press(button);
    RunToTheEnd();
  }
  void ShowSummary() {
    Press("cmdShowSummary");
    world_.time.Advance(20);
  }

  SimulatedWorld world_;
  SimulatedControlPanel panel_{world_};
  HwSerial link_{*world_.device, world_.time, world_.time, world_.log};
  const ProgramInfo info_{
      {3, 2, 1}, QStringLiteral("/log/HUtest.txt"), QStringLiteral("/config/registry.reg")};
  std::unique_ptr<frmNewServoConfig> window_ =
      std::make_unique<frmNewServoConfig>(link_, world_.time, world_.boxes, panel_.control_panel, info_);
};

}  // namespace tendril::test
