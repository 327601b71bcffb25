#include "ui/model/edited_configuration.h"

namespace tendril {

// The editor keeps its start-up values until a channel is chosen.
EditedConfiguration::EditedConfiguration() {
  for (std::size_t channel = 0; channel < kPortCount; ++channel)
    SetFromPreset(kPresets[kStartPreset], records_.At(channel));
  remarks_.AcceptRecords();
  origin_.FromPreset(kPresets[kStartPreset].name);
}

void EditedConfiguration::ApplyPreset(std::size_t preset) {
  preset_ = preset;
  editor_.ApplyPreset(kPresets.at(preset));
  remarks_.AcceptRecords();
  origin_.FromPreset(kPresets[preset].name);
}

void EditedConfiguration::ReadFrom(std::uint8_t unit, const std::string& time) {
  remarks_.AcceptRecords();
  origin_.ReadFrom(unit, time);
  editor_.ReloadChannel();
}

void EditedConfiguration::Load(const ChannelTable& read, std::uint8_t unit, const std::string& time) {
  records_ = read;
  ReadFrom(unit, time);
}

void EditedConfiguration::TakeOver(const ChannelTable& records) {
  records_ = records;
  remarks_.AcceptRecords();
  editor_.ReloadChannel();
}

EditedConfiguration::Snapshot EditedConfiguration::Take() const {
  return {records_, remarks_.Given(), editor_.Current(), origin_.Current(), preset_};
}

void EditedConfiguration::Restore(const Snapshot& snapshot) {
  records_ = snapshot.records;
  remarks_.SetGiven(snapshot.given);
  ChannelEditor::State editor = snapshot.editor;
  const bool chosen_since = !editor.channel && editor_.Channel();
  if (chosen_since) editor = editor_.Current();
  editor_.Restore(editor);
  if (chosen_since) editor_.ReloadChannel();
  origin_.Restore(snapshot.origin);
  preset_ = snapshot.preset;
}

}  // namespace tendril
