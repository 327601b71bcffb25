// The accessible interfaces of controls that Qt does not describe or use as the mouse does.
#pragma once

namespace tendril {

// Gives check boxes, radio buttons, OutputButton, CalmComboBox with its lines, PressableText, Announcement, stacks and
// plain frames accessible interfaces of their own. Qt's toggle a button without a click, select a line without choosing
// it, call a combo box by its current line, and a frame a window. Call it before the first of these controls is created;
// further calls have no effect.
void InstallAccessibleControls();

}  // namespace tendril
