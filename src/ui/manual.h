// The user's manual.
#pragma once

#include "platform/message_boxes.h"

namespace tendril {

// Opens the manual in the system's own viewer. When that fails, a box says where the manual is.
void OpenManual(MessageBoxes& boxes);

}  // namespace tendril
