#include "platform/system_registry.h"

#include "platform/paths.h"
#include "platform/posix/registry_file.h"

namespace tendril {

std::unique_ptr<RegistryStore> OpenSystemRegistry(const WarningSink& warn) {
  return std::make_unique<RegistryFile>(ConfigFolder() / "registry.reg", warn);
}

}  // namespace tendril
