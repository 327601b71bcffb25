#include <QList>

#include "config/option_bytes.h"
#include "exchange/configuration_text.h"
#include "exchange/format_names.h"
#include "exchange/strict_json.h"
#include "platform/hex_text.h"

namespace tendril {
namespace exchange {
namespace {

// The members of an object, in the order in which they are added. Qt's own objects sort theirs by name.
class MemberLines {
 public:
  void Add(const char* name, const QByteArray& value) {
    lines_ += JsonText(QLatin1StringView(name)) + ": " + value;
  }
  void AddText(const char* name, const QString& text) { Add(name, JsonText(text)); }
  void AddText(const char* name, const char* word) { AddText(name, QString::fromLatin1(word)); }
  void AddText(const char* name, const std::optional<QString>& text) {
    if (text) AddText(name, *text);
  }

  // The object, each member in a line of its own.
  QByteArray Object(const QByteArray& indent) const {
    return "{\n" + indent + "  " + lines_.join(",\n" + indent + "  ") + '\n' + indent + '}';
  }

 private:
  QByteArrayList lines_;
};

QByteArray PortObject(std::size_t slot, const std::optional<QString>& name, const ChannelConfig& record) {
  const auto number = [](auto value) { return QByteArray::number(static_cast<qlonglong>(value)); };
  MemberLines port;
  port.Add("port", number(slot + 1));
  port.AddText("name", name);
  port.AddText("kind", kKinds.at(static_cast<std::size_t>(record.PortType - kPortServo)));
  for (const auto& [field, value] : kPairFields) {
    const auto& [low, high] = record.*value;
    port.Add(field, '[' + number(low) + ", " + number(high) + ']');
  }
  for (const auto& [field, value] : kWidthFields) port.Add(field, number(record.*value));
  port.AddText("powerUp", kPowerUps.at(static_cast<std::size_t>(record.PowerUPOpt - kPowerUpDefault)));
  port.AddText("lostCommunication",
               kLostCommunications.at(static_cast<std::size_t>(record.LostCommOption - kLostCommHold)));
  return port.Object("    ");
}

}  // namespace
}  // namespace exchange

std::variant<QByteArray, Refusal> WriteConfiguration(const ConfigurationText& configuration) {
  using namespace exchange;
  QByteArrayList ports;
  for (std::size_t slot = 0; slot < kPortCount; ++slot) {
    const ChannelConfig& record = configuration.records.At(slot);
    const auto encoded = EncodeOptions(record);
    if (const auto* invalid = std::get_if<InvalidRecord>(&encoded)) {
      return Refusal{QStringLiteral("port %1").arg(slot + 1),
                     QString::fromStdString(invalid->field) + QStringLiteral(" cannot be sent")};
    }
    ports += PortObject(slot, configuration.names[slot], record);
  }
  MemberLines top;
  top.AddText("format", kFormat);
  top.Add("version", QByteArray::number(kVersion));
  if (configuration.unit) top.AddText("unit", QString::fromStdString(HexByte(*configuration.unit)));
  top.AddText("read", configuration.read);
  top.AddText("note", configuration.note);
  top.Add("ports", "[\n    " + ports.join(",\n    ") + "\n  ]");
  QByteArray text = top.Object({}) + '\n';
  if (text.size() > kMaxConfigurationText)
    return Refusal{{}, QStringLiteral("the text is larger than 1 MiB")};
  return text;
}

}  // namespace tendril
