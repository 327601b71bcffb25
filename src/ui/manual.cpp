#include "ui/manual.h"

#include <QCoreApplication>
#include <QDesktopServices>
#include <QDir>
#include <QFile>
#include <QUrl>

namespace tendril {
namespace {

// Both from the program's folder: where the manual is installed, and where the sources have it.
constexpr const char* kManualPlaces[] = {TENDRIL_INSTALLED_MANUAL, TENDRIL_SOURCE_MANUAL};

// The first place where there is one; else the first place.
QString ManualPath() {
  const QDir program(QCoreApplication::applicationDirPath());
  for (const char* place : kManualPlaces) {
    QString path = QDir::cleanPath(program.filePath(QString::fromUtf8(place)));
    if (QFile::exists(path)) return path;
  }
  return QDir::cleanPath(program.filePath(QString::fromUtf8(kManualPlaces[0])));
}

}  // namespace

void OpenManual(MessageBoxes& boxes) {
  const QString path = ManualPath();
  if (QFile::exists(path) && QDesktopServices::openUrl(QUrl::fromLocalFile(path))) return;
  const QString text = QFile::exists(path) ? QStringLiteral("The manual cannot be opened. It is here:")
                                           : QStringLiteral("The manual is missing. It belongs here:");
  boxes.Show({(text + QStringLiteral("\r\n") + QDir::toNativeSeparators(path)).toStdString(),
              kDefaultBoxTitle, BoxIcon::kExclamation});
}

}  // namespace tendril
