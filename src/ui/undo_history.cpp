#include "ui/undo_history.h"

#include <QUndoCommand>
#include <utility>

namespace tendril {
namespace {

constexpr int kMostSteps = 100;
constexpr std::size_t kMostBytes = std::size_t{512} * 1024;
static_assert(std::size_t{kMostSteps} * sizeof(EditedConfiguration::Snapshot) < kMostBytes);

}  // namespace

class UndoHistory::Step : public QUndoCommand {
 public:
  Step(UndoHistory& history, const QString& what, State before, State after)
      : QUndoCommand(what), history_(history), before_(std::move(before)), after_(std::move(after)) {}

  void undo() override { history_.GoTo(before_); }
  void redo() override { history_.GoTo(after_); }

 private:
  UndoHistory& history_;
  const State before_;
  const State after_;
};

UndoHistory::UndoHistory(EditedConfiguration& configuration)
    : configuration_(configuration),
      now_(std::make_shared<EditedConfiguration::Snapshot>(configuration.Take())) {
  stack_.setUndoLimit(kMostSteps);
}

std::vector<std::size_t> UndoHistory::Note(const QString& what, bool goes_on) {
  auto changed = ChannelsThatDiffer(configuration_.Records(), now_->records);
  // What belongs to no record is brought back with the records as it was last.
  const bool same_step = goes_on && grows_;
  grows_ = !changed.empty();
  if (changed.empty() || same_step) {
    *now_ = configuration_.Take();
    return changed;
  }
  auto before = std::exchange(now_, std::make_shared<EditedConfiguration::Snapshot>(configuration_.Take()));
  const QString channels = QString::fromStdString(ChannelsInWords(changed));
  stack_.push(new Step(*this, QStringLiteral("%1 (%2)").arg(what, channels), std::move(before), now_));
  return changed;
}

void UndoHistory::GoTo(const State& state) {
  if (state == now_) return;  // a new step's first redo
  now_ = state;
  grows_ = false;
  configuration_.Restore(*now_);
}

}  // namespace tendril
