#include <QFileSystemWatcher>
#include <QString>
#include <QStringList>
#include <filesystem>
#include <system_error>
#include <utility>

#include "platform/port_names.h"
#include "platform/qt/port_watch.h"

namespace tendril {

struct PortWatch::Reports {
  QFileSystemWatcher folders;
};

PortWatch::PortWatch(std::function<void()> on_change) : reports_(std::make_unique<Reports>()) {
  CallWhenSettled(std::move(on_change));
  QObject::connect(&reports_->folders, &QFileSystemWatcher::directoryChanged, &settling_,
                   [this] { Noticed(); });
  for (const std::filesystem::path& folder : SerialDeviceFolders()) {
    std::error_code error;
    if (std::filesystem::is_directory(folder, error))
      reports_->folders.addPath(QString::fromStdString(folder.string()));
  }
}

PortWatch::~PortWatch() = default;

}  // namespace tendril
