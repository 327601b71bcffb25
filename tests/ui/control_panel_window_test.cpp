// The real window beside a Control Panel, on the offscreen platform, in simulated time.
#include <QAbstractItemView>
#include <string>
#include <vector>

#include "bench/faulty_units.h"
#include "window_fixture.h"

namespace tendril::test {
namespace {

using testing::ElementsAre;
using testing::IsEmpty;

class WindowAndControlPanel : public Window {
 protected:
  // Chooses in the opened list, where the line that is selected can be chosen again.
  void ChooseInOpenedList(int line) {
    auto& list = Find<QComboBox>("cmbNYX");
    list.showPopup();
    list.view()->setCurrentIndex(list.model()->index(line, 0));
    QTest::keyClick(list.view(), Qt::Key_Return);
  }
  // Has asked for Comm 3 and opened it.
  void TakeComm3() {
    panel_.Take(3);
    world_.boxes.answer_yes = true;
    ChooseInOpenedList(3);
    ASSERT_EQ(world_.boxes.Take().size(), 2u);
    ASSERT_FALSE(link_.PortOpen());
    world_.time.Advance(10);
    ChooseInOpenedList(3);
    ASSERT_TRUE(link_.PortOpen());
    ASSERT_THAT(world_.boxes.shown, IsEmpty());
  }
};

TEST_F(WindowAndControlPanel, PortThatItHolds_IsTakenAndGivenBackOnClosing) {
  const Bytes identification = panel_.panel.requests().front().payload;
  EXPECT_EQ(std::string(identification.begin(), identification.end()), "Tendril Utility");
  TakeComm3();
  world_.bench.Attach<MuteUnit>(3, std::uint8_t{0x01});
  Click("Command3_0");
  world_.time.Advance(150);

  panel_.panel.SetPortHandler([this](std::uint8_t, bool held) {
    EXPECT_FALSE(held && link_.PortOpen()) << "given back before it is closed";
  });
  EXPECT_FALSE(window_->close());
  QTest::keyClick(&Find("cmbNYX"), Qt::Key_Up);
  EXPECT_FALSE(link_.PortOpen());
  EXPECT_THAT(panel_.PortRequests(), ElementsAre("3:0", "3:1"));
  EXPECT_TRUE(panel_.panel.Holds(3));
  world_.time.Advance(99);
  EXPECT_TRUE(window_->isVisible());
  world_.time.Advance(1);
  EXPECT_FALSE(window_->isVisible());
  world_.time.Advance(60000);
  EXPECT_THAT(world_.boxes.shown, IsEmpty());
  EXPECT_EQ(panel_.PortRequests().size(), 2u);
}

TEST_F(WindowAndControlPanel, SecondCloseRequest_IsNotKeptWaiting) {
  TakeComm3();
  EXPECT_FALSE(window_->close());
  EXPECT_TRUE(window_->close());
  EXPECT_EQ(panel_.PortRequests().back(), "3:1");
}

TEST_F(WindowAndControlPanel, OpenedList_FindsNewPortsAndSaysWhichDeviceEachIs) {
  ChooseByKeys("cmbNYX", 2);
  world_.bench.AddPort(9);
  auto& list = Find<QComboBox>("cmbNYX");
  list.showPopup();
  EXPECT_EQ(list.count(), 6);
  EXPECT_EQ(list.currentText().toStdString(), "Comm 2");
  EXPECT_EQ(list.itemData(5, Qt::ToolTipRole).toString().toStdString(), "Virtual serial line 9");
  EXPECT_EQ(link_.CommPort(), 2);
  list.hidePopup();
  ChooseInOpenedList(5);
  EXPECT_EQ(link_.CommPort(), 9);
}

}  // namespace
}  // namespace tendril::test
