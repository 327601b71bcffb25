// Text in lines of a limited width.
#pragma once

#include <QString>
#include <QStringList>

namespace tendril::ctl {

// The lines of `text`, broken at spaces: as long as `columns` at most, unless a single word is longer. At least one.
QStringList Folded(const QString& text, qsizetype columns);

}  // namespace tendril::ctl
