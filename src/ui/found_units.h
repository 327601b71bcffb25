// FoundUnits: the list of the units that a search finds.
#pragma once

#include <QDialog>
#include <QPushButton>
#include <QString>
#include <QTreeWidget>
#include <cstdint>

#include "ui/announcement.h"
#include "unitops/unit_search.h"

namespace tendril {

// Fills while the search runs. Not modal. To close it ends nothing: the search goes on, and the list keeps what it finds.
class FoundUnits : public QDialog {
  Q_OBJECT

 public:
  // `search` is what is shown; it must outlive the list. `window` owns it.
  FoundUnits(const UnitSearch& search, QWidget& window);

  // Shows what the search has found by now.
  void ShowSearch();
  // Enables the controls, and shows the result once no search runs. `running_command` is what runs, empty when nothing
  // does; `finding`: that is the search. `cancelled`: it ends with its last poll. `moves`: a test moves servos of the
  // chosen unit, so that another one cannot be chosen.
  void EnableControls(const QString& running_command, bool finding, bool cancelled, bool moves);

 Q_SIGNALS:
  // The user has chosen the unit at `id`.
  void UnitChosen(std::uint8_t id);
  void CancelPressed();
  void FindPressed();

 private:
  void AddButtons();
  void AddUnit(const FoundUnit& unit);
  void ChooseUnit(QTreeWidgetItem* line);

  const UnitSearch& search_;
  bool finding_ = false;
  QTreeWidget* lstUnits_;
  Announcement* lblFound_;  // how far the search is, then its result
  QPushButton* cmdCancelFind_;
  QPushButton* cmdFindAgain_;
};

}  // namespace tendril
