// The programs that run on this system. Each system compiles its own implementation: posix/ or windows/.
#pragma once

#include <memory>

#include "platform/process_list.h"

namespace tendril {

// Windows: by the name of a program's file. Linux, macOS: by the name that the system has for the program, or by
// the first of its arguments or the one behind, without their folders: that is how a program shows which runs in
// an emulator or an interpreter. A program that has ended does not run, even if nobody has asked for its end yet.
std::unique_ptr<ProcessList> OpenProcessList();

}  // namespace tendril
