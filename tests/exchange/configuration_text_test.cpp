#include "exchange/configuration_text.h"

#include <gtest/gtest.h>

#include <QFile>
#include <QJsonArray>
#include <QJsonDocument>
#include <QJsonObject>
#include <string>
#include <tuple>
#include <vector>

namespace tendril {
namespace {

using namespace Qt::StringLiterals;

QByteArray Document(const char* name) {
  QFile file(QStringLiteral(TENDRIL_DOCS "/") + QLatin1StringView(name));
  if (!file.open(QIODevice::ReadOnly)) throw std::logic_error(name);
  return file.readAll();
}

// The documented example.
QByteArray Example() {
  const QByteArray begin = "```json\n";
  const QByteArray document = Document("configuration-format.md");
  const qsizetype first = document.indexOf(begin) + begin.size();
  return document.sliced(first, document.indexOf("```", first) - first);
}

TEST(ConfigurationText, ExampleIsReadAndWrittenAgainToTheByte) {
  const auto read = std::get<ConfigurationText>(ReadConfiguration(Example()));
  EXPECT_EQ(read.unit, 0x0A);
  EXPECT_EQ(read.names[0], QStringLiteral("jaw, left"));
  const ChannelConfig jaw{kPortServo, {700, 2300}, {905, 1895},     {950, 1800},
                          1300,       1400,        kPowerUpDefault, kLostCommNeutral};
  EXPECT_EQ(read.records.At(0), jaw);
  EXPECT_EQ(read.records.At(2).PortType, kPortPwm);
  EXPECT_EQ(std::get<QByteArray>(WriteConfiguration(read)).toStdString(), Example().toStdString());
}

TEST(ConfigurationText, SchemaHasTheSameNames) {
  const QJsonObject schema = QJsonDocument::fromJson(Document("configuration.schema.json")).object();
  const QJsonObject example = QJsonDocument::fromJson(Example()).object();
  const QJsonObject port_schema = schema["$defs"_L1]["port"_L1].toObject();
  EXPECT_EQ(schema["properties"_L1].toObject().keys(), example.keys());
  EXPECT_EQ(port_schema["properties"_L1].toObject().keys(), example["ports"_L1][0].toObject().keys());
  QStringList required;
  for (const QJsonValue& name : port_schema["required"_L1].toArray()) required += name.toString();
  required.sort();
  EXPECT_EQ(required, example["ports"_L1][7].toObject().keys()) << "this port has no name";
}

TEST(ConfigurationText, OddRecordsAndTextsSurvive) {
  ConfigurationText odd;
  odd.note = QStringLiteral("\"\\/\n\t\u0001\u00e9\u2028\U0001F600 {\"format\": 1}");
  odd.read = QStringLiteral("2026-02-28T23:59:59.123456789Z");
  odd.names[7] = QString();
  for (std::size_t slot = 0; slot < kPortCount; ++slot) {
    const auto number = static_cast<int>(slot);
    odd.records.At(slot) = {static_cast<std::int16_t>(slot % 3),
                            {2550, 10},
                            {905 + number, 1999 - number},
                            {11, 2549},
                            10,
                            2550,
                            1 + number % 3,
                            1 + number % 4};
  }
  QByteArray text = std::get<QByteArray>(WriteConfiguration(odd));
  EXPECT_EQ(std::get<ConfigurationText>(ReadConfiguration(text)), odd);
  text.replace("\n", "\r\n")
      .replace(": 10,", ": 10.0,")
      .replace("\"kind\"", "\"\\u006bind\"")
      .prepend("\xEF\xBB\xBF");
  EXPECT_EQ(std::get<ConfigurationText>(ReadConfiguration(text)), odd) << "CR LF, the mark, other spellings";
}

TEST(ConfigurationText, RefusedWithPlaceAndReason) {
  const std::vector<std::tuple<const char*, QByteArray, std::string>> cases{
      {"1895", "5", "port 1, virtualRange: [905,5] is not a pair of whole numbers from 10 to 2550"},
      {"1895", "10, 10", "port 1, virtualRange: [905,10,10] is not a pair of whole numbers from 10 to 2550"},
      {"1300", "1300.5", "port 1, defaultPosition: 1300.5 is not a whole number from 10 to 2550"},
      {"1300", "\"1300\"", "port 1, defaultPosition: \"1300\" is not a whole number from 10 to 2550"},
      {"1300", "4294968596", "port 1, defaultPosition: 4294968596 is not a whole number from 10 to 2550"},
      {"1300", "1e400", "line 15: this is not JSON (illegal number)"},
      {"1300", "1300.", "line 15: a number has digits on both sides of its point"},
      {"1300", "1300.0000000000000001", "line 15: a number has more than 15 digits"},
      {"1300,", "1300", "line 16: this is not JSON (a comma or a bracket is missing)"},
      {"  ]\n}", "", "line 100: this is not JSON (a comma or a bracket is missing)"},
      {"\"hold\"", "1",
       "port 2, lostCommunication: 1 is not \"hold\", \"default\", \"neutral\" or \"stop pulse\""},
      {"\"eye lamp\"", "null", "port 3, name: null is not a text"},
      {"eye", R"(\ud800)", "port 3, name: \"\\ud800 lamp\" is not a text"},
      {"eye", "\n", "line 34: a text contains a line break or another control character"},
      {"eye", "\\x", "line 34: a text contains an unknown escape sequence"},
      {"eye", "\xFF", "line 34: this is not JSON (invalid UTF8 string)"},
      {"lamp\"", "lamp\", \"colour\": 1", "port 3: \"colour\" is not a name of this format"},
      {"lamp\"", QByteArray("lamp\", \"") + QByteArray(38, 'x') + "\xF0\x9F\x98\x80\": 1",
       "port 3: \"" + std::string(38, 'x') + "...\" is not a name of this format"},
      {"lamp\"", R"(lamp", "k\u0069nd": "servo")", "line 35: \"kind\" stands there a second time"},
      {"      \"kind\": \"pwm\",\n", "", "port 3: \"kind\" is missing"},
      {"\"port\": 8", "\"port\": 7", "port 7: it stands there a second time"},
      {"\"port\": 8", "\"port\": 9", "ports, entry 8, port: 9 is not a whole number from 1 to 8"},
      {"\"ports\": [", "\"ports\": [1, ", "ports, entry 1: 1 is not a port"},
      {"\"ports\": [", "\"ports\": [], \"more\": [", "port 1: it is missing"},
      {"\"version\": 1", "\"version\": 2", "version: 2 is not 1, the one known here"},
      {"tendril-c", "c", "format: \"configuration\" is not \"tendril-configuration\""},
      {"\"0A\"", "\"0AB\"", "unit: \"0AB\" is not a unit ID from \"01\" to \"FF\""},
      {"\"0A\"", "\"00\"", "unit: \"00\" is not a unit ID from \"01\" to \"FF\""},
      {"2026-11", "2026-13",
       "read: \"2026-13-22T14:02:31+01:00\" is not a time like \"2026-11-22T14:02:31+01:00\""},
      {"+01:00", "", "read: \"2026-11-22T14:02:31\" is not a time like \"2026-11-22T14:02:31+01:00\""},
      {"  ]\n}", "  ]\n} and more", "line 100: this is not JSON (garbage at the end of the document)"},
      {"{\n", "{\"note\": " + QByteArray(1025, '[') + "\n",
       "line 1: this is not JSON (too deeply nested document)"},
      {"{\n", QByteArray(1024 * 1024, ' ') + "{\n", "the text is larger than 1 MiB"},
      {"{\n", "Hello, {\n", "line 1: this is no configuration, which begins with {"}};
  for (const auto& [in_example, instead, sentence] : cases) {
    QByteArray text = Example();
    const qsizetype place = text.indexOf(in_example);
    ASSERT_GE(place, 0) << in_example;
    text.replace(place, qstrlen(in_example), instead);
    EXPECT_EQ(std::get<Refusal>(ReadConfiguration(text)).Sentence().toStdString(), sentence);
  }
}

}  // namespace
}  // namespace tendril
