// Typed numbers in the real window: what cannot be taken stays as it is typed, is explained, and is never stored.
#include <QClipboard>
#include <QShortcut>

#include "ui/calm_spin_box.h"
#include "window_fixture.h"

namespace tendril::test {
namespace {

using testing::HasSubstr;
using testing::StartsWith;

constexpr std::array kSpins{"spnActPulseRange", "spnVirtPulseRange", "spnNeutralTrim",
                            "spnLeftVirtStop",  "spnRightVirtStop",  "spnDefaultPos"};

class Typing : public Window {
 protected:
  std::string Shown(const char* spin) { return Spin(spin).text().toStdString(); }
  std::string Hint() { return Visible("lblTyped") ? Text("lblTyped") : ""; }
  bool Marked(const char* spin) { return Spin(spin).findChild<QLineEdit*>()->font().bold(); }
  void Paste(const char* spin, const char* text) {
    QGuiApplication::clipboard()->setText(QString::fromUtf8(text));
    Spin(spin).setFocus();
    Spin(spin).selectAll();
    Spin(spin).findChild<QLineEdit*>()->paste();
  }
};

TEST_F(Typing, WhatCannotBeTaken_StaysIsExplainedAndIsNotStored) {
  window_->resize(1280, 800);
  Click("ServoSimulator2_0");
  for (int step = 0; step < 5; ++step) QTest::qWait(0);  // from layout to layout
  const ChannelTable before = window_->WorkingConfiguration();
  const QPoint scale = PlaceOf("PulseScale");
  for (const char* spin : kSpins) {
    const std::string value = Shown(spin);
    for (const char* typed : {"2400", "abc", "+-5", "99999999999999999999", "-99999999999999999999", "1.5",
                              "12\n34", "1,5", "'; DROP TABLE", "٣٤x"}) {
      Paste(spin, typed);
      EXPECT_EQ(Shown(spin), QString::fromUtf8(typed).simplified().toStdString() + " µs");
      EXPECT_THAT(Hint(), testing::AllOf(StartsWith("⚠ "), HasSubstr(std::to_string(Spin(spin).maximum()))))
          << typed;
      EXPECT_TRUE(Marked(spin));
      QTest::qWait(0);
      EXPECT_EQ(PlaceOf("PulseScale"), scale) << "the editor jumps";
      Key(Qt::Key_Return);
      EXPECT_EQ(Shown(spin), value) << typed;
      EXPECT_FALSE(Marked(spin)) << typed;
      EXPECT_EQ(Hint(), "");
      EXPECT_THAT(Text("lblStatus"),
                  HasSubstr(" was not taken as " + Spin(spin).accessibleName().toStdString()));
    }
    Spin(spin).findChild<QLineEdit*>()->clear();
    Key(Qt::Key_Return);
    EXPECT_THAT(Text("lblStatus"), StartsWith("Nothing was typed"));
  }
  EXPECT_TRUE(window_->WorkingConfiguration() == before);

  TypeOver("spnActPulseRange", "2400");
  EXPECT_EQ(Hint(), "⚠ 0 to 1000. This is half the width: for 600 to 2400 type 900");
  EXPECT_EQ(Text("lblActPulseRight"), "2400") << "of the old value";
  Key(Qt::Key_Up);
  EXPECT_EQ(Text("lblStatus"), "2400 was not taken as Actual Pulse Range: 0 to 1000. It is 900 again.");
  EXPECT_EQ(Shown("spnActPulseRange"), "900 µs") << "a step only puts the value back";
  // What Ctrl+C copies from another number can be pasted.
  Paste("spnDefaultPos", "-120 µs");
  Key(Qt::Key_Return);
  EXPECT_EQ(Record(0).DefaultPosition, 1380);
}

TEST_F(Typing, Escape_PutsTheValueBackAtOnceAndIsTheWindowsOtherwise) {
  Click("ServoSimulator2_0");
  int of_the_window = 0;
  const QShortcut escape(QKeySequence(Qt::Key_Escape), window_.get(), [&] { ++of_the_window; });
  const QShortcut undo(QKeySequence::Undo, window_.get(), [&] { ++of_the_window; });
  for (const char* typed : {"2400", "100"}) {
    TypeOver("spnDefaultPos", typed);
    Key(Qt::Key_Escape);
    EXPECT_EQ(Shown("spnDefaultPos"), "0 µs") << typed;
    TypeOver("spnDefaultPos", typed);
    QTest::keyClick(&Spin("spnDefaultPos"), Qt::Key_Z, Qt::ControlModifier);
    EXPECT_EQ(Shown("spnDefaultPos"), "0 µs") << typed;
    EXPECT_EQ(Hint(), "");
  }
  EXPECT_EQ(of_the_window, 0);
  Key(Qt::Key_Escape);
  QTest::keyClick(&Spin("spnDefaultPos"), Qt::Key_Z, Qt::ControlModifier);
  EXPECT_EQ(of_the_window, 2);
  EXPECT_EQ(Record(0).DefaultPosition, 1500);

  // What was said of a number goes with its next edit.
  TypeOver("spnDefaultPos", "2400");
  Key(Qt::Key_Return);
  EXPECT_THAT(Text("lblStatus"), HasSubstr("It is 0 again."));
  Key(Qt::Key_Up);
  EXPECT_EQ(Text("lblStatus"), "");
}

TEST_F(Typing, CommandsAndViews_LeaveTheField) {
  const auto& unit = ConnectUnit();
  Click("ServoSimulator2_0");
  const std::string note = "2400 was not taken as Actual Pulse Range: 0 to 1000. It is 900 again.";
  const auto type = [this] { TypeOver("spnActPulseRange", "2400"); };
  type();
  Click("ServoSimulator2_1");
  EXPECT_EQ(Text("lblStatus"), "Channel 2 selected. " + note);
  type();
  ShowSummary();
  EXPECT_EQ(Text("lblStatus"), "Summary of all eight channels. " + note);
  Press("cmdShowConfig");
  EXPECT_EQ(Text("lblStatus"), "Simulator");

  // By its key, and by the mouse, which takes the focus away first.
  for (const bool mouse : {false, true}) {
    type();
    if (mouse) Find("Command3_0").setFocus();
    Run("Command3_0");
    EXPECT_THAT(
        Text("lblStatus"),
        HasSubstr("SUCCESS: Send Complete! Ports 1 to 8 are written. Sent without the 2400 that was typed."));
    EXPECT_EQ(unit.PortOptions(2)[2], 240);
    Find<QLabel>("lblProgress").clear();
  }
  type();
  ChooseByKeys("cmbPresets", 2);
  EXPECT_EQ(Text("lblStatus"), "Preset Wide Range: all channels changed") << "it is not 900 again";
  ChooseByKeys("cmbPresets", 1);
  type();
  Key(Qt::Key_Tab);
  TypeOver("spnActPulseRange", "890");
  Run("Command3_0");
  EXPECT_THAT(Text("lblStatus"), testing::Not(HasSubstr("typed")));
  EXPECT_EQ(unit.PortOptions(2)[2], 239);
}

TEST_F(Typing, NumberEntry_DropsItAfterItsTimeAndOnEscape) {
  ShowSummary();
  const ChannelTable before = window_->WorkingConfiguration();
  Click("txtSumActualRange_3");
  QTest::keyClick(&Spin("spnSumValue_0"), Qt::Key_Down);
  TypeOver("spnSumValue_0", "2400");
  EXPECT_EQ(Text("lblSumTyped"), "⚠ 0 to 1000. This is half the width: for 600 to 2400 type 900");
  world_.time.Advance(3500);
  EXPECT_FALSE(Visible("fraNumberEntry"));
  EXPECT_EQ(Text("lblStatus"), "2400 was not taken as Channel 4 Actual Range: 0 to 1000. It is 890 again.");
  EXPECT_EQ(Record(3).ActualRange[0], 610);
  for (const char* typed : {"2400", "-300"}) {
    Click("txtSumStopRange_2");
    TypeOver("spnSumValue_0", typed);
    Key(Qt::Key_Escape);
    EXPECT_FALSE(Visible("fraNumberEntry"));
    EXPECT_EQ(Record(2).VirtualStops, before.At(2).VirtualStops);
    EXPECT_EQ(window_->focusWidget(), &Find("txtSumStopRange_2"));
  }
}

TEST_F(Typing, MinimisedWindow_KeepsWhatIsTyped) {
  TypeOver("spnActPulseRange", "2400");
  window_->showMinimized();
  window_->showNormal();
  EXPECT_EQ(Shown("spnActPulseRange"), "2400 µs");
}

// Assistive technology acts without the focus, and on disabled controls.
TEST_F(Typing, AssistiveTechnology_NeitherTakesANumberElsewhereNorChangesWhatIsSent) {
  ShowSummary();
  Click("txtSumActualRange_1");
  TypeOver("spnSumValue_0", "700");
  Accessible("txtSumActualRange_2").actionInterface()->doAction(QAccessibleActionInterface::pressAction());
  EXPECT_EQ(Record(1).ActualRange[0], 800) << "as it was left";
  EXPECT_EQ(Shown("spnSumValue_0"), "900 µs") << "of channel 3";
  Press("cmdShowConfig");

  ConnectUnit();
  Click("ServoSimulator2_2");
  Press("Command3_0");
  Accessible("spnActPulseRange").valueInterface()->setCurrentValue(700);
  EXPECT_EQ(Record(2).ActualRange[0], 600);
  EXPECT_EQ(Shown("spnActPulseRange"), "900 µs");
}

TEST_F(Typing, HeldKey_RepeatsItsFirstChange) {
  Click("ServoSimulator2_0");
  auto& spin = Find<CalmSpinBox>("spnNeutralTrim");
  std::string repeats;
  QObject::connect(&spin, &QSpinBox::valueChanged, [&] { repeats += spin.Repeats() ? "r" : "1"; });
  const auto key = [&](QEvent::Type type, bool again) {
    QKeyEvent event(type, Qt::Key_Up, Qt::NoModifier, QString(), again);
    QApplication::sendEvent(&spin, &event);
  };
  for (int press = 0; press < 2; ++press) {
    key(QEvent::KeyPress, false);
    for (int again = 0; again < 2; ++again) key(QEvent::KeyPress, true);
    key(QEvent::KeyRelease, false);
  }
  spin.stepUp();
  EXPECT_EQ(repeats, "1rrr1rrr1") << "Qt steps twice at the first repetition";
}

}  // namespace
}  // namespace tendril::test
