// The user's manual.
#pragma once

#include <QString>

#include "platform/message_boxes.h"
#include "ui/model/manual_chapter.h"

namespace tendril {

// Opens a chapter of the manual in the system's own viewer. Returns the sentence that says where the chapter is, since a
// system without a viewer may open nothing. When it is known that nothing opens, a box says so, and the sentence is empty.
QString OpenManual(ManualChapter chapter, MessageBoxes& boxes);

}  // namespace tendril
