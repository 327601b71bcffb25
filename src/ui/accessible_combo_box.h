// The accessible interfaces of a CalmComboBox, of its list and of the list's lines.
#pragma once

#include <QAccessibleInterface>
#include <QObject>

namespace tendril {

// Returns a new interface for a CalmComboBox or its list; nullptr for any other object.
QAccessibleInterface* CreateComboBoxInterface(QObject* object);

}  // namespace tendril
