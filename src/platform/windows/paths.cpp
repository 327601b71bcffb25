#include "platform/paths.h"

namespace tendril {

// The separator after the drive is doubled in the path as it has always been stored; Windows takes both for
// one.
std::filesystem::path CommandLogPath() { return "C:\\\\NYXDev\\HUtest.txt"; }

}  // namespace tendril
