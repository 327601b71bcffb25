// Window: the real window in simulated time, with the clicks and keys of a person.
#pragma once

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <QComboBox>
#include <QLabel>
#include <QTest>
#include <memory>
#include <string>

#include "support/find_control.h"
#include "support/simulated_control_panel.h"
#include "ui/frm_new_servo_config.h"

namespace tendril::test {

// Nothing is chosen yet; the lines of Comm 1 to 4 have no units until a test attaches some.
class Window : public testing::Test {
 protected:
  Window() {
    window_->show();
    [[maybe_unused]] const bool exposed = QTest::qWaitForWindowExposed(window_.get());
    world_.time.Advance(10);  // the comm listener client has connected and identified itself
    QTest::qWait(0);          // what is not seen at first is made after the first paint
  }

  template <typename Widget = QWidget>
  Widget& Find(const char* name) {
    return FindControl<Widget>(*window_, name);
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
  SimulatedControlPanel panel_{world_};
  HwSerial link_{*world_.device, world_.time, world_.time, world_.log};
  std::unique_ptr<frmNewServoConfig> window_ = std::make_unique<frmNewServoConfig>(
      link_, world_.time, world_.boxes, panel_.control_panel, Version{3, 2, 1});
};

}  // namespace tendril::test
