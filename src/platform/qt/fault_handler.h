// Failures that reach an adapter from the program's own code.
#pragma once

#include <functional>
#include <string>

namespace tendril {

// Shows a failure that no caller handled; `description` is plain UTF-8 text. It may run the event loop.
using FaultHandler = std::function<void(const std::string& description)>;

// Reports a failure to `on_fault`; without a handler, or when the handler fails, to the log.
void ReportFault(const FaultHandler& on_fault, const std::string& description) noexcept;

// Makes a call from the event loop into the program. A failure goes to `on_fault`: one that got into the event loop
// would end the program.
void CallGuarded(const FaultHandler& on_fault, const std::function<void()>& call) noexcept;

}  // namespace tendril
