#include "ui/system_info.h"

#include <QSysInfo>

namespace tendril {

QString DescribeSystem() {
  return QStringLiteral("%1, %2 %3, %4")
      .arg(QSysInfo::prettyProductName(), QSysInfo::kernelType(), QSysInfo::kernelVersion(),
           QSysInfo::currentCpuArchitecture());
}

QString DescribeQt() {
  return QStringLiteral("%1, built with %2")
      .arg(QString::fromLatin1(qVersion()), QStringLiteral(QT_VERSION_STR));
}

}  // namespace tendril
