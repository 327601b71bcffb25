// The running processes, as Linux lists them below /proc.
#pragma once

#include <cstdint>
#include <filesystem>
#include <functional>

namespace tendril {

// Whether `matches` holds for the folder of any process.
bool AnyProcess(const std::function<bool(const std::filesystem::path& process)>& matches);

// Another process that has `device`, a path without links, open; 0 when there is none. Sees only what this user may
// see.
std::int64_t ProcessWithOpen(const std::filesystem::path& device);

}  // namespace tendril
