// CommandArea: the unit commands, and the buttons that switch the view.
#pragma once

#include <QAbstractButton>
#include <QString>
#include <QWidget>
#include <functional>
#include <vector>

#include "unitops/running_command.h"
#include "unitops/unit_commands.h"
#include "unitops/unit_target.h"

namespace tendril {

// What the buttons of the unit commands do, wherever they stand.
inline const QString kSendTip =
    QStringLiteral("Writes the configuration of all eight ports into the chosen unit.");
inline const QString kGetTip =
    QStringLiteral("Reads the configuration of all eight ports out of the chosen unit.");

// The buttons that run unit commands, wherever they stand. Disabled while a command runs, with a tool tip
// that says which.
class CommandButtons {
 public:
  // Why a command cannot be run now, in the words of a tool tip; empty when it can.
  using Objection = std::function<QString()>;

  // Adds a button of `Command3`, and runs `action` when it is pressed.
  void Add(QAbstractButton* button, const QString& tip, std::function<void()> action,
           Objection objection = {});
  // Enables what can be run now, and only that.
  void ShowRunning(const RunningCommand& running);

 private:
  struct Entry {
    QAbstractButton* button;
    QString tip;
    Objection objection;
  };
  std::vector<Entry> entries_;
};

class CommandArea : public QWidget {
 public:
  // `commands` and `target` must outlive the area; its buttons are added to `buttons`. `show_summary` is called when
  // the summary is wanted.
  CommandArea(UnitCommands& commands, const UnitTarget& target, CommandButtons& buttons,
              std::function<void()> show_summary, QWidget* parent = nullptr);

  // "Summary" can be pressed while the summary is not shown.
  void ShowSummaryButton(bool enabled);

  // Start-up: exporting and importing have no function.
  void DisableExportAndImport();

 private:
  QAbstractButton* cmdShowSummary_;
  QAbstractButton* cmdWriteConfig_;
  QAbstractButton* cmdReadConfig_;
};

}  // namespace tendril
