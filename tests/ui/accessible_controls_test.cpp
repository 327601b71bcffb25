// What assistive technology's actions do, compared with what the mouse does.
#include <QAbstractItemView>
#include <QAccessible>
#include <QSignalSpy>

#include "simulator/servo_simulator.h"
#include "window_fixture.h"

namespace tendril::test {
namespace {

// A window in a world of its own.
struct Desk {
  Desk() {
    window.show();
    [[maybe_unused]] const bool exposed = QTest::qWaitForWindowExposed(&window);
    world.time.Advance(2000);
    QTest::qWait(0);
  }
  template <typename Widget = QWidget>
  Widget& Find(const QString& name) {
    return FindControl<Widget>(window, name);
  }
  void Click(const char* button) { QTest::mouseClick(&Find(QString::fromUtf8(button)), Qt::LeftButton); }

  SimulatedWorld world;
  SimulatedControlPanel panel{world};
  HwSerial link{*world.device, world.time, world.time, world.log};
  frmNewServoConfig window{link, world.time, world.boxes, panel.control_panel, Version{1, 0, 0}};
};

// All that the user sees of the choices, and what has been done.
QStringList Seen(Desk& desk) {
  QStringList seen;
  for (const auto* button : desk.window.findChildren<QAbstractButton*>())
    seen += button->objectName() + (button->isChecked() ? QStringLiteral(" on ") : QStringLiteral(" off ")) +
            button->text() + (button->isVisible() ? QStringLiteral("!") : QString());
  for (const auto* box : desk.window.findChildren<QComboBox*>()) seen += box->currentText();
  for (const auto* servo : desk.window.findChildren<ServoSimulator*>())
    seen += QString::number(servo->dial().selected());
  if (desk.Find(QStringLiteral("fraNumberEntry")).isVisible())
    seen += desk.Find<QLabel>(QStringLiteral("lblDisplay")).text();
  for (const BoxMessage& box : desk.world.boxes.shown) seen += QString::fromStdString(box.text);
  return seen;
}

QAccessibleActionInterface& Actions(QAccessibleInterface* control) { return *control->actionInterface(); }

class AccessibleControls : public testing::Test {
 protected:
  // Acts on every control that can be used now, here by its first action and there by the mouse.
  void WalkControls() {
    for (QWidget* control : by_action_.window.findChildren<QWidget*>()) {
      const QString name = control->objectName();
      const bool usable = control->isVisible() && control->isEnabled();
      if (!usable || name.isEmpty() || name.startsWith(QStringLiteral("qt_"))) continue;
      SCOPED_TRACE(name.toStdString());
      // A known state, in which a click on what is chosen already can be seen too: it unticks channel 6.
      for (Desk* desk : {&by_action_, &by_mouse_}) {
        if (!desk->Find(QStringLiteral("chkUpdate_5")).isEnabled()) continue;
        desk->Click("ServoSimulator2_2");
        desk->Find<QAbstractButton>(QStringLiteral("chkUpdate_5")).click();
      }
      if (auto* box = qobject_cast<QComboBox*>(control)) {
        WalkLines(*box, by_mouse_.Find<QComboBox>(name));
      } else if (qobject_cast<QAbstractButton*>(control) != nullptr ||
                 name.startsWith(QStringLiteral("txtSum"))) {
        auto& actions = Actions(QAccessible::queryAccessibleInterface(control));
        const bool push_button = actions.actionNames().first() == actions.pressAction() &&
                                 qobject_cast<QPushButton*>(control) != nullptr;
        actions.doAction(actions.actionNames().first());
        if (push_button) QTest::qWait(150);  // it is seen to go down
        QTest::mouseClick(&by_mouse_.Find(name), Qt::LeftButton, {}, ClickPoint(*control));
        ++walked_;
      }
      for (Desk* desk : {&by_action_, &by_mouse_}) desk->world.time.Advance(30);
      EXPECT_EQ(Seen(by_action_), Seen(by_mouse_));
      EXPECT_EQ(by_action_.window.WorkingConfiguration(), by_mouse_.window.WorkingConfiguration());
    }
  }

  // Chooses the last line, and the same line again.
  void WalkLines(QComboBox& by_action, QComboBox& by_mouse) {
    const QSignalSpy here(&by_action, &QComboBox::activated);
    const QSignalSpy there(&by_mouse, &QComboBox::activated);
    for (int time = 0; time < 2; ++time) {
      auto* box = QAccessible::queryAccessibleInterface(&by_action);
      Actions(box).doAction(QAccessibleActionInterface::showMenuAction());
      auto* line = box->child(0)->child(box->child(0)->childCount() - 1);
      EXPECT_EQ(line->text(QAccessible::Name), by_action.itemText(by_action.count() - 1));
      EXPECT_EQ(box->child(0)->indexOfChild(line), by_action.count() - 1);
      EXPECT_TRUE(by_action.view()->isVisible());
      Actions(line).doAction(Actions(line).actionNames().first());
      EXPECT_FALSE(by_action.view()->isVisible());
      by_mouse.showPopup();
      by_mouse.view()->setCurrentIndex(by_mouse.model()->index(by_mouse.count() - 1, 0));
      QTest::keyClick(by_mouse.view(), Qt::Key_Return);
    }
    EXPECT_EQ(here.count(), 2);
    EXPECT_EQ(there.count(), 2);
    ++walked_;
  }

  // Within the box of a button that is wider than what can be clicked.
  static QPoint ClickPoint(const QWidget& control) { return {8, control.height() / 2}; }

  Desk by_action_, by_mouse_;
  int walked_ = 0;
};

TEST_F(AccessibleControls, Actions_DoWhatClicksDo) {
  WalkControls();
  for (Desk* desk : {&by_action_, &by_mouse_}) {
    desk->Find<QAbstractButton>(QStringLiteral("cmdShowSummary")).click();
    desk->world.time.Advance(20);
  }
  WalkControls();
  EXPECT_GT(walked_, 130);
}

}  // namespace
}  // namespace tendril::test
