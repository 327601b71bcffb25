// The accessible interfaces of controls whose actions Qt does not carry out as clicks.
#pragma once

namespace tendril {

// Makes the accessible actions of check boxes, radio buttons, CalmComboBox lines and PressableText do what the mouse
// does. Qt's own actions toggle a button without a click, and select a line without choosing it. Call it before the
// first of these controls is created; further calls have no effect.
void InstallAccessibleControls();

}  // namespace tendril
