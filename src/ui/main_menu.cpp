#include "ui/main_menu.h"

#include <QAccessible>
#include <QApplication>
#include <QClipboard>
#include <QEvent>
#include <QLabel>
#include <QLineEdit>
#include <QSlider>
#include <QTableView>

#include "ui/appearance.h"
#include "ui/control_action.h"

namespace tendril {
namespace {

struct ControlItem {
  const char* text;
  const char* key;  // empty: none
  const char* control;
};
constexpr std::array<ControlItem, 2> kTargetItems{
    {{"Comm &Port", "Ctrl+P", "cmbNYX"}, {"Unit &ID", "Ctrl+I", "CmbUnitID_0"}}};
constexpr std::array<ControlItem, 3> kCommandItems{
    {{"&SEND(write) Configuration", "Ctrl+Return", "Command3_0"},
     {"&GET(read) Configuration", "Ctrl+G", "Command3_1"},
     {"Comp&are", "Ctrl+M", "cmdCompare_0"}}};
constexpr ControlItem kCancelItem{"&Cancel Command\tEsc", "", "cmdCancel"};
constexpr ControlItem kChangeIdItem{"UPDATE Unit_ID", "", "Command3_2"};
constexpr std::array<ControlItem, 2> kFileItems{
    {{"Export Config", "", "cmdWriteConfig"}, {"Import Config", "", "cmdReadConfig"}}};
// In the order of the editor. No plain function key: one slip would move a servo.
constexpr std::array<ControlItem, 5> kTestItems{{{"Test &Actual Pulse Range", "Ctrl+F5", "cmdTest_3"},
                                                 {"Test &Virtual Pulse Range", "Ctrl+F6", "cmdTest_0"},
                                                 {"Test &Neutral Trim", "Ctrl+F7", "cmdTest_4"},
                                                 {"Test Virtual &Stops", "Ctrl+F8", "cmdTest_1"},
                                                 {"Test &Default Position", "Ctrl+F9", "cmdTest_2"}}};
constexpr ControlItem kSliderItem{"&Use Slider to Test Intensity Values", "Ctrl+L", "chkSendSlideCommands"};
constexpr ControlItem kStoreItem{"S&tore What Is Shown", "Ctrl+S", "cmdStore"};
constexpr ControlItem kPresetsItem{"Standard &Preset Values", "Ctrl+Shift+P", "cmbPresets"};
constexpr ControlItem kSummaryItem{"Summar&y", "F7", "cmdShowSummary"};

QKeySequence Key(const char* key) { return QKeySequence(QString::fromLatin1(key)); }

QAction* AddItem(QMenu& menu, QWidget& window, const ControlItem& item) {
  const QString text = QString::fromLatin1(item.text);
  auto* control = window.findChild<QWidget*>(QString::fromLatin1(item.control));
  auto* list = qobject_cast<CalmComboBox*>(control);
  auto* action = list != nullptr ? new ControlAction(text, Key(item.key), *list, &menu)
                                 : new ControlAction(text, Key(item.key),
                                                     *qobject_cast<QAbstractButton*>(control), &menu);
  menu.addAction(action);
  return action;
}

QMenu& AddMenu(QMenuBar& bar, const char* title) { return *bar.addMenu(QString::fromLatin1(title)); }

template <typename Receiver, typename Slot>
QAction* AddItem(QMenu& menu, const char* text, const char* key, Receiver* receiver, Slot slot) {
  auto* action = menu.addAction(QString::fromLatin1(text));
  action->setShortcut(Key(key));
  QObject::connect(action, &QAction::triggered, receiver, slot);
  return action;
}

}  // namespace

MainMenu::MainMenu(QWidget& window) {
  setObjectName("menu");
  AddUnitMenu(window);
  AddEditMenu(window);
  AddViewMenu(window);
  AddHelpMenu();
  ShowView(false, false);
}

void MainMenu::AddUnitMenu(QWidget& window) {
  QMenu& menu = AddMenu(*this, "&Unit");
  for (const ControlItem& item : kTargetItems) AddItem(menu, window, item);
  id_steps_ = {AddItem(menu, "&Next Unit ID", "Ctrl+PgUp", this, [this] { Q_EMIT IdStepped(1); }),
               AddItem(menu, "P&revious Unit ID", "Ctrl+PgDown", this, [this] { Q_EMIT IdStepped(-1); })};
  find_ = AddItem(menu, "&Find Units...", "Ctrl+F", this, &MainMenu::FindChosen);
  menu.addSeparator();
  for (const ControlItem& item : kCommandItems) AddItem(menu, window, item);
  dismiss_ = AddItem(menu, "&Dismiss Comparison", "", this, &MainMenu::DismissChosen);
  dismiss_->setEnabled(false);
  AddItem(menu, window, kCancelItem);
  restore_ = AddItem(menu, "", "", this, &MainMenu::RestoreChosen);
  ShowWayBack(false, {});
  menu.addSeparator();
  AddTests(*menu.addMenu(QStringLiteral("&Test")), window);
  // Its key is shown, not bound: a list or field that has the focus needs it first.
  stop_ = AddItem(menu, "Stop\tEsc", "", this, &MainMenu::StopChosen);
  menu.addSeparator();
  AddItem(menu, window, kChangeIdItem);
  menu.addSeparator();
  for (const ControlItem& item : kFileItems) AddItem(menu, window, item);
  menu.addSeparator();
  AddItem(menu, "&Quit", "Ctrl+Q", &window, &QWidget::close);
}

void MainMenu::AddTests(QMenu& menu, QWidget& window) {
  for (const ControlItem& item : kTestItems) AddItem(menu, window, item);
  menu.addSeparator();
  AddItem(menu, window, kSliderItem);
}

void MainMenu::AddEditMenu(QWidget& window) {
  QMenu& menu = AddMenu(*this, "&Edit");
  undo_ = AddItem(menu, "", "Ctrl+Z", this, &MainMenu::UndoChosen);
  redo_ = AddItem(menu, "", "Ctrl+Shift+Z", this, &MainMenu::RedoChosen);
  undo_->setObjectName("actUndo");
  redo_->setObjectName("actRedo");
  redo_->setShortcuts({Key("Ctrl+Shift+Z"), Key("Ctrl+Y")});
  ShowUndo(false, {}, false, {});
  menu.addSeparator();
  AddItem(menu, "&Copy", "Ctrl+C", this, &MainMenu::CopyChosen);
  AddItem(menu, "Copy &Status", "Ctrl+Shift+S", this, &MainMenu::CopyStatusChosen);
  AddItem(menu, "Copy &Line for Support", "Ctrl+Shift+L", this, &MainMenu::CopyLineChosen);
  menu.addSeparator();
  AddItem(menu, "Copy Confi&guration", "Ctrl+Shift+C", this, &MainMenu::CopyConfigurationChosen)
      ->setObjectName("actCopyConfiguration");
  paste_ = AddItem(menu, "P&aste Configuration", "Ctrl+Shift+V", this, &MainMenu::PasteConfigurationChosen);
  paste_->setObjectName("actPasteConfiguration");
  menu.addSeparator();
  AddItem(menu, window, kStoreItem);
  AddItem(menu, window, kPresetsItem);
}

void MainMenu::AddViewMenu(QWidget& window) {
  QMenu& menu = AddMenu(*this, "&View");
  simulator_ = AddItem(menu, "Si&mulator", "F6", this, &MainMenu::SimulatorChosen);
  AddItem(menu, window, kSummaryItem);
  QMenu& channels = *menu.addMenu(QStringLiteral("&Channel"));
  for (std::size_t channel = 0; channel < channels_.size(); ++channel) {
    const QByteArray number = QByteArray::number(static_cast<int>(channel) + 1);
    channels_[channel] = AddItem(channels, "Channel &" + number, "Ctrl+" + number, this,
                                 [this, channel] { Q_EMIT ChannelChosen(channel); });
  }
  menu.addSeparator();
  line_ = AddItem(menu, "&Line", "F12", this, &MainMenu::LineToggled);
  line_->setObjectName("actLine");
  line_->setCheckable(true);
  dark_ = AddItem(menu, "&Dark", "Ctrl+Shift+D", this, [](bool on) { SetDarkAppearance(on); });
  dark_->setCheckable(true);
  dark_->setChecked(DarkAppearance());
}

void MainMenu::AddHelpMenu() {
  QMenu& menu = AddMenu(*this, "&Help");
  AddItem(menu, "&Manual", "Ctrl+F1", this, &MainMenu::ManualChosen);
  AddItem(menu, "&Keys", "F1", this, &MainMenu::KeysChosen);
  menu.addSeparator();
  AddItem(menu, "&About", "Ctrl+Shift+F1", this, &MainMenu::AboutChosen);
}

// The system can change its theme, too.
void MainMenu::changeEvent(QEvent* event) {
  QMenuBar::changeEvent(event);
  if (event->type() == QEvent::PaletteChange && dark_ != nullptr) dark_->setChecked(DarkAppearance());
}

void MainMenu::ShowView(bool summary, bool command_runs) {
  simulator_->setEnabled(summary);
  // A choice stores the editor's values: in the summary over an edited row, and in a send over what is sent.
  for (QAction* channel : channels_) channel->setEnabled(!summary && !command_runs);
}

void MainMenu::ShowUndo(bool may_undo, const QString& undo, bool may_redo, const QString& redo) {
  undo_->setText((QStringLiteral("&Undo ") + undo).trimmed());
  undo_->setEnabled(may_undo);
  redo_->setText((QStringLiteral("&Redo ") + redo).trimmed());
  redo_->setEnabled(may_redo);
}

void MainMenu::ShowWayBack(bool enabled, const QString& what) {
  restore_->setText(
      QStringLiteral("Rest&ore What %1").arg(what.isEmpty() ? QStringLiteral("the Unit Held") : what));
  restore_->setEnabled(enabled);
}

void MainMenu::EnableIdSteps(bool enabled) {
  for (QAction* step : id_steps_) step->setEnabled(enabled);
}

bool CopySelection() {
  const QWidget* const focused = QApplication::focusWidget();
  if (focused == nullptr) return false;
  QString text;
  if (const auto* label = qobject_cast<const QLabel*>(focused)) text = label->selectedText();
  if (const auto* table = qobject_cast<const QTableView*>(focused)) text = SelectedRows(*table);
  const auto* field = qobject_cast<const QLineEdit*>(focused);
  if (field == nullptr) field = focused->findChild<QLineEdit*>();
  if (field != nullptr) text = field->selectedText();
  if (!text.isEmpty()) QGuiApplication::clipboard()->setText(text);
  return !text.isEmpty();
}

void CopyFocused() {
  QWidget* const focused = QApplication::focusWidget();
  if (focused == nullptr || qobject_cast<QLabel*>(focused) != nullptr) return;
  const QString text = qobject_cast<QSlider*>(focused) != nullptr
                           ? focused->accessibleDescription()
                           : QAccessible::queryAccessibleInterface(focused)->text(QAccessible::Value);
  if (!text.isEmpty()) QGuiApplication::clipboard()->setText(text);
}

}  // namespace tendril
