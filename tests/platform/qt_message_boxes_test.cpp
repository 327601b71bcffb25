#include "platform/qt/qt_message_boxes.h"

#include <gmock/gmock.h>

#include <QApplication>
#include <QClipboard>
#include <QLabel>
#include <QPushButton>
#include <QTest>
#include <QTimer>

namespace tendril::test {
namespace {

// Calls `act` with the box that opens next.
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
    QWidget* text = box.findChild<QLabel*>(QStringLiteral("qt_msgbox_label"));
    for (QWidget* focused : {box.focusWidget(), text}) {
      QGuiApplication::clipboard()->clear();
      QTest::keyClick(focused, Qt::Key_C, Qt::ControlModifier);
      EXPECT_EQ(QGuiApplication::clipboard()->text(),
                box.windowTitle() + QStringLiteral("\n\n") + box.text());
    }
    EXPECT_EQ(box.focusWidget(), box.button(QMessageBox::Ok));
    box.button(QMessageBox::Ok)->click();
  });
  boxes.Show({"<b>low</b> > high\r\n\r\n1500 \u00b5s", "Comm Error!", BoxIcon::kCritical});
  EXPECT_TRUE(seen);

  window.show();
  QDialog list(&window);
  list.show();
  list.activateWindow();
  ASSERT_TRUE(QTest::qWaitForWindowActive(&list));
  OnNextBox([&](QMessageBox& box) {
    EXPECT_EQ(box.parentWidget(), &list);
    box.accept();
  });
  boxes.Show({"text", ""});
}

TEST(QtMessageBoxes, Question_IsYesOnlyForYes) {
  auto window = std::make_unique<QWidget>();
  QtMessageBoxes boxes;
  boxes.SetParent(window.get());
  const auto answer_to = [&](const std::function<void(QMessageBox&)>& act) {
    OnNextBox(act);
    return boxes.AskYesNo({"Sure?", "Port In Use"});
  };
  EXPECT_TRUE(answer_to([](QMessageBox& box) { box.button(QMessageBox::Yes)->click(); }));
  EXPECT_FALSE(answer_to([](QMessageBox& box) { box.button(QMessageBox::No)->click(); }));
  EXPECT_FALSE(answer_to([](QMessageBox& box) { QTest::keyClick(&box, Qt::Key_Return); }));
  EXPECT_FALSE(answer_to([](QMessageBox& box) { QTest::keyClick(&box, Qt::Key_Escape); }));
  EXPECT_FALSE(answer_to([&](QMessageBox&) { window.reset(); }));
}

// The program ends while a question is open, and another box is to follow.
TEST(QtMessageBoxes, ProgramEndsWhileABoxIsOpen_AnswerIsNoAndNoBoxFollows) {
  for (const bool quit : {true, false}) {
    QtMessageBoxes boxes;
    bool yes = true;
    QTimer::singleShot(0, qApp, [&] {
      OnNextBox([&](QMessageBox&) { quit ? QCoreApplication::quit() : boxes.CloseAll(); });
      yes = boxes.AskYesNo({"Sure?", "Port In Use"});
      boxes.Show({"Never seen", ""});  // would stay open
      QCoreApplication::quit();
    });
    QApplication::exec();
    EXPECT_FALSE(yes) << quit;
  }
}

}  // namespace
}  // namespace tendril::test
