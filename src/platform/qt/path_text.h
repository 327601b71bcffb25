// Paths as Qt has them, and as the standard library has them. Every character of a name stays as it is.
#pragma once

#include <QDir>
#include <QString>
#include <filesystem>

namespace tendril {

inline std::filesystem::path ToPath(const QString& text) { return text.toStdU16String(); }

// With the system's own separators.
inline QString FromPath(const std::filesystem::path& path) {
  return QDir::toNativeSeparators(QString::fromStdU16String(path.u16string()));
}

}  // namespace tendril
