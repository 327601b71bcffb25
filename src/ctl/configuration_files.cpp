#include "ctl/configuration_files.h"

#include <QDir>
#include <QFile>
#include <QFileInfo>
#include <QJsonDocument>
#include <QSaveFile>
#include <cstdio>
#include <filesystem>
#include <system_error>

#include "ctl/unit_ids.h"

namespace tendril::ctl {
namespace {

using namespace Qt::StringLiterals;

// "show.json cannot be read: No such file or directory." On Windows the reason ends in a full stop of its own.
QString Cannot(const QString& path, QLatin1StringView what, const QString& reason) {
  return u"%1 cannot be %2: %3"_s.arg(path, what, reason) + (reason.endsWith(u'.') ? u""_s : u"."_s);
}

// The nearest folder above `path` that exists.
QFileInfo FolderOf(const QString& path) {
  QFileInfo folder(QFileInfo(path).absolutePath());
  while (!folder.exists() && !folder.isRoot()) folder = QFileInfo(folder.absolutePath());
  return folder;
}

// Why what stands at `path` may not be replaced. A link that leads nowhere stands there, too.
QString WhyNotReplaced(const QString& path, const CommandLine& line) {
  const QFileInfo file(path);
  if (!file.exists() && !file.isSymLink()) return {};
  if (file.isDir()) return u"%1 is a folder, not a file."_s.arg(path);
  // A file that is written whole takes the place of what stands there, also of a device.
  if (file.exists() && !file.isFile()) return u"%1 is not a regular file."_s.arg(path);
  if (line.force) return {};
  // When a command runs again after a part of its work, the older backup is the good one.
  const QString advice =
      line.backup.isEmpty() ? u"; --force overwrites it."_s : u": give --backup another folder."_s;
  return u"%1 exists already"_s.arg(path) + advice;
}

QString CreateFolderOf(const QString& path) {
  const QString folder = QDir::toNativeSeparators(QFileInfo(path).absolutePath());
  std::error_code fault;
  std::filesystem::create_directories(folder.toStdU16String(), fault);
  return fault
             ? u"The folder %1 cannot be created: %2."_s.arg(folder, QString::fromStdString(fault.message()))
             : QString();
}

// A disk that gets full takes a part, without a reason. The next write has it.
bool WriteAll(QIODevice& file, QByteArrayView text) {
  while (!text.isEmpty()) {
    const qint64 taken = file.write(text.data(), text.size());
    if (taken <= 0) return false;
    text = text.sliced(taken);
  }
  return true;
}

}  // namespace

QString NameOfFile(const QString& path) { return path == u"-" ? u"Standard input"_s : path; }

std::variant<ConfigurationText, QString> ReadConfigurationFile(const QString& path) {
  const bool standard_input = path == u"-";
  const QString name = NameOfFile(path);
  if (!standard_input && QFileInfo(path).isDir()) return u"%1 is a folder, not a file."_s.arg(path);
  QFile file(path);
  const bool open = standard_input ? file.open(stdin, QIODevice::ReadOnly) : file.open(QIODevice::ReadOnly);
  // What is too long is refused, however much of it is read.
  const QByteArray text = open ? file.read(kMaxConfigurationText + 1) : QByteArray();
  if (file.error() != QFileDevice::NoError) return Cannot(name, "read"_L1, file.errorString());
  auto configuration = ReadConfiguration(text);
  if (const auto* refusal = std::get_if<Refusal>(&configuration))
    return u"%1: %2."_s.arg(name, refusal->Sentence());
  return std::get<ConfigurationText>(std::move(configuration));
}

QJsonObject AsJson(const QByteArray& configuration) {
  return QJsonDocument::fromJson(configuration).object();
}

QString UnitFileName(std::uint8_t unit) { return u"unit-%1.json"_s.arg(IdText(unit)); }

QString UnitFilePath(const QString& folder, std::uint8_t unit) {
  if (folder.isEmpty()) return UnitFileName(unit);
  return QDir::toNativeSeparators(QDir(folder).filePath(UnitFileName(unit)));
}

QString WhyNotWritable(const QString& path, const CommandLine& line) {
  QString reason = WhyNotReplaced(path, line);
  if (!reason.isEmpty()) return reason;
  const QFileInfo folder = FolderOf(path);
  const QString name = QDir::toNativeSeparators(folder.filePath());
  if (!folder.isDir()) return Cannot(path, "written"_L1, u"%1 is not a folder"_s.arg(name));
  if (!folder.isWritable())
    return Cannot(path, "written"_L1, u"the folder %1 is write-protected"_s.arg(name));
  return {};
}

QString WhyNoneWritable(std::span<const std::uint8_t> units, const PathOfUnit& path_of,
                        const CommandLine& line) {
  for (const std::uint8_t unit : units) {
    QString reason = WhyNotWritable(path_of(unit), line);
    if (!reason.isEmpty()) return reason;
  }
  return {};
}

QString WriteNewFile(const QString& path, const QByteArray& text, const CommandLine& line) {
  QString no_folder = CreateFolderOf(path);
  if (!no_folder.isEmpty()) return no_folder;
  QSaveFile file(path);
  const bool written = file.open(QIODevice::WriteOnly | QIODevice::Unbuffered) && WriteAll(file, text);
  // As late as can be: another program may have written it since the command began.
  QString reason = WhyNotReplaced(path, line);
  if (!reason.isEmpty()) return reason;
  return written && file.commit() ? QString() : Cannot(path, "written"_L1, file.errorString());
}

}  // namespace tendril::ctl
