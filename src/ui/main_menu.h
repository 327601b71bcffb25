// MainMenu: the menu bar, with every command of the window and its key.
#pragma once

#include <QAction>
#include <QMenu>
#include <QMenuBar>
#include <array>
#include <cstddef>

#include "config/channel_config.h"

namespace tendril {

// "UPDATE Unit_ID" has no key and no letter: one slip would give a unit another ID.
class MainMenu : public QMenuBar {
  Q_OBJECT

 public:
  // `window` has all controls of the simulator view already; it must outlive the menu.
  explicit MainMenu(QWidget& window);

  // Enables what the shown view has, and no choice of a channel while a command runs.
  void ShowView(bool summary, bool command_runs);
  // Names the steps that undo and redo would go; each is enabled when it may be gone.
  void ShowUndo(bool may_undo, const QString& undo, bool may_redo, const QString& redo);
  // Names the reading that can be restored ("Unit 01 Held at 14:02"), and enables it when it may be.
  void ShowWayBack(bool enabled, const QString& what);
  // Enables "Dismiss Comparison" while there is one.
  void EnableDismiss(bool enabled) { dismiss_->setEnabled(enabled); }
  // Enables "Stop" while a sweep runs.
  void EnableStop(bool enabled) { stop_->setEnabled(enabled); }
  // Whether the pane of the line is shown.
  void ShowLine(bool shown) { line_->setChecked(shown); }
  // Enables "Paste Configuration".
  void EnablePaste(bool enabled) { paste_->setEnabled(enabled); }
  // Enables the steps through the unit IDs.
  void EnableIdSteps(bool enabled);
  void EnableFind(bool enabled) { find_->setEnabled(enabled); }

 Q_SIGNALS:
  // Choose channel 0 to 7.
  void ChannelChosen(std::size_t channel);
  // Choose the next (+1) or the previous (-1) unit ID.
  void IdStepped(int by);
  // Find the units on the line, or show the search that runs.
  void FindChosen();
  void SimulatorChosen();
  void UndoChosen();
  void RedoChosen();
  void RestoreChosen();
  void DismissChosen();
  // End the sweep.
  void StopChosen();
  // Copy what is selected, the table of the summary, or the value that has the focus.
  void CopyChosen();
  void CopyConfigurationChosen();
  void PasteConfigurationChosen();
  // Put the status bar's text on the clipboard.
  void CopyStatusChosen();
  // Put the report about the line on the clipboard.
  void CopyLineChosen();
  // Show or hide the pane of the line.
  void LineToggled(bool shown);
  void ManualChosen();
  void KeysChosen();
  void AboutChosen();

 protected:
  void changeEvent(QEvent* event) override;

 private:
  void AddUnitMenu(QWidget& window);
  void AddTests(QMenu& menu, QWidget& window);
  void AddEditMenu(QWidget& window);
  void AddViewMenu(QWidget& window);
  void AddHelpMenu();

  std::array<QAction*, 2> id_steps_{};
  QAction* find_ = nullptr;
  std::array<QAction*, kPortCount> channels_{};
  QAction* simulator_ = nullptr;
  QAction* undo_ = nullptr;
  QAction* redo_ = nullptr;
  QAction* restore_ = nullptr;
  QAction* paste_ = nullptr;
  QAction* dismiss_ = nullptr;
  QAction* dark_ = nullptr;
  QAction* line_ = nullptr;
  QAction* stop_ = nullptr;
};

// Puts the selected text of the focused control on the clipboard. False: nothing is selected.
bool CopySelection();
// Puts the value of the focused control on the clipboard. Does nothing when it has none.
void CopyFocused();

}  // namespace tendril
