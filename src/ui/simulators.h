// Simulators: the large drawn servo and the eight small ones, as one.
#pragma once

#include "config/channel_config.h"
#include "ui/channel_strip.h"
#include "ui/editor_area.h"
#include "ui/model/channel_editor.h"
#include "unitops/live_test.h"

namespace tendril {

// The large servo shows the chosen channel, or while there is none what the editor shows.
class Simulators : public ServoPictures {
 public:
  // All must outlive it.
  Simulators(ChannelStrip& channels, EditorArea& editor, const ChannelEditor& ticks);

  // Shows all records anew, with the arms at `arm`: at the start, and after anything that replaces them.
  void UpdateAll(Microseconds arm);
  // Shows the records of the ticked channels anew, and the large servo, with the arms at `arm`.
  void UpdateSimulators(Microseconds arm) override;
  void MoveArm(Microseconds position) override;

 private:
  ChannelStrip& channels_;
  EditorArea& editor_;
  const ChannelEditor& ticks_;
};

}  // namespace tendril
