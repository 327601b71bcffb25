#include "ui/comparison_signs.h"

#include "platform/hex_text.h"
#include "ui/time_of_day.h"

namespace tendril {

ComparisonSigns::ComparisonSigns(Comparison& comparison, const HwSerial& link, const UnitTarget& target,
                                 ChannelStrip& channels, MotionParameters& parameters,
                                 ChannelChoices& choices, StatusLine& status)
    : comparison_(comparison),
      link_(link),
      target_(target),
      channels_(channels),
      parameters_(parameters),
      choices_(choices),
      status_(status) {}

void ComparisonSigns::Show() {
  if (offered_ && *offered_ != Chosen()) Offer(std::nullopt);
  if (!comparison_.Any() && !shown_) return;
  shown_ = comparison_.Any();
  comparison_.Choose(Chosen());
  for (std::size_t channel = 0; channel < kPortCount; ++channel)
    channels_.ShowDiffers(channel, QString::fromStdString(comparison_.ChannelSentence(channel)));
  parameters_.ShowDifferences();
  choices_.ShowDifferences();
  if (summary_ != nullptr && summary_->isVisible()) summary_->ShowDifferences();
  status_.Compared().ShowResult(QString::fromStdString(comparison_.Sentence()),
                                QString::fromStdString(comparison_.Reading()));
  if (menu_ != nullptr) menu_->EnableDismiss(shown_);
}

void ComparisonSigns::NoteCompared(std::uint8_t unit, const OptionTable& held) {
  comparison_.Begin({link_.CommPort(), unit}, held, TimeOfDay());
  Show();
}

void ComparisonSigns::NoteFailure(bool cancelled) {
  comparison_.ReadingFailed(Chosen(), cancelled);
  Show();
}

void ComparisonSigns::NoteWriting() {
  comparison_.WritingBegins(Chosen());
  Show();
}

void ComparisonSigns::NoteBegun(bool changes_id) {
  Offer(std::nullopt);
  // The unit may be found at another ID from now on.
  if (changes_id && comparison_.Place().port == link_.CommPort()) comparison_.End();
  Show();
}

void ComparisonSigns::NoteRead(std::uint8_t unit) {
  if (MayBeSameUnit(comparison_.Place(), {link_.CommPort(), unit})) comparison_.End();
}

void ComparisonSigns::NoteSent(std::uint8_t unit) {
  const UnitPlace sent{link_.CommPort(), unit};
  if (MayBeSameUnit(comparison_.Place(), sent)) Dismiss();
  Offer(sent);
}

void ComparisonSigns::Dismiss() {
  comparison_.End();
  Show();
}

void ComparisonSigns::Offer(const std::optional<UnitPlace>& place) {
  if (place == offered_) return;
  offered_ = place;
  status_.Compared().OfferAfterSend(place ? QString::fromStdString(HexByte(place->unit)) : QString());
}

}  // namespace tendril
