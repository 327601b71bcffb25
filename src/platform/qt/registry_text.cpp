#include "platform/qt/registry_text.h"

#include <QString>
#include <QStringConverter>
#include <QStringTokenizer>
#include <algorithm>
#include <optional>
#include <stdexcept>
#include <utility>

namespace tendril {
namespace {

constexpr QStringView kHeader = u"Windows Registry Editor Version 5.00";
constexpr std::size_t kMaxItems = 1'000'000;  // keys and values

// Read as something else and written again, a file in another encoding would be lost.
QString Decoded(const QByteArray& bytes) {
  const auto encoding = QStringConverter::encodingForData(bytes).value_or(QStringConverter::Utf8);
  const bool is_utf8 = encoding == QStringConverter::Utf8 && !bytes.left(4).contains('\0');
  QStringDecoder decoder(encoding);
  QString text = decoder(bytes);
  if (bytes.startsWith("REGEDIT4") || (!is_utf8 && encoding != QStringConverter::Utf16LE) ||
      decoder.hasError()) {
    throw std::runtime_error("it is neither UTF-16 with a byte order mark, low byte first, nor UTF-8.");
  }
  return text;
}

Bytes Utf16Bytes(const QString& text) {
  const QByteArray bytes = QStringEncoder(QStringConverter::Utf16LE)(text);
  return {bytes.begin(), bytes.end()};
}

QString Utf16Text(const Bytes& bytes) {
  const QByteArrayView view(bytes.data(), static_cast<qsizetype>(bytes.size()));
  return QStringDecoder(QStringConverter::Utf16LE, QStringConverter::Flag::ConvertInitialBom)(view);
}

// Takes `prefix` off the front of `text`, if it is there.
bool Take(QStringView& text, QStringView prefix) {
  if (!text.startsWith(prefix)) return false;
  text = text.sliced(prefix.size());
  return true;
}

// Takes the text between quotes off the front of `line`. A backslash that escapes nothing stands for itself.
std::optional<QString> TakeQuoted(QStringView& line) {
  if (!Take(line, u"\"")) return std::nullopt;
  QString text;
  for (auto unit = line.begin(); unit != line.end(); ++unit) {
    if (*unit == u'"') {
      line = QStringView(unit + 1, line.end());
      return text;
    }
    const QChar escaped = *unit == u'\\' && unit + 1 != line.end() ? unit[1] : QChar();
    if (escaped == u'\\' || escaped == u'"' || escaped == u'n' || escaped == u'r') {
      ++unit;
      text += escaped == u'n' ? u'\n' : escaped == u'r' ? u'\r' : escaped;
    } else {
      text += *unit;
    }
  }
  return std::nullopt;
}

std::optional<std::uint32_t> HexNumber(QStringView digits) {
  constexpr qsizetype kMaxDigits = 8;
  const auto is_digit = [](QChar c) { return QStringView(u"0123456789abcdefABCDEF").contains(c); };
  if (digits.isEmpty() || digits.size() > kMaxDigits || !std::all_of(digits.begin(), digits.end(), is_digit))
    return std::nullopt;
  return digits.toUInt(nullptr, 16);
}

std::optional<RegistryValue> ReadNumber(QStringView digits, bool line_has_end) {
  constexpr qsizetype kAllDigits = 8;
  const std::optional<std::uint32_t> number = HexNumber(digits);
  if (!number || (!line_has_end && digits.size() < kAllDigits)) return std::nullopt;
  RegistryValue value{kRegDword, {}};
  for (const int shift : {0, 8, 16, 24})
    value.data.push_back(static_cast<std::uint8_t>(*number >> shift & 0xFF));
  return value;
}

// Reads what follows "hex".
std::optional<RegistryValue> ReadHex(QStringView data) {
  RegistryValue value{kRegBinary, {}};
  if (Take(data, u"(")) {
    const qsizetype end = std::max<qsizetype>(data.indexOf(u')'), 0);
    const std::optional<std::uint32_t> type = HexNumber(data.first(end));
    if (!type) return std::nullopt;
    value.type = *type;
    data = data.sliced(end + 1);
  }
  if (!Take(data, u":")) return std::nullopt;
  if (data.isEmpty()) return value;
  for (const QStringView digits : data.tokenize(u',')) {
    const std::optional<std::uint32_t> byte = HexNumber(digits);
    if (!byte || digits.size() != 2) return std::nullopt;
    value.data.push_back(static_cast<std::uint8_t>(*byte));
  }
  return value;
}

std::optional<RegistryValue> ReadData(QStringView data, bool line_has_end) {
  if (Take(data, u"dword:")) return ReadNumber(data, line_has_end);
  if (Take(data, u"hex")) return line_has_end ? ReadHex(data) : std::nullopt;
  const std::optional<QString> text = TakeQuoted(data);
  if (!text || !data.isEmpty()) return std::nullopt;
  return RegistryValue{kRegSz, Utf16Bytes(*text + QChar(0))};
}

bool ReadValue(QStringView line, bool line_has_end, RegistryValues& values) {
  const std::optional<QString> name = Take(line, u"@") ? QString() : TakeQuoted(line);
  line = line.trimmed();
  if (!name || !Take(line, u"=")) return false;
  std::optional<RegistryValue> value = ReadData(line.trimmed(), line_has_end);
  if (!value) return false;
  values.insert_or_assign(name->toStdU16String(), *std::move(value));
  return true;
}

// The values of the key that `line` names; null when it names none.
RegistryValues* ReadKey(QStringView line, RegistryKeys& keys) {
  if (!line.startsWith(u"[HKEY_") || !line.endsWith(u']')) return nullptr;
  const std::u16string path = line.sliced(1).chopped(1).toString().toStdU16String();
  return IsRegistryPath(path) ? &keys[path] : nullptr;
}

QString Quoted(QString text) {
  text.replace(u'\\', QStringLiteral("\\\\")).replace(u'"', QStringLiteral("\\\""));
  return u'"' + text.replace(u'\n', QStringLiteral("\\n")).replace(u'\r', QStringLiteral("\\r")) + u'"';
}

QString Written(const RegistryValue& value) {
  QByteArray data(reinterpret_cast<const char*>(value.data.data()),
                  static_cast<qsizetype>(value.data.size()));
  const QString text = value.type == kRegSz && data.size() % 2 == 0 ? Utf16Text(value.data) : QString();
  if (!text.isEmpty() && text.indexOf(QChar(0)) == text.size() - 1) return Quoted(text.chopped(1));
  if (value.type == kRegDword && data.size() == 4) {
    std::reverse(data.begin(), data.end());
    return QStringLiteral("dword:") + QLatin1String(data.toHex());
  }
  const QString type = value.type == kRegBinary ? QString() : QStringLiteral("(%1)").arg(value.type, 0, 16);
  return QStringLiteral("hex") + type + u':' + QLatin1String(data.toHex(','));
}

}  // namespace

RegistryKeys ReadRegistryText(const QByteArray& bytes, const UnreadLineSink& unread) {
  const QString text = Decoded(bytes);
  const auto lines = QStringView(text).tokenize(u'\n');
  RegistryKeys keys;
  RegistryValues* values = nullptr;  // of the last key line; null if that cannot be read
  std::size_t line_number = 0;
  std::size_t items = 0;
  for (auto next = lines.begin(); next != lines.end();) {
    const std::size_t first_number = ++line_number;
    QString line = (*next++).trimmed().toString();
    if (line.isEmpty() || line.startsWith(u';') || line == kHeader) continue;
    const auto goes_on = [&] {
      return line.endsWith(u'\\') && next != lines.end() &&
             (next->startsWith(u' ') || next->startsWith(u'\t'));
    };
    for (; goes_on(); ++line_number) {
      line.chop(1);
      line += (*next++).trimmed();
    }
    const bool is_key = line.startsWith(u'[');
    if (is_key) values = ReadKey(line, keys);
    const bool line_has_end = next != lines.end();
    if (values == nullptr || (!is_key && !ReadValue(line, line_has_end, *values))) {
      unread(first_number);
    } else if (++items > kMaxItems) {
      throw std::runtime_error("it has more than a million keys and values.");
    }
  }
  return keys;
}

QByteArray WriteRegistryText(const RegistryKeys& keys) {
  QString text = kHeader.toString() + QStringLiteral("\r\n");
  for (const auto& [path, values] : keys) {
    text += QStringLiteral("\r\n[") + QString::fromStdU16String(path) + QStringLiteral("]\r\n");
    for (const auto& [name, value] : values) {
      text += name.empty() ? QStringLiteral("@") : Quoted(QString::fromStdU16String(name));
      text += u'=' + Written(value) + QStringLiteral("\r\n");
    }
  }
  text += QStringLiteral("\r\n");
  return QStringEncoder(QStringConverter::Utf16LE, QStringConverter::Flag::WriteBom)(text);
}

}  // namespace tendril
