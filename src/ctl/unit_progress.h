// UnitProgress: the progress of a command that takes units one after the other.
#pragma once

#include <QString>
#include <cstddef>
#include <cstdint>
#include <string>

#include "ctl/program.h"
#include "ctl/progress.h"

namespace tendril::ctl {

// "unit 0A (3 of 40): port 5 of 8, 00:31 left".
class UnitProgress {
 public:
  // Takes the session's step handler. The job must outlive it.
  UnitProgress(Job& job, std::size_t units);
  ~UnitProgress();
  UnitProgress(const UnitProgress&) = delete;
  UnitProgress& operator=(const UnitProgress&) = delete;

  // The next unit follows.
  void BeginUnit(std::uint8_t unit);
  // The session's next command is called `what` ("compare"; empty for the main one), and is `share` of what is done
  // with each unit, 0 to 1.
  void BeginPhase(const QString& what, double share);
  // The unit is done: `outcome` says how it is. Of several units, each has a line where no terminal shows progress.
  void EndUnit(const QString& outcome);

 private:
  void ShowStep(const std::string& step, double part);
  // "unit 0A (3 of 40): ".
  QString Place() const;

  Job& job_;
  Progress progress_;
  std::size_t units_;
  std::size_t done_ = 0;
  std::uint8_t unit_ = 0;
  QString phase_;
  double phases_done_ = 0;  // of this unit
  double share_ = 0;        // of the phase
};

}  // namespace tendril::ctl
