#include "ctl/unit_progress.h"

#include <utility>

#include "ctl/unit_ids.h"

namespace tendril::ctl {

using namespace Qt::StringLiterals;

UnitProgress::UnitProgress(Job& job, std::size_t units)
    : job_(job), progress_(job.line, job.environment), units_(units) {
  job_.units.SetStepHandler([this](const std::string& step, double part) { ShowStep(step, part); });
}

UnitProgress::~UnitProgress() { job_.units.SetStepHandler(nullptr); }

void UnitProgress::BeginUnit(std::uint8_t unit) {
  unit_ = unit;
  phases_done_ = 0;
  share_ = 0;
}

void UnitProgress::BeginPhase(const QString& what, double share) {
  phase_ = what.isEmpty() ? QString() : what + u", "_s;
  phases_done_ += std::exchange(share_, share);
}

void UnitProgress::EndUnit(const QString& outcome) {
  if (units_ > 1) progress_.Note(Place() + outcome);  // the report about one unit follows at once
  ++done_;
}

void UnitProgress::ShowStep(const std::string& step, double part) {
  const double of_unit = phases_done_ + part * share_;
  progress_.Show(Place() + phase_ + QString::fromStdString(step),
                 (static_cast<double>(done_) + of_unit) / static_cast<double>(units_));
}

QString UnitProgress::Place() const {
  return u"unit %1 (%2 of %3): "_s.arg(IdText(unit_)).arg(done_ + 1).arg(units_);
}

}  // namespace tendril::ctl
