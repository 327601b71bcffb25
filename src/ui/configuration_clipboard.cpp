#include "ui/configuration_clipboard.h"

#include <QClipboard>
#include <QGuiApplication>

#include "exchange/configuration_text.h"

namespace tendril {

QString CopyAsText(const EditedConfiguration& configuration) {
  ConfigurationText content;
  content.records = configuration.Records();
  if (const auto reading = configuration.Origin().UnchangedReading()) {
    content.unit = reading->unit;
    content.read = QString::fromStdString(reading->time);
  }
  const auto written = WriteConfiguration(content);
  if (const auto* refusal = std::get_if<Refusal>(&written))
    return QStringLiteral("Not copied: ") + refusal->Sentence();
  QGuiApplication::clipboard()->setText(QString::fromUtf8(std::get<QByteArray>(written)));
  return QStringLiteral("Copied the configuration: %1 channels").arg(kPortCount);
}

QString PasteText(EditedConfiguration& configuration) {
  const QString text = QGuiApplication::clipboard()->text();
  if (text.isEmpty()) return QStringLiteral("Not pasted: there is no text on the clipboard");
  // What is too long is refused, however much of it is looked at.
  const auto read = ReadConfiguration(text.left(kMaxConfigurationText + 1).toUtf8());
  if (const auto* refusal = std::get_if<Refusal>(&read))
    return QStringLiteral("Not pasted: ") + refusal->Sentence();
  configuration.TakeOver(std::get<ConfigurationText>(read).records);
  return {};
}

}  // namespace tendril
