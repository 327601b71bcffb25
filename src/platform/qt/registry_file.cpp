#include "platform/qt/registry_file.h"

#include <QDir>
#include <QFile>
#include <QFileInfo>
#include <QSaveFile>
#include <exception>
#include <utility>

#include "platform/qt/registry_text.h"

namespace tendril {
namespace {

constexpr std::size_t kMaxWarnedLines = 20;
constexpr int kLockMs = 2000;  // other programs hold the lock for moments

// Reads the file to `bytes`. Returns what went wrong, as the end of a sentence that begins with the path.
QString ReadWhole(const QString& path, QByteArray& bytes) {
  const QFileInfo about(path);
  if (!about.exists()) return QStringLiteral(" is not there.");
  if (!about.isFile())
    return QStringLiteral(" is not read: it is no regular file.");  // opening a pipe would wait
  if (about.size() > RegistryFile::kMaxBytes) {
    return QStringLiteral(" is not read: it is larger than %1 MiB.").arg(RegistryFile::kMaxBytes >> 20);
  }
  QFile file(path);
  if (file.open(QIODevice::ReadOnly)) bytes = file.readAll();
  if (file.error() != QFileDevice::NoError) return QStringLiteral(" is not read: ") + file.errorString();
  return bytes.isEmpty() ? QStringLiteral(" is empty.") : QString();
}

}  // namespace

RegistryFile::RegistryFile(const QString& path, WarningSink warn)
    : path_(path), warn_(std::move(warn)), lock_(path + QStringLiteral(".lock")) {}

RegistryFile::~RegistryFile() { Settle(); }

void RegistryFile::Warn(const QString& text) const {
  if (warn_) warn_((path_ + text).toStdString());
}

void RegistryFile::Refresh() {
  QByteArray bytes;
  const QString fault = ReadWhole(path_, bytes);
  if (loaded_ && bytes == bytes_ && fault == fault_) return;
  loaded_ = true;
  bytes_ = bytes;
  fault_ = fault;
  writable_ = fault.isEmpty() || !QFileInfo::exists(path_);
  memory_.SetKeys({});
  if (fault.isEmpty()) {
    Parse();
  } else {
    Warn(fault);
  }
}

void RegistryFile::Parse() {
  if (bytes_.isEmpty()) Warn(QStringLiteral(" is empty."));
  std::size_t unread_lines = 0;
  try {
    memory_.SetKeys(ReadRegistryText(bytes_, [&](std::size_t line) {
      if (++unread_lines <= kMaxWarnedLines) Warn(QStringLiteral(", line %1 cannot be read.").arg(line));
    }));
  } catch (const std::exception& fault) {
    writable_ = false;
    Warn(QStringLiteral(" is not read: ") + QString::fromUtf8(fault.what()));
  }
  if (unread_lines > kMaxWarnedLines) {
    Warn(QStringLiteral(": %1 more lines cannot be read.").arg(unread_lines - kMaxWarnedLines));
  }
}

std::int32_t RegistryFile::Change(const std::function<std::int32_t()>& call) {
  if (!lock_.isLocked()) {
    QDir().mkpath(QFileInfo(path_).path());
    if (!lock_.tryLock(kLockMs)) return kRegLockViolation;
    Refresh();
  }
  const std::int32_t code = writable_ ? call() : kRegAccessDenied;
  if (code == kRegSuccess) changed_ = true;
  if (!memory_.HasOpenKeys()) Settle();
  return code;
}

std::int32_t RegistryFile::Settle() {
  bool kept = true;
  if (std::exchange(changed_, false)) {
    bytes_ = WriteRegistryText(memory_.keys());
    QSaveFile file(path_);
    // A larger one could not be read again. Qt 6.4 commits what it could not flush.
    kept = bytes_.size() <= kMaxBytes && file.open(QIODevice::WriteOnly) &&
           file.write(bytes_) == bytes_.size() && file.flush() && file.commit();
    fault_.clear();
    loaded_ = kept;  // what could not be kept is forgotten too
    if (!kept) Warn(QStringLiteral(" cannot be written: ") + file.errorString());
  }
  lock_.unlock();
  return kept ? kRegSuccess : kRegIoFailed;
}

std::int32_t RegistryFile::OpenKey(RootKey root, const std::string& path, std::uint32_t access,
                                   RegistryHandle& key) {
  if (!memory_.HasOpenKeys()) Refresh();
  return memory_.OpenKey(root, path, access, key);
}

std::int32_t RegistryFile::CreateKey(RootKey root, const std::string& path, RegistryHandle& key) {
  if (OpenKey(root, path, kKeyAllAccess, key) == kRegSuccess) return kRegSuccess;
  return Change([&] { return memory_.CreateKey(root, path, key); });
}

std::int32_t RegistryFile::QueryValue(RegistryHandle key, const std::string& name, std::uint32_t& type,
                                      std::uint8_t* data, std::uint32_t& size) {
  return memory_.QueryValue(key, name, type, data, size);
}

std::int32_t RegistryFile::SetValue(RegistryHandle key, const std::string& name, std::uint32_t type,
                                    std::span<const std::uint8_t> data) {
  return Change([&] { return memory_.SetValue(key, name, type, data); });
}

std::int32_t RegistryFile::DeleteKey(RegistryHandle key, const std::string& subkey) {
  return Change([&] { return memory_.DeleteKey(key, subkey); });
}

std::int32_t RegistryFile::CloseKey(RegistryHandle key) {
  const std::int32_t code = memory_.CloseKey(key);
  return code != kRegSuccess || memory_.HasOpenKeys() ? code : Settle();
}

}  // namespace tendril
