// RecordRemarks: which records cannot be sent, and which ones showing them has changed.
#pragma once

#include <cstddef>
#include <string>
#include <vector>

#include "config/channel_config.h"
#include "ui/model/channel_editor.h"

namespace tendril {

// The editor and the summary apply their constraints to each record that they show: for example, they centre the actual
// range on 1500. This class compares the shown records with those that a unit, a preset or an edit gave last.
class RecordRemarks {
 public:
  // `working` are the records. Both must outlive this object.
  RecordRemarks(const ChannelTable& working, const ChannelEditor& editor)
      : working_(working), editor_(editor) {}

  // All records were replaced on purpose, at start-up too.
  void AcceptRecords() { given_ = working_; }
  // The record of `channel`, 0 to 7, was changed on purpose.
  void AcceptRecord(std::size_t channel) { given_.At(channel) = working_.At(channel); }
  // What was given last; only the pulse fields are valid.
  const ChannelTable& Given() const { return given_; }
  void SetGiven(const ChannelTable& given) { given_ = given; }
  // The user made an edit in the editor: accepts the edited channel as the editor shows it, and the ticked channels'
  // records.
  void AcceptEdit();

  // One sentence for each field: first what cannot be sent, then what differs, the edited channel first. With
  // `editor_shown` the edited channel is shown by its working values, otherwise by its record.
  std::vector<std::string> Sentences(bool editor_shown) const;

 private:
  void AddDifferences(std::size_t channel, bool editor_shown, std::vector<std::string>& sentences) const;
  // What is shown of `channel`, 0 to 7. Only the pulse fields are valid.
  ChannelConfig Shown(std::size_t channel, bool editor_shown) const;

  const ChannelTable& working_;
  const ChannelEditor& editor_;
  ChannelTable given_;  // only the pulse fields are valid
};

}  // namespace tendril
