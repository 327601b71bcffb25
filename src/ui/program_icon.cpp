#include "ui/program_icon.h"

namespace tendril {

QIcon ProgramIcon() {
  QIcon icon;
  for (const int size : {16, 32, 48, 64, 128, 256})
    icon.addFile(QStringLiteral(":/icons/tendril-utility-%1.png").arg(size), QSize(size, size));
  return icon;
}

}  // namespace tendril
