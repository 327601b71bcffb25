// ConnectionArea: which comm port, and which unit.
#pragma once

#include <QComboBox>
#include <QWidget>
#include <array>
#include <cstddef>
#include <cstdint>
#include <functional>
#include <string>
#include <utility>
#include <vector>

#include "unitops/port_selection.h"
#include "unitops/unit_target.h"

namespace tendril {

class ConnectionArea : public QWidget, public UnitTarget {
 public:
  // `ports` must outlive the area.
  explicit ConnectionArea(PortSelection& ports, QWidget* parent = nullptr);

  // Start-up: the digits of the unit ID, unit 01 chosen.
  void FillUnitIds();
  // Fills the list of comm ports and selects "Select", which opens nothing.
  void ListCommPorts();
  // Port and unit can be chosen only while no command runs. `what`: which one does; empty for none.
  void ShowRunning(const std::string& what);

  // Who is told when another unit ID is chosen.
  void SetUnitIdHandler(std::function<void()> handler) { unit_id_changed_ = std::move(handler); }

  bool PortChosen() const override;
  std::uint8_t UnitId() const override;

 private:
  void ShowPorts(const std::vector<std::string>& lines, std::size_t selected);
  void RereadCommPorts();

  PortSelection& ports_;
  std::function<void()> unit_id_changed_;
  QComboBox* cmbNYX_;
  std::array<QComboBox*, 2> CmbUnitID_{};  // the high digit, then the low one
};

}  // namespace tendril
