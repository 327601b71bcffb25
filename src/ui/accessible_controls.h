// The accessible interfaces of controls that Qt does not describe or use as the mouse does.
#pragma once

namespace tendril {

// Gives check boxes, radio buttons, OutputButton, CalmComboBox with its lines, PressableText and Announcement accessible
// interfaces whose actions do what the mouse does. Qt's own toggle a button without a click, select a line without
// choosing it, and call a combo box by its current line. Call it before the first of these controls is created; further
// calls have no effect.
void InstallAccessibleControls();

}  // namespace tendril
