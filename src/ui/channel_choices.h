// ChannelChoices: presets, output kind, and the behaviour at power-up and when communication is lost.
#pragma once

#include <QBoxLayout>
#include <QButtonGroup>
#include <QString>
#include <QWidget>
#include <cstddef>
#include <cstdint>
#include <span>
#include <vector>

#include "config/channel_config.h"
#include "ui/controls.h"
#include "ui/model/channel_editor.h"
#include "ui/model/comparison.h"

namespace tendril {

class ChannelChoices : public QWidget {
  Q_OBJECT

 public:
  // `editor`, `working`, its records, and what compares them must outlive the area. The preset that the records start
  // from is selected, but not applied.
  ChannelChoices(ChannelEditor& editor, const ChannelTable& working, const Comparison& comparison);

  // Selects this row of kPresets, and applies nothing.
  void ShowPreset(std::size_t preset) { cmbPresets_->setCurrentIndex(static_cast<int>(preset)); }
  // Checks what the edited channel's record holds; nothing for unknown values, or while no channel is edited.
  void ShowChoices();
  // Signs what differs from the unit that is compared. ShowChoices() does it, too.
  void ShowDifferences();
  // Enables presets and choices. `running_command` is what runs; empty when nothing does.
  void EnableControls(const QString& running_command);

 Q_SIGNALS:
  // The user chose an output kind, 0 to 2.
  void KindChosen(std::int16_t kind);
  // The user chose an option of `what`; the records hold it.
  void OptionChosen(const QString& what);
  // The user chose this row of kPresets.
  void PresetChosen(std::size_t preset);

 private:
  struct Choice {
    QString caption;
    QString tip;
  };

  static std::vector<Choice> Choices(std::span<const char* const> captions, const char* when);
  QWidget* MakePresets();
  void EnableOptions();
  QButtonGroup* AddOptions(const QString& title, const char* array, const std::vector<Choice>& choices,
                           QBoxLayout::Direction direction);

  ChannelEditor& editor_;
  const ChannelTable& working_;
  const Comparison& comparison_;
  QString running_command_;
  CalmComboBox* cmbPresets_ = nullptr;
  // The buttons' ids are the record's values; those of the output kind are one more.
  QButtonGroup* optChannelType_;
  QButtonGroup* optPowerUp_;
  QButtonGroup* optLostComm_;
};

}  // namespace tendril
