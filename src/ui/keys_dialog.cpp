#include "ui/keys_dialog.h"

#include <QDialogButtonBox>
#include <QHeaderView>
#include <QMenu>
#include <QScreen>
#include <QTreeWidget>
#include <QVBoxLayout>
#include <array>

#include "ui/controls.h"

namespace tendril {
namespace {

struct GeneralKey {
  const char* key;
  const char* what;
};
// Of a window, and of the screen's bars.
constexpr QSize kRoomForFrames(16, 60);

constexpr std::array<GeneralKey, 10> kGeneralKeys{
    {{"Tab, Shift+Tab", "Next and previous control"},
     {"Alt+underlined letter", "The button or list with that letter, or the menu"},
     {"Space, Enter",
      "Chooses the channel of a drawn servo; opens the number entry of a value in the summary"},
     {"Space", "Presses a button, ticks a box"},
     {"Up, Down", "A number by 10 µs; the next choice; the next line of a list"},
     {"Page Up, Page Down", "A number by 100 µs; the slider by 10 %"},
     {"F4, Alt+Down", "Opens a list"},
     {"Enter", "A typed number takes effect"},
     {"Escape", "Closes a list, the number entry, or this window"},
     {"Escape", "With none of these open: ends a servo test, or else cancels a command"}}};

QTreeWidgetItem* AddGroup(QTreeWidget& list, const QString& title) {
  auto* group = new QTreeWidgetItem(&list, {title});
  QFont bold = list.font();
  bold.setBold(true);
  group->setFont(0, bold);
  group->setFirstColumnSpanned(true);
  return group;
}

void AddKeys(QTreeWidgetItem& group, const QMenu& menu) {
  for (const QAction* action : menu.actions()) {
    if (action->menu() != nullptr) AddKeys(group, *action->menu());
    if (!action->shortcut().isEmpty()) {
      new QTreeWidgetItem(&group, {action->shortcut().toString(QKeySequence::NativeText),
                                   action->text().remove(QLatin1Char('&'))});
    }
  }
}

}  // namespace

KeysDialog::KeysDialog(const QMenuBar& menus, QWidget& window) : QDialog(&window) {
  setObjectName("KeysDialog");
  setWindowTitle(QStringLiteral("Keys"));
  auto* list = Named(new QTreeWidget, "lstKeys");
  list->setAccessibleName(QStringLiteral("Keys and what they do"));
  list->setHeaderLabels({QStringLiteral("Key"), QStringLiteral("What it does")});
  list->setRootIsDecorated(false);
  list->setAlternatingRowColors(true);
  for (const QAction* menu : menus.actions())
    AddKeys(*AddGroup(*list, menu->text().remove(QLatin1Char('&'))), *menu->menu());
  QTreeWidgetItem* general = AddGroup(*list, QStringLiteral("Everywhere"));
  for (const GeneralKey& key : kGeneralKeys)
    new QTreeWidgetItem(general, {QString::fromUtf8(key.key), QString::fromUtf8(key.what)});
  list->expandAll();
  list->setCurrentItem(list->topLevelItem(0));  // the first thing that is read out
  list->resizeColumnToContents(0);
  auto* buttons = new QDialogButtonBox(QDialogButtonBox::Close);
  connect(buttons, &QDialogButtonBox::rejected, this, &QDialog::close);
  auto* column = new QVBoxLayout(this);
  column->addWidget(list);
  column->addWidget(buttons);
  resize(QSize(640, 560).boundedTo(window.screen()->availableSize() - kRoomForFrames));
}

void ShowKeys(QWidget& window, const QMenuBar& menus) {
  auto* dialog = window.findChild<QDialog*>(QStringLiteral("KeysDialog"));
  if (dialog == nullptr) dialog = new KeysDialog(menus, window);
  dialog->show();
  dialog->raise();
  dialog->activateWindow();
}

}  // namespace tendril
