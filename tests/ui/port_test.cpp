// The comm port in the window: its list, and what the window says of it.
#include "bench/faulty_units.h"
#include "window_fixture.h"

namespace tendril::test {
namespace {

using testing::ElementsAre;
using testing::IsEmpty;

class Ports : public Window {
 protected:
  // Asks for Comm 3 and opens it.
  void TakeComm3() {
    panel_.Take(3);
    world_.boxes.answer_yes = true;
    ChooseByKeys("cmbNYX", 3);
    ASSERT_EQ(world_.boxes.Take().size(), 2u);
    ASSERT_FALSE(link_.PortOpen());
    world_.time.Advance(10);
    ChooseByKeys("cmbNYX", 3);
    ASSERT_TRUE(link_.PortOpen());
  }
};

TEST_F(Ports, PortThatItHolds_IsTakenAndGivenBackOnClosing) {
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
}

TEST_F(Ports, SecondCloseRequest_ClosesAtOnce) {
  TakeComm3();
  EXPECT_FALSE(window_->close());
  EXPECT_TRUE(window_->close());
  EXPECT_EQ(panel_.PortRequests().back(), "3:1");
}

TEST_F(Ports, Keys_OpenTheListsAndOnlyEnterThereChooses) {
  for (const char* name : {"cmbNYX", "cmbPresets"}) {
    auto& list = Find<QComboBox>(name);
    const int before = list.currentIndex();
    for (const Qt::Key key : {Qt::Key_Down, Qt::Key_PageUp, Qt::Key_End, Qt::Key_C}) {
      QTest::keyClick(&list, key);
      EXPECT_TRUE(list.view()->isVisible()) << name << key;
      for (const Qt::Key walk : {Qt::Key_Up, Qt::Key_Escape}) QTest::keyClick(list.view(), walk);
      EXPECT_EQ(list.currentIndex(), before) << name << key;
    }
  }
  EXPECT_FALSE(link_.PortOpen());
}

TEST_F(Ports, List_FollowsTheDevicesAndKeepsTheChosenLine) {
  auto& list = Find<QComboBox>("cmbNYX");
  ChooseByKeys("cmbNYX", 2);
  EXPECT_EQ(Text("lblPort"), "Comm 2 open: Virtual serial line 2");
  world_.bench.AddPort(9);
  Find("cmbPresets").setFocus();
  list.setFocus();
  QTest::qWait(0);
  EXPECT_EQ(list.count(), 6) << "read again with the focus";
  Press("cmdTest_0");
  world_.bench.Unplug(2);
  world_.time.Advance(2);
  EXPECT_EQ(Text("lblStatus"), "Servo test stopped: the port is closed, and the servo stays where it is");
  EXPECT_EQ(Text("lblPort"), "Comm 2 is not open: it was unplugged");
  list.showPopup();
  EXPECT_EQ(list.itemData(5, Qt::ToolTipRole).toString().toStdString(), "Virtual serial line 9");
  world_.bench.Unplug(1);
  world_.time.Advance(1000);
  EXPECT_EQ(list.count(), 6) << "not while it is open";
  list.hidePopup();
  world_.bench.Unplug(9);
  world_.time.Advance(1000);
  EXPECT_EQ(list.count(), 4);
  EXPECT_EQ(list.currentText().toStdString(), "Comm 2");
  EXPECT_EQ(Text("lblPort"), "Comm 2 is not open: it was unplugged");
  world_.bench.Replug(2);
  world_.time.Advance(1000);
  EXPECT_EQ(Text("lblPort"), "Comm 2 is back: Enter opens it");
  EXPECT_FALSE(link_.PortOpen());
  QTest::keyClick(&list, Qt::Key_Return);
  EXPECT_EQ(Text("lblPort"), "Comm 2 open: Virtual serial line 2");

  link_.SetPortOpen(false);
  for (const int port : {2, 3, 4}) world_.bench.Unplug(port);
  ChooseByKeys("cmbNYX", 0);
  world_.time.Advance(1000);
  EXPECT_EQ(list.count(), 1);
  for (const std::string& said : {Text("lblPort"), ToolTip("cmbNYX")})
    EXPECT_EQ(said, "No serial port found: plug in the adapter");
  EXPECT_THAT(world_.boxes.shown, IsEmpty());
}

TEST_F(Ports, PortThatDoesNotOpen_IsNamedWithTheReasonUntilACommandOpensIt) {
  panel_.processes.running.clear();
  world_.bench.SetHeldByAnother(3, true, {"picocom", 812});
  std::string behind_the_box;
  world_.boxes.while_open = [&] { behind_the_box = Text("lblPort"); };
  ChooseByKeys("cmbNYX", 3);
  EXPECT_EQ(behind_the_box, "Comm 3 is not open: picocom (process 812) has it");
  EXPECT_EQ(Text("lblPort"), behind_the_box);
  world_.bench.SetHeldByAnother(3, false);
  Click("Command3_0");
  EXPECT_EQ(Text("lblPort"), "Comm 3 open: Virtual serial line 3");
}

TEST_F(Ports, PortOfTheControlPanel_StaysInSight) {
  panel_.Take(3);
  const auto ask = [this](PanelBehaviour behaviour) {
    panel_.panel.SetBehaviour(behaviour, 1);
    ChooseByKeys("cmbNYX", 3);
    world_.time.Advance(2000);
    return Text("lblPort").substr(18);
  };
  EXPECT_EQ(ask(PanelBehaviour::kProper), ": the Control Panel has it");
  world_.boxes.answer_yes = true;
  EXPECT_EQ(ask(PanelBehaviour::kRefuse), ": the Control Panel keeps it");
  EXPECT_EQ(ask(PanelBehaviour::kSilent), ": the Control Panel is silent");
  panel_.Take(3);
  EXPECT_EQ(ask(PanelBehaviour::kProper), ": given up, Enter opens it");
  QTest::keyClick(&Find("cmbNYX"), Qt::Key_Return);
  EXPECT_TRUE(link_.PortOpen());
  ChooseByKeys("cmbNYX", 1);
  EXPECT_THAT(Text("lblBorrowed"), testing::StartsWith("Comm 3 is taken from the Control Panel"));
}

}  // namespace
}  // namespace tendril::test
