#include <QDateTime>
#include <QJsonArray>
#include <QJsonObject>
#include <QRegularExpression>
#include <algorithm>
#include <span>
#include <utility>

#include "config/option_bytes.h"
#include "exchange/configuration_text.h"
#include "exchange/format_names.h"
#include "exchange/strict_json.h"

namespace tendril {
namespace exchange {
namespace {

[[noreturn]] void Refuse(const QString& place, const QString& reason) { throw Refusal{place, reason}; }

// "5 is not a port".
[[noreturn]] void RefuseValue(const QString& place, const QJsonValue& value, const QString& wanted) {
  Refuse(place, QStringLiteral("%1 is not %2").arg(Quoted(value), wanted));
}

// Hands out the members of an object, each once; what is left then is unknown.
class Members {
 public:
  Members(const QJsonObject& object, QString place) : left_(object), place_(std::move(place)) {}

  bool Has(const char* name) const { return left_.contains(QLatin1StringView(name)); }

  QJsonValue Take(const char* name) {
    if (!Has(name)) Refuse(place_, QStringLiteral("\"%1\" is missing").arg(QLatin1StringView(name)));
    return left_.take(QLatin1StringView(name));
  }

  // The index of a word in `words`.
  int TakeWord(const char* name, std::span<const char* const> words) {
    const QJsonValue value = Take(name);
    QString wanted;
    for (std::size_t i = 0; i < words.size(); ++i) {
      if (value == QLatin1StringView(words[i])) return static_cast<int>(i);
      wanted += QLatin1StringView(i == 0 ? "" : i + 1 < words.size() ? ", " : " or ");
      wanted += QStringLiteral("\"%1\"").arg(QLatin1StringView(words[i]));
    }
    RefuseValue(PlaceOf(name), value, wanted);
  }

  std::optional<QString> TakeText(const char* name) {
    if (!Has(name)) return std::nullopt;
    const QJsonValue value = Take(name);
    if (!value.isString() || !value.toString().isValidUtf16())
      RefuseValue(PlaceOf(name), value, QStringLiteral("a text"));
    return value.toString();
  }

  // A text that `pattern` describes as a whole.
  std::optional<QString> TakeText(const char* name, const char* pattern, const char* wanted) {
    auto text = TakeText(name);
    const QRegularExpression whole(QRegularExpression::anchoredPattern(QString::fromLatin1(pattern)));
    if (text && !whole.match(*text).hasMatch())
      RefuseValue(PlaceOf(name), *text, QString::fromLatin1(wanted));
    return text;
  }

  // The place of a member, and of the object itself.
  QString PlaceOf(const char* name) const {
    return place_.isEmpty() ? QString::fromLatin1(name) : place_ + QStringLiteral(", ") + QLatin1String(name);
  }
  const QString& Place() const { return place_; }
  void SetPlace(const QString& place) { place_ = place; }

  void End() const {
    if (left_.isEmpty()) return;
    RefuseValue(place_, left_.constBegin().key(), QStringLiteral("a name of this format"));
  }

 private:
  QJsonObject left_;
  QString place_;
};

// Fills a record that can be sent, a field at a time: so each field is checked by the encoder's own rule, and what the
// encoder refuses is the field that was set last.
class PulseReader {
 public:
  PulseReader(Members& port, ChannelConfig& record) : port_(port), record_(record) {}

  // Anything but a whole number becomes 0, which no unit can hold.
  void TakePair(const char* name, PulsePair& pair) {
    const QJsonValue value = port_.Take(name);
    const QJsonArray both = value.toArray();
    pair = {both.at(0).toInt(), both.at(1).toInt()};
    if (both.size() != 2 || !Sendable())
      RefuseValue(port_.PlaceOf(name), value, QStringLiteral("a pair of whole numbers") + Bounds());
  }
  void TakeWidth(const char* name, Microseconds& width) {
    const QJsonValue value = port_.Take(name);
    width = value.toInt();
    if (!Sendable()) RefuseValue(port_.PlaceOf(name), value, QStringLiteral("a whole number") + Bounds());
  }

 private:
  bool Sendable() const { return std::holds_alternative<OptionBytes>(EncodeOptions(record_)); }
  static QString Bounds() { return QStringLiteral(" from %1 to %2").arg(kMinPulseWidth).arg(kMaxPulseWidth); }

  Members& port_;
  ChannelConfig& record_;
};

// Takes a port's members into the configuration; `taken` are the ports before it.
void TakePort(Members port, ConfigurationText& configuration, std::array<bool, kPortCount>& taken) {
  const QJsonValue value = port.Take("port");
  const int number = value.toInt();
  if (number < 1 || number > static_cast<int>(kPortCount))
    RefuseValue(port.PlaceOf("port"), value, QStringLiteral("a whole number from 1 to %1").arg(kPortCount));
  const auto slot = static_cast<std::size_t>(number) - 1;
  port.SetPlace(QStringLiteral("port %1").arg(number));
  if (std::exchange(taken[slot], true)) Refuse(port.Place(), QStringLiteral("it stands there a second time"));

  ChannelConfig& record = configuration.records.At(slot);
  SetFromPreset(kPresets[kStartPreset], record);
  configuration.names[slot] = port.TakeText("name");
  record.PortType = static_cast<std::int16_t>(kPortServo + port.TakeWord("kind", kKinds));
  PulseReader pulses(port, record);
  for (const auto& [name, pair] : kPairFields) pulses.TakePair(name, record.*pair);
  for (const auto& [name, width] : kWidthFields) pulses.TakeWidth(name, record.*width);
  record.PowerUPOpt = kPowerUpDefault + port.TakeWord("powerUp", kPowerUps);
  record.LostCommOption = kLostCommHold + port.TakeWord("lostCommunication", kLostCommunications);
  port.End();
}

void TakePorts(const QJsonValue& ports, ConfigurationText& configuration) {
  if (!ports.isArray()) RefuseValue(QStringLiteral("ports"), ports, QStringLiteral("a list of ports"));
  std::array<bool, kPortCount> taken{};
  const QJsonArray entries = ports.toArray();
  for (qsizetype i = 0; i < entries.size(); ++i) {
    const QString place = QStringLiteral("ports, entry %1").arg(i + 1);
    if (!entries[i].isObject()) RefuseValue(place, entries[i], QStringLiteral("a port"));
    TakePort({entries[i].toObject(), place}, configuration, taken);
  }
  const auto missing = std::find(taken.begin(), taken.end(), false);
  if (missing != taken.end())
    Refuse(QStringLiteral("port %1").arg(missing - taken.begin() + 1), QStringLiteral("it is missing"));
}

std::optional<QString> TakeTime(Members& members, const char* name) {
  constexpr char kWanted[] = "a time like \"2026-11-22T14:02:31+01:00\"";
  auto text =
      members.TakeText(name, R"(\d{4}-\d\d-\d\dT\d\d:\d\d:\d\d(\.\d{1,9})?(Z|[+-]\d\d:\d\d))", kWanted);
  if (text && !QDateTime::fromString(*text, Qt::ISODate).isValid())
    RefuseValue(members.PlaceOf(name), *text, QString::fromLatin1(kWanted));
  return text;
}

ConfigurationText TakeConfiguration(const QByteArray& text) {
  if (text.size() > kMaxConfigurationText) Refuse({}, QStringLiteral("the text is larger than 1 MiB"));
  const QJsonDocument document = ParseStrictly(text);
  if (!document.isObject()) Refuse({}, QStringLiteral("the text is a list, not a configuration"));
  Members top(document.object(), {});
  // First: another version may have other names.
  top.TakeWord("format", std::array{kFormat});
  const QJsonValue version = top.Take("version");
  if (version.toInt() != kVersion)
    RefuseValue(QStringLiteral("version"), version, QStringLiteral("%1, the one known here").arg(kVersion));

  ConfigurationText configuration;
  if (const auto unit = top.TakeText("unit", "(?!00)[0-9A-Fa-f]{2}", "a unit ID from \"01\" to \"FF\""))
    configuration.unit = static_cast<std::uint8_t>(unit->toUInt(nullptr, 16));
  configuration.read = TakeTime(top, "read");
  configuration.note = top.TakeText("note");
  TakePorts(top.Take("ports"), configuration);
  top.End();
  return configuration;
}

}  // namespace
}  // namespace exchange

std::variant<ConfigurationText, Refusal> ReadConfiguration(const QByteArray& text) {
  try {
    return exchange::TakeConfiguration(text);
  } catch (const Refusal& refusal) {
    return refusal;
  }
}

}  // namespace tendril
