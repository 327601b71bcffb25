#include "platform/paths.h"

#include <pwd.h>
#include <unistd.h>

#include <cstdlib>

namespace tendril {
namespace {

namespace fs = std::filesystem;

fs::path HomeFolder() {
  const char* home = std::getenv("HOME");
  if (home != nullptr && *home != '\0') return home;
  const passwd* entry = ::getpwuid(::geteuid());
  return entry != nullptr ? entry->pw_dir : "/";
}

// The base folder that `variable` names. One that is not absolute does not count: it would move with the
// folder that the program happens to be started in.
fs::path BaseFolder(const char* variable, const char* below_home) {
  if (const char* value = std::getenv(variable); value != nullptr && *value == '/') return value;
  return HomeFolder() / below_home;
}

}  // namespace

fs::path ConfigFolder() { return BaseFolder("XDG_CONFIG_HOME", ".config") / "kelvane"; }

fs::path StateFolder() { return BaseFolder("XDG_STATE_HOME", ".local/state") / "kelvane"; }

fs::path CommandLogPath() { return StateFolder() / "HUtest.txt"; }

fs::path RegistryPath() { return ConfigFolder() / "registry.reg"; }

}  // namespace tendril
