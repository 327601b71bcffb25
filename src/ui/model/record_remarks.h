// RecordRemarks: which records cannot be sent, and which differ from what was given because they were looked at.
#pragma once

#include <cstddef>
#include <string>
#include <vector>

#include "config/channel_config.h"
#include "ui/model/channel_editor.h"

namespace tendril {

// Editor and summary bring a record into their bounds by showing it: an actual range that is not centred on 1500
// becomes one that is, for example. This compares what is shown with what was given last: by a unit, a preset or an
// edit. Start-up is a preset.
class RecordRemarks {
 public:
  // `working` are the records; both must outlive it.
  RecordRemarks(const ChannelTable& working, const ChannelEditor& editor)
      : working_(working), editor_(editor) {}

  // All records were replaced on purpose.
  void AcceptRecords() { given_ = working_; }
  // The record of `channel`, 0 to 7, was changed on purpose.
  void AcceptRecord(std::size_t channel) { given_.At(channel) = working_.At(channel); }
  // The user has edited in the editor: all that it shows of its channel is meant, and the ticked channels' records.
  void AcceptEdit();

  // One sentence each: first what cannot be sent, then what differs, of the edited channel first. `editor_shown`: the
  // editor's working values are what is shown of its channel; otherwise its record is.
  std::vector<std::string> Sentences(bool editor_shown) const;

 private:
  void AddDifferences(std::size_t channel, bool editor_shown, std::vector<std::string>& sentences) const;
  // What is shown of `channel`, 0 to 7; only the pulse fields mean something.
  const ChannelConfig& Shown(std::size_t channel, bool editor_shown) const;

  const ChannelTable& working_;
  const ChannelEditor& editor_;
  ChannelTable given_;  // only the pulse fields mean something
};

}  // namespace tendril
