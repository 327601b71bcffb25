// UndoHistory: the steps that undo and redo go through.
#pragma once

#include <QString>
#include <QUndoStack>
#include <cstddef>
#include <memory>
#include <vector>

#include "ui/model/edited_configuration.h"

namespace tendril {

// A step is any difference of the eight records between two calls of Note(), whatever made it. At most 100 are kept.
class UndoHistory {
 public:
  // `configuration` must outlive it.
  explicit UndoHistory(EditedConfiguration& configuration);

  // Called after everything that may have changed the configuration. Keeps a step called `what` if a record has changed.
  // With `goes_on` it belongs to the step that the call before has kept, if it has: one more step of a held arrow does.
  // Returns the changed channels.
  std::vector<std::size_t> Note(const QString& what, bool goes_on = false);

  // Whether there is a step to undo or redo.
  bool CanUndo() const { return stack_.canUndo(); }
  bool CanRedo() const { return stack_.canRedo(); }
  // What the step is called; empty when there is none.
  QString UndoText() const { return stack_.undoText(); }
  QString RedoText() const { return stack_.redoText(); }
  // Restores the configuration. The caller shows it.
  void Undo() { stack_.undo(); }
  void Redo() { stack_.redo(); }

 private:
  using State = std::shared_ptr<EditedConfiguration::Snapshot>;
  class Step;

  void GoTo(const State& state);

  EditedConfiguration& configuration_;
  State now_;           // what the configuration is; the newest step ends with it
  bool grows_ = false;  // the last Note() has changed the newest step
  QUndoStack stack_;
};

}  // namespace tendril
