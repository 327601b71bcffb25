// The comm port in the window: its list, and what the window says of it.
#include <gmock/gmock.h>

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

TEST_F(Ports, OpenedList_ShowsNewPortsAndTheirDevices) {
  ChooseByKeys("cmbNYX", 2);
  world_.bench.AddPort(9);
  auto& list = Find<QComboBox>("cmbNYX");
  list.showPopup();
  EXPECT_EQ(list.count(), 6);
  EXPECT_EQ(list.currentText().toStdString(), "Comm 2");
  EXPECT_EQ(list.itemData(5, Qt::ToolTipRole).toString().toStdString(), "Virtual serial line 9");
  EXPECT_EQ(link_.CommPort(), 2);
  list.hidePopup();
  ChooseByKeys("cmbNYX", 5);
  EXPECT_EQ(link_.CommPort(), 9);
}

TEST_F(Ports, Keys_OpenTheListsAndOnlyEnterThereChooses) {
  for (const char* name : {"cmbNYX", "cmbPresets"}) {
    auto& list = Find<QComboBox>(name);
    const int before = list.currentIndex();
    for (const Qt::Key key : {Qt::Key_Down, Qt::Key_Up, Qt::Key_PageDown, Qt::Key_End, Qt::Key_C}) {
      QTest::keyClick(&list, key);
      EXPECT_TRUE(list.view()->isVisible()) << name << key;
      for (const Qt::Key walk : {Qt::Key_Up, Qt::Key_Escape}) QTest::keyClick(list.view(), walk);
      EXPECT_EQ(list.currentIndex(), before) << name << key;
    }
  }
  EXPECT_FALSE(link_.PortOpen());
  ChooseByKeys("cmbPresets", 2);
  const ChannelConfig preset = Record(0);
  ChooseByKeys("cmbPresets", 1);
  EXPECT_NE(Record(0), preset);
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

  world_.bench.Unplug(2);
  world_.time.Advance(2);
  EXPECT_EQ(Text("lblPort"), "Comm 2 is not open: it was unplugged");
  list.showPopup();
  world_.bench.Unplug(1);
  world_.time.Advance(1000);
  EXPECT_EQ(list.count(), 6) << "not while it is open";
  list.hidePopup();
  world_.bench.Unplug(9);
  world_.time.Advance(1000);
  EXPECT_EQ(list.count(), 4);
  EXPECT_EQ(list.currentText().toStdString(), "Comm 2");
  world_.bench.Replug(2);
  world_.time.Advance(999);
  EXPECT_EQ(Text("lblPort"), "Comm 2 is not open: it was unplugged");
  world_.time.Advance(1);
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

TEST_F(Ports, PortThatDoesNotOpen_StaysNamedWithTheReason) {
  panel_.processes.running.clear();
  world_.bench.SetHeldByAnother(3, true, {"picocom", 812});
  world_.bench.SetAllowed(4, false);
  std::string behind_the_box;
  world_.boxes.while_open = [&] { behind_the_box = Text("lblPort"); };
  for (const auto& [line, sentence] : {std::pair(3, "Comm 3 is not open: picocom (process 812) has it"),
                                       std::pair(4, "Comm 4 is not open: you are not allowed to use it")}) {
    ChooseByKeys("cmbNYX", line);
    EXPECT_EQ(behind_the_box, sentence);
    EXPECT_EQ(Text("lblPort"), sentence);
  }
  // A command opens the port by itself.
  world_.bench.SetAllowed(4, true);
  Click("Command3_0");
  EXPECT_EQ(Text("lblPort"), "Comm 4 open: Virtual serial line 4");
}

TEST_F(Ports, PortOfTheControlPanel_StaysInSight) {
  panel_.Take(3);
  const auto ask = [this](PanelBehaviour behaviour) {
    panel_.panel.SetBehaviour(behaviour, 1);
    ChooseByKeys("cmbNYX", 3);
    const std::string before = Text("lblBorrowed");
    world_.time.Advance(2000);
    return before + "|" + Text("lblBorrowed") + "|" + Text("lblPort");
  };
  EXPECT_EQ(ask(PanelBehaviour::kProper), "||Comm 3 is not open: the Control Panel has it");
  world_.boxes.answer_yes = true;
  const std::string asked = "The Control Panel is asked for Comm 3 and has not answered yet.|";
  EXPECT_EQ(ask(PanelBehaviour::kRefuse),
            asked +
                "The Control Panel refuses to give up Comm 3: shows go on using it.|Comm 3 is not open: the "
                "Control Panel keeps it");
  EXPECT_EQ(ask(PanelBehaviour::kSilent).substr(0, asked.size() + 34),
            asked + "The Control Panel was asked for Co");
  panel_.Take(3);
  const std::string taken =
      "Comm 3 is taken from the Control Panel: shows cannot use it. It goes back when this window is closed "
      "or "
      "another port is asked for.|";
  EXPECT_EQ(ask(PanelBehaviour::kProper), asked + taken + "Comm 3 is not open: given up, Enter opens it");
  Find("cmbNYX").setFocus();
  Key(Qt::Key_Return);
  EXPECT_TRUE(link_.PortOpen());
  ChooseByKeys("cmbNYX", 1);
  EXPECT_EQ(Text("lblBorrowed") + "|" + Text("lblPort"), taken + "Comm 1 open: Virtual serial line 1");
}

}  // namespace
}  // namespace tendril::test
