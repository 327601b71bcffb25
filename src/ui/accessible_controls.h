// What assistive technology sees of the controls whose actions Qt does not carry out as clicks.
#pragma once

namespace tendril {

// From now on the actions of check boxes, radio buttons, the lines of CalmComboBox and PressableText do what the mouse
// does. Qt's own would toggle a button without a click, and select a line without choosing it. To be called before
// the first of these controls is made; more calls do nothing.
void InstallAccessibleControls();

}  // namespace tendril
