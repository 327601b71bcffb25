// The registry of this system. Each system compiles its own implementation: windows/, or qt/ on the others.
#pragma once

#include <memory>

#include "platform/registry_store.h"

namespace tendril {

// Windows: the current user's registry, by the platform's own calls. Linux, macOS: the file `registry.reg` in the
// configuration folder, which is not created before something is written; `warn` gets what of it cannot be read.
std::unique_ptr<RegistryStore> OpenSystemRegistry(const WarningSink& warn);

}  // namespace tendril
