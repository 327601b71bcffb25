#include "platform/qt/qt_message_boxes.h"

#include <gmock/gmock.h>

#include <QApplication>
#include <QPushButton>
#include <QTest>
#include <QTimer>

namespace tendril::test {
namespace {

// Does `act` to the box that opens next, once it is up.
void OnNextBox(const std::function<void(QMessageBox&)>& act) {
  QTimer::singleShot(0, qApp, [act] {
    auto* box = qobject_cast<QMessageBox*>(QApplication::activeModalWidget());
    ASSERT_NE(box, nullptr);
    act(*box);
  });
}

TEST(QtMessageBoxes, Message_IsShownAsPlainTextOverItsWindow) {
  QtMessageBoxes boxes;
  QWidget window;
  boxes.SetParent(&window);
  bool seen = false;
  OnNextBox([&](QMessageBox& box) {
    seen = true;
    EXPECT_EQ(box.text(), QStringLiteral("<b>low</b> > high\n\n1500 \u00b5s"));
    EXPECT_EQ(box.textFormat(), Qt::PlainText);
    EXPECT_EQ(box.windowTitle(), QStringLiteral("Comm Error!"));
    EXPECT_EQ(box.icon(), QMessageBox::Critical);
    EXPECT_EQ(box.parentWidget(), &window);
    box.button(QMessageBox::Ok)->click();
  });
  boxes.Show({"<b>low</b> > high\r\n\r\n1500 \u00b5s", "Comm Error!", BoxIcon::kCritical});
  EXPECT_TRUE(seen);
}

TEST(QtMessageBoxes, Question_IsYesOnlyForYes) {
  auto window = std::make_unique<QWidget>();
  const struct {
    const char* how;
    std::function<void(QMessageBox&)> answer;
    bool yes;
  } rows[] = {
      {"Yes", [](QMessageBox& box) { box.button(QMessageBox::Yes)->click(); }, true},
      {"No", [](QMessageBox& box) { box.button(QMessageBox::No)->click(); }, false},
      {"Enter", [](QMessageBox& box) { QTest::keyClick(&box, Qt::Key_Return); }, false},
      {"Escape", [](QMessageBox& box) { QTest::keyClick(&box, Qt::Key_Escape); }, false},
      {"its window destroyed", [&](QMessageBox&) { window.reset(); }, false},
  };
  QtMessageBoxes boxes;
  boxes.SetParent(window.get());
  for (const auto& row : rows) {
    OnNextBox(row.answer);
    EXPECT_EQ(boxes.AskYesNo({"Sure?", "Port In Use"}), row.yes) << row.how;
  }
}

// Counts the boxes that come up.
class BoxCounter : public QObject {
 public:
  BoxCounter() { qApp->installEventFilter(this); }
  bool eventFilter(QObject* object, QEvent* event) override {
    if (event->type() == QEvent::Show && qobject_cast<QMessageBox*>(object) != nullptr) ++count;
    return false;
  }
  int count = 0;
};

// The program ends while a question is open, with another box to come.
TEST(QtMessageBoxes, ProgramEndsWhileABoxIsOpen_AnswerIsNoAndNoBoxFollows) {
  for (const bool quit : {true, false}) {
    QtMessageBoxes boxes;
    BoxCounter shown;
    bool yes = true;
    QTimer::singleShot(0, qApp, [&] {
      OnNextBox([&](QMessageBox&) { quit ? QCoreApplication::quit() : boxes.CloseAll(); });
      yes = boxes.AskYesNo({"Sure?", "Port In Use"});
      boxes.Show({"Never seen", ""});
      yes = yes || boxes.AskYesNo({"Never seen", ""});
      QCoreApplication::quit();
    });
    QApplication::exec();
    EXPECT_EQ(shown.count, 1) << quit;
    EXPECT_FALSE(yes) << quit;
  }
}

}  // namespace
}  // namespace tendril::test
