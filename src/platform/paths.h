// The paths of the program's files. Each system compiles its own implementation: posix/ or windows/.
#pragma once

#include <filesystem>

namespace tendril {

#ifndef _WIN32
// `$XDG_CONFIG_HOME/kelvane`, by default `~/.config/kelvane`. Not created.
std::filesystem::path ConfigFolder();

// `$XDG_STATE_HOME/kelvane`, by default `~/.local/state/kelvane`. Not created.
std::filesystem::path StateFolder();
#endif

// The log of unit-wide commands, a text file. Neither it nor its folder is created.
std::filesystem::path CommandLogPath();

// The registry. Windows: the key of the program's maker. Linux, macOS: a file in the configuration folder, not created.
std::filesystem::path RegistryPath();

}  // namespace tendril
