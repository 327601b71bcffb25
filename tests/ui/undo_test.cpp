// Undo and redo, the origin of the configuration, and the way back after a send.
#include <QComboBox>
#include <functional>
#include <vector>

#include "window_fixture.h"

namespace tendril::test {
namespace {

using testing::AllOf;
using testing::EndsWith;
using testing::HasSubstr;
using testing::Not;
using testing::StartsWith;

class Undoing : public Window {
 protected:
  ChannelTable Records() { return window_->WorkingConfiguration(); }
  void Undo() { Keys("Ctrl+Z"); }
  void Redo() { Keys("Ctrl+Shift+Z"); }
  // The item of the menu that begins with `text`.
  QAction& Item(const char* text) {
    for (QAction* action : window_->findChildren<QAction*>()) {
      if (action->text().remove(QLatin1Char('&')).startsWith(QString::fromLatin1(text))) return *action;
    }
    throw std::logic_error(text);
  }
  void ArrowUp(const char* spin) { QTest::keyClick(&Spin(spin), Qt::Key_Up); }
};

TEST_F(Undoing, TakesBackWhateverChangedARecord) {
  auto& unit = ConnectUnit();
  unit.SetPortOptions(2, {1, 70, 230, 90, 190, 95, 180, 130, 140});
  int crossed = 0;
  world_.bench.Line(1).SetTap([&](const LineByte&) { ++crossed; });
  Click("ServoSimulator2_0");
  struct Act {
    const char* what;
    std::function<void()> act;
  };
  const std::vector<Act> acts{
      {"an edit", [&] { ArrowUp("spnNeutralTrim"); }},
      {"leaving a channel, which stores what the edit moved", [&] { Click("ServoSimulator2_3"); }},
      {"an edit of two channels",
       [&] {
         Press("chkUpdate_5");
         ArrowUp("spnDefaultPos");
       }},
      {"ALL", [&] { Press("chkUpdate_8"); }},
      {"a kind", [&] { Press("optChannelType_2"); }},
      {"an option", [&] { Press("optLostComm_0"); }},
      {"a preset", [&] { ChooseByKeys("cmbPresets", 2); }},
      {"a get", [&] { Run("Command3_1"); }},
      {"an entry of the summary",
       [&] {
         ShowSummary();
         Click("txtSumActualRange_1");
         ArrowUp("spnSumValue_0");
       }},
      {"an option of the summary", [&] { Press("optSumPUNeutral_2"); }}};
  std::vector<ChannelTable> records{Records()};
  for (const Act& act : acts) {
    act.act();
    ASSERT_FALSE(Records() == records.back()) << act.what;
    records.push_back(Records());
  }
  crossed = 0;
  for (std::size_t i = acts.size(); i-- > 0;) {
    Undo();
    EXPECT_TRUE(Records() == records[i]) << acts[i].what;
  }
  EXPECT_FALSE(Item("Undo").isEnabled());
  for (std::size_t i = 0; i < acts.size(); ++i) {
    Redo();
    EXPECT_TRUE(Records() == records[i + 1]) << acts[i].what;
  }
  world_.time.Advance(1000);
  EXPECT_EQ(crossed, 0) << "something is sent";
}

TEST_F(Undoing, ShowsWhatItBrought) {
  Click("ServoSimulator2_1");
  ArrowUp("spnVirtPulseRange");
  ChooseByKeys("cmbPresets", 0);
  EXPECT_EQ(Text("lblStatus"), "Preset Narrow Range: all channels changed");
  EXPECT_TRUE(Visible("cmdUndo"));
  Click("ServoSimulator2_4");
  Press("cmdUndo");
  EXPECT_EQ(Find<QComboBox>("cmbPresets").currentIndex(), 1);
  EXPECT_EQ(Text("lblVirtPulseRange", "lblStatus"), "510] Undone: Preset Narrow Range (all channels)");
  EXPECT_TRUE(Checked("chkUpdate_1") && !Checked("chkUpdate_4")) << "the edited channel is back";
  EXPECT_EQ(Arcs("ServoSimulator2_1"), "-90 90 -51 51 -50 50 ");
  EXPECT_EQ(Text("lblOrigin"), "Preset Medium Range (default); channel 2 changed since");
  ArrowUp("spnDefaultPos");
  EXPECT_EQ(Text("lblStatus"), "") << "it was said of the change before";
  Undo();

  // In the summary the rows are shown as they were, not within their bounds.
  ShowSummary();
  ShowSummary();
  Undo();
  EXPECT_EQ(Text("txtSumVirtualRange_1"), "1000-2000");
  Redo();
  EXPECT_EQ(Text("txtSumVirtualRange_1", "lblStatus"),
            "990-2010 Done again: Virtual Pulse Range (channel 2)");
}

TEST_F(Undoing, HeldArrowIsOneStep) {
  Click("ServoSimulator2_1");
  ArrowUp("spnDefaultPos");
  for (const bool repeated : {false, true, true, true}) {
    QKeyEvent press(QEvent::KeyPress, Qt::Key_Up, Qt::NoModifier, {}, repeated);
    QApplication::sendEvent(&Spin("spnDefaultPos"), &press);
  }
  const Microseconds held = Record(1).DefaultPosition;
  EXPECT_GE(held, 1550);
  Undo();
  EXPECT_EQ(Record(1).DefaultPosition, 1510);
  Redo();
  EXPECT_EQ(Record(1).DefaultPosition, held);
}

TEST_F(Undoing, HeldArrowThatStartsWithoutAChange_DoesNotGoOnWithTheStepBefore) {
  Click("ServoSimulator2_1");
  for (const char* range : {"490", "900"}) {
    TypeOver("spnActPulseRange", range);
    Key(Qt::Key_Return);
  }
  Spin("spnVirtPulseRange").setFocus();  // 490; the record still holds 500
  for (const bool repeated : {false, true, true}) {
    QKeyEvent press(QEvent::KeyPress, Qt::Key_Up, Qt::NoModifier, {}, repeated);
    QApplication::sendEvent(&Spin("spnVirtPulseRange"), &press);
  }
  ASSERT_GT(Record(1).VirtualRange[1], 2000);
  Undo();
  EXPECT_EQ(Record(1).VirtualRange, (PulsePair{1000, 2000}));
  EXPECT_EQ(Record(1).ActualRange, (PulsePair{600, 2400}));
}

TEST_F(Undoing, ItsButtonGivesTheFocusToTheWindow) {
  ChooseByKeys("cmbPresets", 0);
  Find("cmdUndo").setFocus();
  Key(Qt::Key_Space);
  EXPECT_EQ(window_->focusWidget(), window_.get());
}

TEST_F(Undoing, StepsOfTheSummaryLeaveNothingToStore) {
  Click("ServoSimulator2_1");
  ShowSummary();
  Click("txtSumActualRange_1");
  for (int i = 0; i < 2; ++i) ArrowUp("spnSumValue_0");
  Press("cmdShowConfig");
  Undo();
  EXPECT_EQ(Text("lblActPulseLeft"), "590");
  Click("ServoSimulator2_2");
  EXPECT_EQ(Record(1).ActualRange, (PulsePair{590, 2410}));
}

TEST_F(Undoing, IsOffWhileSomethingMovesOrACommandRuns) {
  ConnectUnit();
  const auto with_shift = Qt::ControlModifier | Qt::ShiftModifier;
  QTest::keyClick(window_.get(), Qt::Key_C, with_shift);
  Click("ServoSimulator2_1");
  ArrowUp("spnDefaultPos");
  const ChannelTable edited = Records();
  for (const auto& [button, end] : {std::pair("cmdTest_0", "cmdTest_0"),
                                    {"chkSendSlideCommands", "chkSendSlideCommands"},
                                    {"Command3_0", ""}}) {
    Press(button);
    Undo();
    QTest::keyClick(window_.get(), Qt::Key_V, with_shift);  // paste
    EXPECT_TRUE(Records() == edited) << button;
    if (*end != '\0') {
      Press(end);
    } else {
      RunToTheEnd();
    }
  }
  Undo();
  EXPECT_FALSE(Records() == edited);
}

TEST_F(Undoing, NamesTheOriginAndTheWayBack) {
  auto& unit = ConnectUnit();
  EXPECT_EQ(Text("lblOrigin"), "Preset Medium Range (default)");
  EXPECT_FALSE(Item("Restore What the Unit Held").isEnabled());
  Click("Command3_0");
  Press("cmdCancel");
  RunToTheEnd();
  EXPECT_EQ(Text("lblOrigin"), "Preset Medium Range (default)");
  EXPECT_THAT(Text("lblStatus"), EndsWith("are not. What it held before is not known: it was not read."));
  Run("Command3_0");
  EXPECT_THAT(Text("lblOrigin"), StartsWith("Sent to 01 at "));
  EXPECT_THAT(Text("lblStatus"), EndsWith("Ports 1 to 8 are written.")) << "it holds what was sent";

  unit.SetPortOptions(2, {1, 70, 230, 90, 190, 95, 180, 130, 140});
  Run("Command3_1");
  EXPECT_THAT(Text("lblOrigin"), StartsWith("Read from 01 at "));
  const ChannelTable read = Records();
  ChooseByKeys("cmbPresets", 0);
  const ChannelTable preset = Records();
  Run("Command3_0");
  Undo();  // of the preset, not of the send
  EXPECT_THAT(Text("lblOrigin"), AllOf(StartsWith("Sent to 01 at "), EndsWith("all channels changed since")));
  Redo();
  EXPECT_THAT(Text("lblOrigin"), Not(HasSubstr("changed since")));
  Run("cmdCompare_0");  // reads what was sent: the way back stays
  Run("Command3_0");
  Run("Command3_1");  // so does a get
  EXPECT_TRUE(Records() == preset);
  Item("Restore What Unit 01 Held at ").trigger();
  EXPECT_TRUE(Records() == read);
  EXPECT_THAT(Text("lblOrigin"), StartsWith("Read from 01 at "));
  Undo();
  EXPECT_TRUE(Records() == preset);
  ChooseByKeys("cmbNYX", 2);
  EXPECT_FALSE(Item("Restore What the Unit Held").isEnabled()) << "another unit 01";
  ChooseByKeys("cmbNYX", 1);
  EXPECT_TRUE(Item("Restore What Unit 01 Held at ").isEnabled());
}

}  // namespace
}  // namespace tendril::test
