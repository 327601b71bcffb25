#include "exchange/strict_json.h"

#include <QJsonArray>
#include <QSet>
#include <algorithm>
#include <vector>

namespace tendril::exchange {
namespace {

constexpr qsizetype kLongestQuote = 40;
// A double keeps so many: what is beyond them gets lost.
constexpr int kMostDigits = 15;

bool IsDigit(char c) { return c >= '0' && c <= '9'; }

// Goes through a text that Qt's parser has accepted.
class StrictScan {
 public:
  explicit StrictScan(const QByteArray& text) : text_(text) {}

  void Run() {
    int digits = 0;  // of the number so far
    for (; at_ < text_.size(); ++at_) {
      const char c = text_[at_];
      if (c == '{' || c == '[') names_.emplace_back();
      if (c == '}' || c == ']') names_.pop_back();
      if (c == '"') ScanString();
      if (c == '.' && !(IsDigit(text_[at_ - 1]) && IsDigit(text_[at_ + 1])))
        Refuse(QStringLiteral("a number has digits on both sides of its point"));
      if (c != '.') digits = IsDigit(c) ? digits + 1 : 0;
      if (digits > kMostDigits) Refuse(QStringLiteral("a number has more than %1 digits").arg(kMostDigits));
    }
  }

 private:
  [[noreturn]] void Refuse(const QString& reason) const;

  // Ends at the closing quotation mark.
  void ScanString() {
    const qsizetype begin = at_;
    for (++at_; text_[at_] != '"'; ++at_) {
      if (static_cast<unsigned char>(text_[at_]) < ' ')
        Refuse(QStringLiteral("a text contains a line break or another control character"));
      if (text_[at_] == '\\' && !QByteArrayView("\"\\/bfnrtu").contains(text_[++at_]))
        Refuse(QStringLiteral("a text contains an unknown escape sequence"));
    }
    if (IsName()) NoteName(text_.sliced(begin, at_ + 1 - begin));
  }

  // Whether the string that ends here is the name of a member.
  bool IsName() const {
    qsizetype next = at_ + 1;
    while (QByteArrayView(" \t\r\n").contains(text_[next])) ++next;
    return text_[next] == ':';
  }

  // Two names can be the same with different escapes.
  void NoteName(const QByteArray& json) {
    const QString name = QJsonDocument::fromJson('[' + json + ']')[0].toString();
    if (names_.back().contains(name)) Refuse(Quoted(name) + QStringLiteral(" stands there a second time"));
    names_.back().insert(name);
  }

  const QByteArray& text_;
  qsizetype at_ = 0;
  std::vector<QSet<QString>> names_;  // of each object that is open; arrays have none
};

[[noreturn]] void RefuseAt(const QByteArray& text, qsizetype offset, const QString& reason) {
  throw Refusal{QStringLiteral("line %1").arg(text.first(offset).count('\n') + 1), reason};
}

void StrictScan::Refuse(const QString& reason) const { RefuseAt(text_, at_, reason); }

// Qt calls a missing comma or bracket an unterminated object, wherever that ends.
QString WhyNotJson(const QJsonParseError& error) {
  using Error = QJsonParseError;
  const bool missing = error.error == Error::UnterminatedObject || error.error == Error::UnterminatedArray ||
                       error.error == Error::MissingValueSeparator;
  return missing ? QStringLiteral("a comma or a bracket is missing") : error.errorString();
}

}  // namespace

QJsonDocument ParseStrictly(const QByteArray& text) {
  QJsonParseError error;
  QJsonDocument document = QJsonDocument::fromJson(text, &error);
  if (error.error != QJsonParseError::NoError) {
    if (!text.trimmed().startsWith('{'))
      RefuseAt(text, 0, QStringLiteral("this is no configuration, which begins with {"));
    const auto offset = std::min<qsizetype>(error.offset, text.size());
    RefuseAt(text, offset, QStringLiteral("this is not JSON (%1)").arg(WhyNotJson(error)));
  }
  StrictScan(text).Run();
  return document;
}

QByteArray JsonText(const QJsonValue& value) {
  const QByteArray array = QJsonDocument(QJsonArray{value}).toJson(QJsonDocument::Compact);
  return array.sliced(1, array.size() - 2);
}

QString Quoted(const QJsonValue& value) {
  QString text = QString::fromUtf8(JsonText(value));
  if (text.size() <= kLongestQuote) return text;
  text.truncate(kLongestQuote);
  if (text.back().isHighSurrogate()) text.chop(1);
  return text + QLatin1StringView(value.isString() ? "...\"" : "...");
}

}  // namespace tendril::exchange
