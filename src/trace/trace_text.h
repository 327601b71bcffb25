// The columns of the trace as text.
#pragma once

#include <string>

#include "trace/line_trace.h"

namespace tendril {

// Whether it is noise that says something of the line: zero bytes alone do not.
bool IsNoise(const TraceEntry& entry);
// Its bytes: "FE 2A 01 00". A longer packet ends in "...", and its size.
std::string TraceBytes(const TraceEntry& entry);
// What it means, on one line. A sign stands before what should not happen: "⚠ no reply in time".
std::string TraceMeaning(const TraceEntry& entry);

}  // namespace tendril
