// ChannelChoices: presets, output kind, and what happens at power-up and when communication is lost.
#pragma once

#include <QAbstractButton>
#include <QButtonGroup>
#include <QStringList>
#include <QWidget>
#include <cstddef>
#include <cstdint>
#include <functional>
#include <vector>

#include "config/channel_config.h"
#include "ui/controls.h"
#include "ui/model/channel_editor.h"

namespace tendril {

class ChannelChoices : public QWidget {
 public:
  // What only the window can carry out.
  struct Events {
    std::function<void(std::int16_t kind)> kind_chosen;
    std::function<void(std::size_t preset)> preset_chosen;
  };

  // `editor` and `working`, its records, must outlive the area.
  ChannelChoices(ChannelEditor& editor, const ChannelTable& working, Events events,
                 QWidget* parent = nullptr);

  // Start-up: lists the presets and selects the one that the records start from; applies nothing.
  void ListPresets();
  // Checks what the edited channel's record says; nothing when it says nothing known, or while none is edited.
  void ShowChoices();

 private:
  struct Option {
    QAbstractButton* button;
    QString tip;
  };

  QButtonGroup* MakeOptions(QLayout& column, const QString& title, const QString& array,
                            const QStringList& captions, const QStringList& tips, bool side_by_side);

  ChannelEditor& editor_;
  const ChannelTable& working_;
  Events events_;
  CalmComboBox* cmbPresets_;
  // The buttons' ids are the record's values.
  QButtonGroup* optChannelType_;
  QButtonGroup* optPowerUp_;
  QButtonGroup* optLostComm_;
  std::vector<Option> options_;  // of all three
};

}  // namespace tendril
