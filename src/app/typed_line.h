// The line that the user types on the terminal.
#pragma once

#include <QString>
#include <optional>

#include "ctl/environment.h"

namespace tendril {

// Waits for a line from the terminal at standard input, while the event loop runs. Nothing when the input ends, or when
// a stop was requested meanwhile.
std::optional<QString> ReadTypedLine(ctl::Waiting& waiting, const ctl::StopRequest& stop);

}  // namespace tendril
