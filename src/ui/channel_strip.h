// ChannelStrip: the eight servos.
#pragma once

#include <QGroupBox>
#include <QStackedWidget>
#include <QString>
#include <array>
#include <cstddef>
#include <vector>

#include "config/channel_config.h"
#include "simulator/servo_simulator.h"
#include "ui/controls.h"
#include "ui/output_button.h"

namespace tendril {

class ChannelStrip : public QGroupBox {
  Q_OBJECT

 public:
  // `working` are the records that are shown; they must outlive the strip.
  explicit ChannelStrip(const ChannelTable& working);

  // Marks `channel` as the chosen one.
  void ShowSelected(std::size_t channel);
  // Shows each channel according to its record's output kind: as a servo, or as a button with the kind's name.
  void ShowKinds();
  // Shows the record of `channel`, with the arm at `arm`.
  void UpdateSimulator(std::size_t channel, Microseconds arm);
  // Enables the choice of a channel. `running_command` is what runs; empty when nothing does.
  void EnableControls(const QString& running_command);
  // Marks these channels, and no other, as changed since the configuration was read, sent or taken from a preset.
  void ShowChanged(const std::vector<std::size_t>& channels);
  // Marks `channel` as one that differs from a unit, as `how` says; empty: it does not.
  void ShowDiffers(std::size_t channel, const QString& how);
  // Moves the arm alone.
  void MoveArm(std::size_t channel, Microseconds arm);

 Q_SIGNALS:
  // The user chose a channel, 0 to 7.
  void ChannelChosen(std::size_t channel);

 private:
  void ShowMarks(std::size_t channel);
  QWidget* MakeCell(std::size_t channel);
  void ShowKind(std::size_t channel);

  const ChannelTable& working_;
  // Each cell shows its servo, or when the port drives none, its button.
  std::array<QStackedWidget*, kPortCount> cells_{};
  std::array<ServoSimulator*, kPortCount> ServoSimulator2_{};
  std::array<OutputButton*, kPortCount> cmdDigitalOutput_{};
  std::array<bool, kPortCount> changed_{};
  std::array<QString, kPortCount> differs_{};  // how; empty: not
};

}  // namespace tendril
