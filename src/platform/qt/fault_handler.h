// What the adapters do with a failure that comes back to them from the program's own code.
#pragma once

#include <functional>
#include <string>

namespace tendril {

// Is told, in plain UTF-8 text, of a failure that nobody nearer could handle, so that it can be shown. It may
// run the event loop.
using FaultHandler = std::function<void(const std::string& description)>;

// Tells `on_fault` of a failure; without a handler, or when the handler fails, the log.
void TellFault(const FaultHandler& on_fault, const std::string& description) noexcept;

// Makes a call from the event loop into the program. A failure goes to `on_fault` and no further: one that
// got into the event loop would end the program.
void CallGuarded(const FaultHandler& on_fault, const std::function<void()>& call) noexcept;

}  // namespace tendril
