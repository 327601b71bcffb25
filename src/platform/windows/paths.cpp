#include "platform/paths.h"

namespace tendril {

// The separator after the drive is doubled; Windows takes the two for one.
std::filesystem::path CommandLogPath() { return "C:\\\\NYXDev\\HUtest.txt"; }

std::filesystem::path RegistryPath() { return "HKEY_CURRENT_USER\\Software\\Kelvane"; }

}  // namespace tendril
