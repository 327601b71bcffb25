// The menu bar in the real window: keys, letters, and what they reach.
#include <QFile>
#include <QLabel>
#include <QMenuBar>
#include <QRegularExpression>
#include <map>
#include <set>

#include "window_fixture.h"

namespace tendril::test {
namespace {

class Menu : public Window {
 protected:
  std::string Id() {
    return Find<QComboBox>("CmbUnitID_0").currentText().toStdString() +
           Find<QComboBox>("CmbUnitID_1").currentText().toStdString();
  }
  // What each key does in the shown view, in words.
  std::multimap<std::string, std::string> KeysOfView() {
    std::multimap<std::string, std::string> keys;
    const auto add = [&](const QKeySequence& key, const QString& what) {
      if (!key.isEmpty()) keys.emplace(key.toString().toStdString(), what.toStdString());
    };
    for (const QAction* action : window_->findChildren<QAction*>())
      if (action->isEnabled()) add(action->shortcut(), action->text());
    for (const QAction* menu : Find<QMenuBar>("menu").actions())
      add(QKeySequence::mnemonic(menu->text()), menu->text());
    for (const QAbstractButton* button : window_->findChildren<QAbstractButton*>())
      if (button->isVisible()) add(button->shortcut(), button->text());
    for (const QLabel* label : window_->findChildren<QLabel*>())
      if (label->isVisible() && label->buddy() != nullptr)
        add(QKeySequence::mnemonic(label->text()), label->text());
    return keys;
  }
};

TEST_F(Menu, NoKeyAndNoLetterTwice) {
  for (const char* view : {"simulator", "summary"}) {
    const auto keys = KeysOfView();
    EXPECT_GT(keys.size(), 20u);
    for (auto key = keys.begin(); key != keys.end(); ++key)
      EXPECT_EQ(keys.count(key->first), 1u) << key->first << " in the " << view << ": " << key->second;
    Keys("F7");
    world_.time.Advance(20);
  }
  for (const QMenu* menu : window_->findChildren<QMenu*>()) {
    std::map<QString, QString> letters;
    for (const QAction* action : menu->actions()) {
      const QString letter = QKeySequence::mnemonic(action->text()).toString();
      if (letter.isEmpty()) continue;
      EXPECT_TRUE(letters.emplace(letter, action->text()).second) << action->text().toStdString();
    }
  }
  EXPECT_TRUE(QKeySequence::mnemonic(Find<QAbstractButton>("Command3_2").text()).isEmpty());
}

// "| Ctrl+Y, Ctrl+Z | *Undo*: more |": each key of the menus is in the manual, and no other.
TEST_F(Menu, KeysAreThoseOfTheManual) {
  std::set<std::string> keys;
  for (const QAction* action : window_->findChildren<QAction*>()) {
    const QString text = action->text().remove(u'&').trimmed();
    for (const QKeySequence& key : action->shortcuts())
      keys.insert(
          (key.toString() + u' ' + (text.startsWith(u"Channel ") ? text.first(7) : text)).toStdString());
  }
  QFile chapter(QStringLiteral(TENDRIL_SOURCES "/docs/manual/keys.md"));
  ASSERT_TRUE(chapter.open(QIODevice::ReadOnly));
  const QString text = QString::fromUtf8(chapter.readAll());
  std::set<std::string> written;
  const QRegularExpression row(QStringLiteral("(?m)^\\| ([^|]+) \\| \\*([^*]+)\\*"));
  for (const auto& match : row.globalMatch(text)) {
    QString named = match.captured(1);
    named.replace(QStringLiteral("1 to Ctrl+8"),
                  QStringLiteral("1, Ctrl+2, Ctrl+3, Ctrl+4, Ctrl+5, Ctrl+6, Ctrl+7, Ctrl+8"));
    for (const QString& key : named.split(QStringLiteral(", ")))
      written.insert((key + u' ' + match.captured(2)).toStdString());
  }
  EXPECT_EQ(written, keys);
}

TEST_F(Menu, Keys_ChooseChannelsInTheSimulatorViewOnly) {
  Keys("Ctrl+3");
  EXPECT_TRUE(Dial("ServoSimulator2_2").selected());
  TypeOver("spnDefaultPos", "-100");
  Keys("Ctrl+8");
  EXPECT_EQ(Record(2).DefaultPosition, 1400) << "typed before the key";
  Keys("F7");
  world_.time.Advance(20);
  ASSERT_TRUE(Visible("frmSumHeader"));
  Keys("Ctrl+1");
  EXPECT_TRUE(Dial("ServoSimulator2_7").selected());
  Keys("Ctrl+F6");
  EXPECT_EQ(Text("cmdTest_0"), "Test") << "hidden";
  Keys("F6");
  EXPECT_TRUE(Visible("ServoSimulator1"));
}

TEST_F(Menu, Keys_StepTheUnitIdUnlessSomethingMoves) {
  for (const auto& [keys, id] : {std::pair("Ctrl+PgDown", "FD"), {"Ctrl+PgUp", "01"}, {"Ctrl+PgUp", "02"}}) {
    Keys(keys);
    EXPECT_EQ(Id(), id) << keys;
  }
  ChooseByKeys("CmbUnitID_0", 15);
  ChooseByKeys("CmbUnitID_1", 15);
  Keys("Ctrl+PgDown");
  EXPECT_EQ(Id(), "FD") << "from FF, which all units hear";
  ConnectUnit(0xFD);
  for (const char* moving : {"cmdTest_0", "chkSendSlideCommands"}) {
    Press(moving);
    Keys("Ctrl+PgUp");
    EXPECT_EQ(Id(), "FD") << moving;
    Press(moving);
  }
  Keys("Ctrl+Return");
  Keys("Ctrl+PgUp");
  EXPECT_EQ(Id(), "FD") << "during a send";
  RunToTheEnd();
  Keys("Ctrl+PgUp");
  EXPECT_EQ(Id(), "01");
}

// From the start to a sent configuration.
TEST_F(Menu, EveryCommand_ByKeyboardAlone) {
  auto& unit = world_.bench.Attach<VirtualUnit>(1, std::uint8_t{0x02});
  Keys("Ctrl+P");
  auto& ports = *Find<QComboBox>("cmbNYX").view();
  QTest::keyClick(&ports, Qt::Key_Down);
  QTest::keyClick(&ports, Qt::Key_Return);
  Keys("Ctrl+PgUp");
  Keys("Ctrl+5");
  Find("ServoSimulator2_4").setFocus();
  const auto tab_to = [&](const char* control) {
    for (int steps = 0; steps < 60 && QApplication::focusWidget() != &Find(control); ++steps)
      Key(Qt::Key_Tab);
    return QApplication::focusWidget() == &Find(control);
  };
  for (const char* control : {"spnNeutralTrim", "optLostComm_3"}) {
    ASSERT_TRUE(tab_to(control)) << control;
    Key(Qt::Key_Up);
  }
  TypeOver("spnDefaultPos", "-120");
  Keys("Ctrl+F9");
  EXPECT_EQ(Dial("ServoSimulator1").arm_pulse(), 1390) << "typed before the key";
  Keys("Ctrl+C");
  EXPECT_EQ(Copied(), "-120 µs") << "nothing is selected";
  Keys("Ctrl+F6");
  EXPECT_EQ(Text("cmdTest_0"), "Stop");
  Keys("Ctrl+F6");
  EXPECT_EQ(Text("cmdTest_0"), "Test");
  Keys("Ctrl+L");
  EXPECT_TRUE(Checked("chkSendSlideCommands"));
  Keys("Ctrl+L");
  Keys("F1");
  EXPECT_TRUE(Visible("KeysDialog"));
  Find("KeysDialog").close();
  Keys("Ctrl+Shift+F1");
  EXPECT_TRUE(Visible("AboutDialog") && !Visible("KeysDialog"));
  Find("AboutDialog").close();
  Keys("Ctrl+Return");
  RunToTheEnd();
  EXPECT_EQ(Text("lblProgress"), "SUCCESS: Send Complete!");
  EXPECT_EQ(unit.PortOptions(5)[8], 151);
  EXPECT_EQ(Record(4).LostCommOption, kLostCommNeutral);
  Find<QLabel>("lblProgress").clear();
  Keys("Ctrl+G");
  RunToTheEnd();
  EXPECT_EQ(Text("lblProgress"), "SUCCESS: Upload Complete");
}

}  // namespace
}  // namespace tendril::test
