// The registry of this system. Each system compiles its own implementation: posix/ or windows/.
#pragma once

#include <memory>

#include "platform/registry_store.h"

namespace tendril {

// Windows: the current user's registry, by the platform's own calls. Linux, macOS: the file `registry.reg` in the
// configuration folder, which is not made before something is written; what of it cannot be read is told to `warn`.
std::unique_ptr<RegistryStore> OpenSystemRegistry(const WarningSink& warn);

}  // namespace tendril
