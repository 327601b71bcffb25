#include "ui/window_facts.h"

#include <QString>

#include "ui/time_of_day.h"

namespace tendril {

void WindowFacts::Show() {
  status_.ShowUnit(QString::fromStdString(answers_.Sentence(link_.CommPort(), target_.UnitId())));
  const MovingFacts facts = Moving();
  if (shown_ == facts) return;
  shown_ = facts;
  status_.Moving().ShowMoving(QString::fromStdString(MovingSentence(facts)), facts.moves);
}

void WindowFacts::NotePoll(std::uint8_t unit, bool replied) {
  answers_.Note(link_.CommPort(), unit, replied, TimeOfDay());
  Show();
}

MovingFacts WindowFacts::Moving() const {
  const Moves moves = live_test_.Sweeps()        ? Moves::kSweep
                      : live_test_.SliderSends() ? Moves::kSlider
                                                 : Moves::kNothing;
  return {.moves = moves,
          .port = link_.CommPort(),
          .port_open = link_.PortOpen(),
          .unit = target_.UnitId(),
          .channel = choice_.Channel(),
          .command_runs = running_.Active()};
}

}  // namespace tendril
