// UnitWork: the steps of the commands that take units one after the other.
#pragma once

#include <QString>
#include <cstdint>
#include <functional>
#include <span>
#include <vector>

#include "config/channel_config.h"
#include "config/option_bytes.h"
#include "ctl/program.h"
#include "ctl/unit_progress.h"
#include "ctl/unit_result.h"
#include "exchange/configuration_text.h"

namespace tendril::ctl {

// The option bytes of `records`, which can be sent.
OptionTable OptionsOf(const ChannelTable& records);
// The records of what a unit holds, as a get has them.
ChannelTable RecordsOf(const OptionTable& held);
// The configuration that `unit` holds, read now.
ConfigurationText ConfigurationOf(const Environment& environment, std::uint8_t unit, const OptionTable& held);

// Each step sets the result, and returns whether all is well so that the next one may follow. `share`: see
// UnitProgress::BeginPhase().
class UnitWork {
 public:
  UnitWork(Job& job, UnitProgress& progress, UnitResult& result)
      : job_(job), progress_(progress), result_(result) {}

  std::uint8_t Unit() const { return result_.unit; }
  // Sets `held` to what the unit holds. `what` is the name of the step.
  bool Read(OptionTable& held, const QString& what, double share);
  // Writes `wanted` into the unit.
  bool Write(const OptionTable& wanted, double share);
  // Reads the unit and compares what it holds with `wanted`.
  bool Compare(const OptionTable& wanted, const QString& what, double share);
  // Writes what the unit holds to the file `path`; without one, it goes into the result. It differs where a file cannot
  // have all of it.
  bool Keep(const OptionTable& held, const QString& path);
  // Reads the unit and keeps what it holds in `path`, before something is written.
  bool BackUp(const QString& path, double share);

 private:
  bool Take(const CommandResult& end);
  bool Fail(const QString& reason);
  // Takes over the differences; all is well without any.
  bool SetDifferences(std::vector<PortsDifference> differences);

  Job& job_;
  UnitProgress& progress_;
  UnitResult& result_;
};

// Does `work` with each unit in turn. When the port is gone or a stop was requested, the rest is not tried.
std::vector<UnitResult> ForEachUnit(Job& job, std::span<const std::uint8_t> units,
                                    const std::function<void(UnitWork&)>& work);

}  // namespace tendril::ctl
