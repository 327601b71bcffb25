// ComparisonSigns: the comparison with a unit, as the window shows it.
#pragma once

#include <cstdint>
#include <optional>

#include "config/option_bytes.h"
#include "serial/hw_serial.h"
#include "ui/channel_choices.h"
#include "ui/channel_strip.h"
#include "ui/main_menu.h"
#include "ui/model/comparison.h"
#include "ui/motion_parameters.h"
#include "ui/status_line.h"
#include "ui/summary_area.h"
#include "unitops/unit_target.h"

namespace tendril {

// Signs what differs wherever it is shown, and offers a compare after a send. The comparison stays about its unit,
// whatever unit is chosen, until that is read anew, sent to with success, or the user dismisses it.
class ComparisonSigns {
 public:
  // All must outlive it.
  ComparisonSigns(Comparison& comparison, const HwSerial& link, const UnitTarget& target,
                  ChannelStrip& channels, MotionParameters& parameters, ChannelChoices& choices,
                  StatusLine& status);

  // These are made later than the other areas.
  void SetSummary(SummaryArea& summary) { summary_ = &summary; }
  void SetMenu(MainMenu& menu) { menu_ = &menu; }

  // Shows the comparison with the records and for the chosen unit as they are now. Called after everything that may have
  // changed them; cheap while nothing is compared.
  void Show();
  // A compare has read `unit`, which held this.
  void NoteCompared(std::uint8_t unit, const OptionTable& held);
  // The compare that ran, or was to run, has failed or was `cancelled`.
  void NoteFailure(bool cancelled);
  // A send has begun to write into the chosen unit.
  void NoteWriting();
  // A command begins. `changes_id`: it gives a unit another ID.
  void NoteBegun(bool changes_id);
  // The records were just read from `unit`, or sent to it.
  void NoteRead(std::uint8_t unit);
  void NoteSent(std::uint8_t unit);
  // A record has changed: what was sent is no longer what is shown.
  void NoteEdit() { Offer(std::nullopt); }
  // Ends the comparison.
  void Dismiss();

 private:
  UnitPlace Chosen() const { return {link_.CommPort(), target_.UnitId()}; }
  void Offer(const std::optional<UnitPlace>& place);

  Comparison& comparison_;
  const HwSerial& link_;
  const UnitTarget& target_;
  ChannelStrip& channels_;
  MotionParameters& parameters_;
  ChannelChoices& choices_;
  StatusLine& status_;
  SummaryArea* summary_ = nullptr;
  MainMenu* menu_ = nullptr;
  std::optional<UnitPlace> offered_;
  bool shown_ = false;
};

}  // namespace tendril
