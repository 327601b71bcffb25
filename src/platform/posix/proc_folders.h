// The running processes, as Linux lists them below /proc.
#pragma once

#include <filesystem>
#include <functional>

namespace tendril {

// Whether `matches` holds for the folder of any process.
bool AnyProcess(const std::function<bool(const std::filesystem::path& process)>& matches);

// Whether another process has `device`, a path without links, open. Sees only what this user may see.
bool OpenInAnotherProcess(const std::filesystem::path& device);

}  // namespace tendril
