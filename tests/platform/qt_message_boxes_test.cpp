#include "platform/qt/qt_message_boxes.h"

#include <gmock/gmock.h>

#include <QApplication>
#include <QPushButton>
#include <QTest>
#include <QTimer>

#include "platform/wait_for.h"

namespace tendril::test {
namespace {

// Does `act` to the box that opens next, once it is up.
void OnNextBox(const std::function<void(QMessageBox&)>& act) {
  QTimer::singleShot(0, qApp, [act] {
    auto* box = qobject_cast<QMessageBox*>(QApplication::activeModalWidget());
    ASSERT_NE(box, nullptr);
    EXPECT_EQ(box->objectName(), QStringLiteral("messageBox"));
    act(*box);
  });
}

TEST(QtMessageBoxes, Message_IsShownAsPlainTextWithTitleAndIcon) {
  const struct {
    BoxIcon icon;
    QMessageBox::Icon shown;
  } rows[] = {{BoxIcon::kNone, QMessageBox::NoIcon},
              {BoxIcon::kExclamation, QMessageBox::Warning},
              {BoxIcon::kCritical, QMessageBox::Critical}};
  QtMessageBoxes boxes;
  QWidget window;
  for (QWidget* parent : {static_cast<QWidget*>(nullptr), &window}) {
    boxes.SetParent(parent);
    for (const auto& row : rows) {
      int seen = 0;
      OnNextBox([&](QMessageBox& box) {
        ++seen;
        EXPECT_EQ(box.text(), QStringLiteral("<b>low</b> > high\n\n1500 \u00b5s"));
        EXPECT_EQ(box.textFormat(), Qt::PlainText);
        EXPECT_EQ(box.windowTitle(), QStringLiteral("Comm Error!"));
        EXPECT_EQ(box.icon(), row.shown);
        EXPECT_EQ(box.parentWidget(), parent);
        box.button(QMessageBox::Ok)->click();
      });
      boxes.Show({"<b>low</b> > high\r\n\r\n1500 \u00b5s", "Comm Error!", row.icon});
      EXPECT_EQ(seen, 1);
    }
  }
}

TEST(QtMessageBoxes, Question_IsYesOnlyForYes) {
  const struct {
    const char* how;
    std::function<void(QMessageBox&)> answer;
    bool yes;
  } rows[] = {
      {"Yes", [](QMessageBox& box) { box.button(QMessageBox::Yes)->click(); }, true},
      {"No", [](QMessageBox& box) { box.button(QMessageBox::No)->click(); }, false},
      {"Escape", [](QMessageBox& box) { QTest::keyClick(&box, Qt::Key_Escape); }, false},
      {"closed", [](QMessageBox& box) { box.close(); }, false},
  };
  QtMessageBoxes boxes;
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
  const struct {
    const char* how;
    std::function<void(QtMessageBoxes&)> end;
  } rows[] = {{"quit", [](QtMessageBoxes&) { QCoreApplication::quit(); }},
              {"exit", [](QtMessageBoxes&) { QCoreApplication::exit(); }},
              {"all closed", [](QtMessageBoxes& boxes) { boxes.CloseAll(); }}};
  for (const auto& row : rows) {
    QtMessageBoxes boxes;
    BoxCounter shown;
    bool yes = true;
    QTimer::singleShot(0, qApp, [&] {
      OnNextBox([&](QMessageBox&) { row.end(boxes); });
      yes = boxes.AskYesNo({"Sure?", "Port In Use"});
      boxes.Show({"Never seen", ""});
      yes = yes || boxes.AskYesNo({"Never seen", ""});
      QCoreApplication::quit();
    });
    QApplication::exec();
    EXPECT_EQ(shown.count, 1) << row.how;
    EXPECT_FALSE(yes) << row.how;
  }
}

TEST(QtMessageBoxes, WindowDestroyedUnderItsBox_AnswerIsNo) {
  QtMessageBoxes boxes;
  auto window = std::make_unique<QWidget>();
  boxes.SetParent(window.get());
  OnNextBox([&](QMessageBox&) { window.reset(); });
  EXPECT_FALSE(boxes.AskYesNo({"Sure?", "Port In Use"}));
}

}  // namespace
}  // namespace tendril::test
