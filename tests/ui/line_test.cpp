// The pane of the line in the real window.
#include <QDockWidget>
#include <QScrollBar>
#include <QTableView>

#include "trace/line_trace.h"
#include "window_fixture.h"

namespace tendril::test {
namespace {

using testing::AllOf;
using testing::ContainsRegex;
using testing::HasSubstr;
using testing::StartsWith;

class Line : public Window {
 protected:
  Line() { ConnectUnit(); }

  void Get() {
    Find<QLabel>("lblProgress").clear();
    Keys("Ctrl+G");
    RunToTheEnd();
    world_.time.Advance(100);
  }
  // The program says this much, each time to another unit than before.
  void Say(int packets) {
    for (int i = 0; i < packets; ++i) link_.SendUnlockCmd(static_cast<std::uint8_t>(++said_));
    world_.time.Advance(100);
  }
  QTableView& Table() { return Find<QTableView>("tblLine"); }
  int Rows() { return Table().model()->rowCount(); }
  std::string Meaning(int row) { return Table().model()->index(row, 3).data().toString().toStdString(); }
  // Of the first and of the last line in view.
  std::string First() { return Meaning(Table().rowAt(0)); }
  std::string Last() { return Meaning(Table().rowAt(Table().viewport()->height() - 2)); }

  int said_ = 0;
};

TEST_F(Line, Pane_FollowsTheLineUntilItIsScrolledBack) {
  Get();
  Find("spnDefaultPos").setFocus();
  Keys("F12");
  EXPECT_EQ(QApplication::focusWidget(), &Table());
  EXPECT_EQ(Text("lblVerdict"), "Unit 01 answers.");
  EXPECT_EQ(Last(), "2 zero bytes");
  Key(Qt::Key_Home);
  EXPECT_EQ(First(), "Comm 1 at 19200 bit/s is open");
  Say(20);
  EXPECT_EQ(First(), "Comm 1 at 19200 bit/s is open");
  Key(Qt::Key_End);
  Say(static_cast<int>(LineTrace::kMaxEntries));
  EXPECT_EQ(Rows(), LineTrace::kMaxEntries);
  EXPECT_THAT(Last(), HasSubstr("unit " + QString::number(said_ % 256, 16).toUpper().toStdString()));

  // Lines drop out at the front of a full trace.
  Table().selectRow(20);  // it drops out
  Table().verticalScrollBar()->setValue(5000);
  const std::string first = First();
  Say(100);
  EXPECT_EQ(First(), first);
  EXPECT_FALSE(Checked("chkFollowLine") || Table().currentIndex().isValid());
  window_->resize(window_->width(), window_->height() - 60);
  Press("chkFollowLine");
  Say(1);
  EXPECT_THAT(Last(), HasSubstr("unit " + QString::number(said_ % 256, 16).toUpper().toStdString()));

  Keys("F12");
  EXPECT_EQ(QApplication::focusWidget(), &Find("spnDefaultPos"));
  const int timers = world_.time.RunningTimers();
  link_.SendUnlockCmd(1);
  EXPECT_EQ(world_.time.RunningTimers(), timers) << "hidden, it costs nothing";
}

TEST_F(Line, Verdict_ChangesNoHeight) {
  window_->resize(880, 700);
  Keys("F12");
  QCoreApplication::processEvents();
  const QPoint place = PlaceOf("LinePane");
  for (const int unit : {1, 2}) {
    ChooseByKeys("CmbUnitID_1", unit);
    Run("Command3_1");
    QCoreApplication::processEvents();
    EXPECT_EQ(PlaceOf("LinePane"), place) << Text("lblVerdict");
  }
}

TEST_F(Line, Pause_KeepsWhatIsShownAndClearForgetsIt) {
  Keys("F12");
  Get();
  const int rows = Rows();
  Press("chkPauseLine");
  Say(1);
  EXPECT_EQ(Find("LinePane").windowTitle().toStdString(), "Line: paused, 1 new line waits");
  Say(static_cast<int>(LineTrace::kMaxEntries));
  EXPECT_EQ(Find("LinePane").windowTitle().toStdString(), "Line: paused, 10001 new lines wait");
  EXPECT_EQ(Rows(), rows);
  EXPECT_EQ(Last(), "2 zero bytes");
  Press("cmdClearLine");
  Say(1);
  EXPECT_EQ(Rows(), 0);
  Press("chkPauseLine");
  EXPECT_EQ(Rows(), 1);
  EXPECT_EQ(Find("LinePane").windowTitle().toStdString(), "Line");
  EXPECT_THAT(Text("lblVerdict"), StartsWith("What is sent now gets no answer."));
}

TEST_F(Line, Copy_IsWhatSupportNeeds) {
  Get();
  Say(300);
  Keys("Ctrl+Shift+L");  // the pane has never been shown
  const std::string copied = Copied();
  EXPECT_THAT(copied, AllOf(StartsWith("Tendril Configuration Utility 3.2.1\nSystem: "),
                            HasSubstr("\nPort: Comm 1, Virtual serial line 1, open\nUnit: 01\n"
                                      "Verdict: What is sent now gets no answer. To check the line, read the "
                                      "unit.\nLines: the last 200 of "),
                            HasSubstr("\n\nTime\tFrom\tBytes\tMeaning\n"),
                            ContainsRegex("\n..:..:..\\..+\tprogram\t00 2C 8A 56 00\tunlock unit 2C\n$")));
  EXPECT_THAT(copied, ContainsRegex("\nCopied: ....-..-..T..:..:.....:..\n")) << "local, with the offset";
  EXPECT_EQ(std::count(copied.begin(), copied.end(), '\n'), 210);
  EXPECT_EQ(Text("lblStatus"), "Copied for support: version, system, port, verdict and the last 200 lines");

  Keys("F12");
  Key(Qt::Key_End);
  QTest::keyClick(&Table(), Qt::Key_Up, Qt::ShiftModifier);
  Keys("Ctrl+C");
  EXPECT_THAT(Copied(), ContainsRegex("^.+\tprogram\t.+\tunlock unit 2B\n.+\t.*unit 2C\n$"));
}

}  // namespace
}  // namespace tendril::test
