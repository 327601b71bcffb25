// The ProcessList of this system. Each system compiles its own implementation: posix/ or windows/.
#pragma once

#include <memory>

#include "platform/process_list.h"

namespace tendril {

// Windows: finds a program by the name of its file. Linux, macOS: by the system's name of the program, or by its first
// or second argument without folders: a program in an emulator or interpreter appears there. A process that has ended
// does not count, even when its parent has not waited for it yet.
std::unique_ptr<ProcessList> OpenProcessList();

}  // namespace tendril
