#include <QFile>

#include "platform/paths.h"
#include "platform/qt/registry_file.h"
#include "platform/system_registry.h"

namespace tendril {

std::unique_ptr<RegistryStore> OpenSystemRegistry(const WarningSink& warn) {
  return std::make_unique<RegistryFile>(QFile(RegistryPath()).fileName(), warn);
}

}  // namespace tendril
