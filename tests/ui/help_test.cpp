// What the help menu opens: the facts about the program, and the manual.
#include <QDesktopServices>
#include <QDir>
#include <QLineEdit>
#include <QPushButton>
#include <QTextBrowser>

#include "ui/about_dialog.h"
#include "ui/manual.h"
#include "window_fixture.h"

namespace tendril::test {
namespace {

using testing::HasSubstr;

TEST_F(Window, About_CopiesEveryFactThatItShows) {
  ShowAbout(*window_, info_);
  EXPECT_EQ(window_->windowIcon().availableSizes().size(), 6);
  auto& about = Find<QDialog>("AboutDialog");
  for (auto* button : about.findChildren<QPushButton*>())
    if (button->toolTip().startsWith(QStringLiteral("Copies"))) button->click();
  const std::string copied = Copied();
  EXPECT_THAT(copied, HasSubstr("Version: 3.2.1\nQt: " QT_VERSION_STR));
  EXPECT_THAT(copied, HasSubstr("/log/HUtest.txt\nRegistry: /config/registry.reg"));
  EXPECT_EQ(about.findChildren<QLineEdit*>().size(), 6);
  for (auto* fact : about.findChildren<QLineEdit*>()) {
    const QString name = QAccessible::queryAccessibleInterface(fact)->text(QAccessible::Name);
    EXPECT_THAT(copied, HasSubstr((name + QStringLiteral(": ") + fact->text() + u'\n').toStdString()));
    EXPECT_TRUE(fact->isReadOnly() && fact->focusPolicy() == Qt::StrongFocus);
  }
  QTest::keyClick(&about, Qt::Key_Escape);
  EXPECT_FALSE(about.isVisible());
  ShowAbout(*window_, info_);
  EXPECT_TRUE(about.isVisible()) << "the same dialog";
}

TEST_F(Window, Manual_OpensTheChapterThatFits) {
  QTextBrowser viewer;
  QDesktopServices::setUrlHandler(QStringLiteral("file"), &viewer, "setSource");
  const auto opened = [&] {
    Keys("Ctrl+F1");
    return viewer.source().fileName().section(u'.', 0, 0).toStdString();
  };
  EXPECT_EQ(opened(), "first-unit");
  EXPECT_THAT(Text("lblStatus"),
              HasSubstr(QDir::toNativeSeparators(viewer.source().toLocalFile()).toStdString()));
  ChooseByKeys("cmbNYX", 1);
  Run("Command3_1");
  EXPECT_EQ(opened(), "no-answer");
  Keys("Ctrl+PgUp");
  EXPECT_EQ(opened(), "first-unit") << "this unit was not asked; the focus is on the connection";
  Run("Command3_2");
  EXPECT_EQ(opened(), "no-answer") << "its ID was to be changed: every unit was asked";
  world_.bench.Attach<VirtualUnit>(1, std::uint8_t{0x02});
  Run("Command3_1");
  Keys("Ctrl+1");
  Spin("spnDefaultPos").setFocus();
  EXPECT_EQ(opened(), "numbers");
  Click("chkSendSlideCommands");
  EXPECT_EQ(opened(), "live-test");
  Click("chkSendSlideCommands");
  Find("Command3_0").setFocus();
  EXPECT_EQ(opened(), "configurations");
  QDesktopServices::unsetUrlHandler(QStringLiteral("file"));
}

TEST_F(Window, Manual_IsOpenedOrTheUserSeesWhereItIs) {
  QTextBrowser viewer;
  QDesktopServices::setUrlHandler(QStringLiteral("file"), &viewer, "setSource");
  for (int i = 0; i <= static_cast<int>(ManualChapter::kNoAnswer); ++i) {
    const QString sentence = OpenManual(ManualChapter(i), world_.boxes);
    EXPECT_THAT(sentence.toStdString(),
                HasSubstr(QDir::toNativeSeparators(viewer.source().toLocalFile()).toStdString()));
    EXPECT_GT(viewer.toPlainText().size(), 300) << "chapter " << i;
  }
  EXPECT_TRUE(world_.boxes.Take().empty());

  QDesktopServices::unsetUrlHandler(QStringLiteral("file"));
  EXPECT_EQ(OpenManual(ManualChapter::kNoAnswer, world_.boxes), QString());  // this platform opens nothing
  ASSERT_EQ(world_.boxes.shown.size(), 1u);
  EXPECT_THAT(world_.boxes.shown[0].text,
              HasSubstr(QDir::toNativeSeparators(viewer.source().toLocalFile()).toStdString()));
}

}  // namespace
}  // namespace tendril::test
