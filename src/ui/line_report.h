// LineReport: what support needs to see of the line, as text.
#pragma once

#include <QString>
#include <cstddef>
#include <cstdint>
#include <deque>
#include <string>

#include "serial/hw_serial.h"
#include "trace/line_trace.h"
#include "ui/program_info.h"

namespace tendril {

// Lines of the trace that a report has at most.
inline constexpr std::size_t kReportedLines = 200;

// The program, the system, the port with its device, the unit and the verdict, each in a line of its own. After an empty
// line the last of `entries`, with tabs between the columns.
QString LineReport(const ProgramInfo& info, const HwSerial& link, std::uint8_t unit,
                   const std::string& verdict, const std::deque<TraceEntry>& entries);

}  // namespace tendril
