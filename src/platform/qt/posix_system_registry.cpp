#include <QFile>

#include "platform/paths.h"
#include "platform/qt/registry_file.h"
#include "platform/system_registry.h"

namespace tendril {

std::unique_ptr<RegistryStore> OpenSystemRegistry(const WarningSink& warn) {
  const std::filesystem::path path = ConfigFolder() / "registry.reg";
  return std::make_unique<RegistryFile>(QFile::decodeName(path.c_str()), warn);
}

}  // namespace tendril
