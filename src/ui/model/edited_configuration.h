// EditedConfiguration: the working configuration, and all that the window keeps about it.
#pragma once

#include <cstddef>
#include <cstdint>
#include <string>

#include "config/channel_config.h"
#include "ui/model/channel_editor.h"
#include "ui/model/provenance.h"
#include "ui/model/record_remarks.h"

namespace tendril {

// Can be kept as a snapshot and be restored from one: that is what undo does.
class EditedConfiguration {
 public:
  // Everything that a step of undo brings back.
  struct Snapshot {
    ChannelTable records;
    ChannelTable given;
    ChannelEditor::State editor;
    Provenance::State origin;
    std::size_t preset;
  };

  // The records are those of the preset at the start.
  EditedConfiguration();
  EditedConfiguration(const EditedConfiguration&) = delete;
  EditedConfiguration& operator=(const EditedConfiguration&) = delete;

  // The records that are edited, sent and shown.
  ChannelTable& Records() { return records_; }
  const ChannelTable& Records() const { return records_; }
  ChannelEditor& Editor() { return editor_; }
  RecordRemarks& Remarks() { return remarks_; }
  const Provenance& Origin() const { return origin_; }
  // The row of kPresets that was chosen last.
  std::size_t ChosenPreset() const { return preset_; }

  // Stores this row of kPresets in all records.
  void ApplyPreset(std::size_t preset);
  // `unit` has just given all records, at `time` ("2026-11-22T14:02:31+01:00").
  void ReadFrom(std::uint8_t unit, const std::string& time);
  // What `unit` held when it was read at `time` becomes the configuration.
  void Load(const ChannelTable& read, std::uint8_t unit, const std::string& time);
  // Replaces all records by those of a text. The origin stays: what differs has changed since.
  void TakeOver(const ChannelTable& records);
  // `unit` has just taken all records.
  void SentTo(std::uint8_t unit, const std::string& time) { origin_.SentTo(unit, time); }

  Snapshot Take() const;
  // A channel stays chosen when none was.
  void Restore(const Snapshot& snapshot);

 private:
  ChannelTable records_;
  ChannelEditor editor_{records_};
  RecordRemarks remarks_{records_, editor_};
  Provenance origin_{records_};
  std::size_t preset_ = kStartPreset;
};

}  // namespace tendril
