// The line to the network as text, for --trace and monitor.
#pragma once

#include <QByteArray>
#include <cstdint>
#include <string>

#include "ctl/environment.h"
#include "trace/line_trace.h"

namespace tendril::ctl {

// "14:02:03.125  unit     FE 2A 01 00   reply to '*': here is unit 01", with the line's end. `from`: who sent it.
QByteArray TraceLine(const TraceEntry& entry, const std::string& from);

// Prints each entry of a trace on standard error, as it comes.
class TraceOutput {
 public:
  // Takes the trace's handler. Both must outlive it.
  TraceOutput(LineTrace& trace, Terminal& terminal);
  ~TraceOutput();
  TraceOutput(const TraceOutput&) = delete;
  TraceOutput& operator=(const TraceOutput&) = delete;

 private:
  void PrintNew();

  LineTrace& trace_;
  Terminal& terminal_;
  std::uint64_t next_ = 0;  // the number of the next entry
};

}  // namespace tendril::ctl
