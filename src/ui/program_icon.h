// The program's icon.
#pragma once

#include <QIcon>

namespace tendril {

// In all sizes from 16 to 256 pixels. Decodes them, which takes some milliseconds.
QIcon ProgramIcon();

}  // namespace tendril
