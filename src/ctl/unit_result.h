// UnitResult: how a command has ended for one unit, and the report about all of them.
#pragma once

#include <QJsonArray>
#include <QString>
#include <cstdint>
#include <vector>

#include "config/option_bytes.h"
#include "config/option_differences.h"
#include "ctl/environment.h"
#include "ctl/report.h"
#include "unitops/send_operation.h"

namespace tendril::ctl {

// A part that is not as it should be, in the same way in some ports.
struct PortsDifference {
  // "3", "1-3, 8".
  QString Ports() const;
  // "virtual range".
  QString Name() const;

  std::vector<int> ports;  // from 1, in order
  OptionDifference part;
};
// All parts in which `held` differs from `wanted`, each way of it once.
std::vector<PortsDifference> DifferencesBetween(const OptionTable& wanted, const OptionTable& held);
// The differences for the JSON document.
QJsonArray ToJson(const std::vector<PortsDifference>& differences);

struct UnitResult {
  enum class Outcome { kDone, kDiffers, kFailed, kCancelled, kNotTried };

  std::uint8_t unit = 0;
  Outcome outcome = Outcome::kNotTried;
  SendOperation::Written written = SendOperation::Written::kNothing;
  bool compared = false;          // what the unit holds with what it should
  QString file = {};              // that was written with what the unit held
  QByteArray configuration = {};  // the same, when no file was wanted
  QString reason = {};            // kFailed: why, in sentences
  QString aftermath = {};         // of a send that has not ended well: how it has left the unit
  std::vector<PortsDifference> differences = {};
};

// What is to be said of a unit that is not done, in lines: sentences, or the differences.
QStringList Remarks(const UnitResult& result);
// A line for progress: "written, holds it".
QString InWords(const UnitResult& result);

// What the table has beside the unit and what is to be said of it.
struct ResultColumns {
  bool written = false;
  bool compared = false;
  QString file = {};  // the heading of the files; empty: there are none
};

// The table, the member "units" and, unless all are done, a sentence about all of them with the IDs for another run.
Report ReportOf(const std::vector<UnitResult>& results, const ResultColumns& columns,
                const Terminal& terminal);

}  // namespace tendril::ctl
