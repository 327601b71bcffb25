#include "ui/manual.h"

#include <QCoreApplication>
#include <QDesktopServices>
#include <QDir>
#include <QFile>
#include <QUrl>

namespace tendril {
namespace {

// Both from the program's folder: where the manual is installed, and where the build has it.
constexpr const char* kManualPlaces[] = {TENDRIL_INSTALLED_MANUAL, TENDRIL_BUILT_MANUAL};

// In the first place where there is one; else in the first place.
QString PathOf(ManualChapter chapter) {
  const std::string_view page = PageOf(chapter);
  const QString file =
      u'/' + QString::fromUtf8(page.data(), qsizetype(page.size())) + QStringLiteral(TENDRIL_MANUAL_SUFFIX);
  const QDir program(QCoreApplication::applicationDirPath());
  for (const char* place : kManualPlaces) {
    QString path = QDir::cleanPath(program.filePath(QString::fromUtf8(place) + file));
    if (QFile::exists(path)) return path;
  }
  return QDir::cleanPath(program.filePath(QString::fromUtf8(kManualPlaces[0]) + file));
}

}  // namespace

QString OpenManual(ManualChapter chapter, MessageBoxes& boxes) {
  const QString path = PathOf(chapter);
  const QString shown = QDir::toNativeSeparators(path);
  if (QFile::exists(path) && QDesktopServices::openUrl(QUrl::fromLocalFile(path)))
    return QStringLiteral("Opening the manual: ") + shown;
  const QString text = QFile::exists(path) ? QStringLiteral("The manual cannot be opened. It is here:")
                                           : QStringLiteral("The manual is missing. It belongs here:");
  boxes.Show(
      {(text + QStringLiteral("\r\n") + shown).toStdString(), kDefaultBoxTitle, BoxIcon::kExclamation});
  return {};
}

}  // namespace tendril
