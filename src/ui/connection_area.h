// ConnectionArea: which comm port, and which unit.
#pragma once

#include <QPushButton>
#include <QString>
#include <QWidget>
#include <array>
#include <cstddef>
#include <cstdint>
#include <string>
#include <vector>

#include "ui/controls.h"
#include "ui/list_combo_box.h"
#include "unitops/port_selection.h"
#include "unitops/unit_target.h"

namespace tendril {

// Unit 01 is chosen at first.
class ConnectionArea : public QWidget, public UnitTarget {
  Q_OBJECT

 public:
  // `ports` must outlive the area.
  explicit ConnectionArea(PortSelection& ports);

  // Fills the list of comm ports and selects "Select", which opens nothing.
  void ListCommPorts();
  // From now on the list is read again with the focus, and when devices come and go.
  void WatchCommPorts();
  // Chooses the next ID (`by` = 1) or the previous one (-1), from 01 to FD; the last one and the first one are neighbours.
  void StepUnitId(int by);
  void ChooseUnitId(std::uint8_t id);
  // Enables the controls. `running_command` is what runs; empty when nothing does. `finding`: it finds units, and the
  // button shows them.
  void EnableControls(const QString& running_command, bool finding);

  bool PortChosen() const override;
  std::uint8_t UnitId() const override;

 Q_SIGNALS:
  void UnitIdChanged();
  void FindPressed();

 private:
  CalmComboBox* MakeDigit(std::size_t index, const char* which);
  void ShowPorts(const std::vector<std::string>& lines, std::size_t selected);
  void RereadCommPorts();
  void DescribePorts();

  PortSelection& ports_;
  ListComboBox* cmbNYX_;
  QPushButton* cmdFindUnits_;
  std::vector<std::string> lines_;            // of the list
  std::array<CalmComboBox*, 2> CmbUnitID_{};  // the high digit, then the low one
};

}  // namespace tendril
