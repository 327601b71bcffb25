#include "platform/qt/registry_text.h"

#include <gmock/gmock.h>

#include <QList>
#include <QString>
#include <QStringEncoder>
#include <string>
#include <vector>

namespace tendril::test {
namespace {

using testing::IsEmpty;

// As the editor exports it.
constexpr char kExport[] =
    "Windows Registry Editor Version 5.00\r\n"
    "\r\n"
    "[HKEY_CURRENT_USER\\Software\\Kelvane]\r\n"
    "@=\"the nameless value\"\r\n"
    "\"Empty\"=\"\"\r\n"
    "\"Path\"=\"C:\\\\NYX\\\\\\\"quoted\\\"\"\r\n"
    "\r\n"
    "[HKEY_CURRENT_USER\\Software\\Kelvane\\Shared\\Network]\r\n"
    "\"Binary\"=hex:00,01,02,03,04,05,06,07,08,09,0a,0b,0c,0d,0e,0f,10,11,12,13,14,15,16,17,18,\\\r\n"
    "  19,1a\r\n"
    "\"Comment\"=\"B\xC3\xBChne \xF0\x9F\x92\xA1\"\r\n"
    "\"DMXListenerPort\"=dword:00002285\r\n"
    "\"Line\\nend\\r\"=\"\"\r\n"
    "\"Lines\"=hex(1):61,00,00,00,62,00,00,00\r\n"
    "\"List\"=hex(7):61,00,00,00,62,00,00,00,00,00\r\n"
    "\"Nothing\"=hex(80000001):\r\n"
    "\"Odd\"=hex(1):61\r\n"
    "\r\n"
    "[HKEY_USERS\\.DEFAULT\\Console]\r\n"
    "\r\n";

QByteArray AsUtf16(const char* text) {
  return QStringEncoder(QStringConverter::Utf16LE, QStringConverter::Flag::WriteBom)(QString::fromUtf8(text));
}

struct Content {
  std::vector<std::size_t> unread;
  RegistryKeys keys;

  explicit Content(const QByteArray& bytes)
      : keys(ReadRegistryText(bytes, [this](std::size_t line) { unread.push_back(line); })) {}
};

TEST(RegistryText, Export_IsReadInEveryEncodingAndComesBackWhenWritten) {
  const Content exported(AsUtf16(kExport));
  const QByteArray written = WriteRegistryText(exported.keys);
  EXPECT_TRUE(written.startsWith(AsUtf16("Windows Registry Editor Version 5.00\r\n")));
  for (const QByteArray& bytes : {AsUtf16(kExport), QByteArray(kExport), "\xEF\xBB\xBF" + QByteArray(kExport),
                                  QByteArray(kExport).replace("\r", ""), written}) {
    const Content content(bytes);
    EXPECT_THAT(content.unread, IsEmpty());
    EXPECT_EQ(content.keys, exported.keys);
    EXPECT_EQ(content.keys.size(), 3U);
    EXPECT_EQ(
        content.keys.at(u"hkey_current_user\\SOFTWARE\\kelvane\\Shared\\Network").at(u"dmxlistenerport"),
        (RegistryValue{kRegDword, {0x85, 0x22, 0, 0}}));
  }
}

TEST(RegistryText, Line_IsAValueOrIsSkipped) {
  const QByteArray start = "Windows Registry Editor Version 5.00\r\n; first\r\n[HKEY_CURRENT_USER\\K]\r\n";
  const std::pair<const char*, RegistryValue> values[] = {
      {" \"V\" = \"a\" \t", {kRegSz, {'a', 0, 0, 0}}},
      {R"("v"="\n\r\t\\\"")", {kRegSz, {'\n', 0, '\r', 0, '\\', 0, 't', 0, '\\', 0, '"', 0, 0, 0}}},
      {"\"v\"=dword:0000Ffff", {kRegDword, {0xFF, 0xFF, 0, 0}}},
      {"\"v\"=dword:1234", {kRegDword, {0x34, 0x12, 0, 0}}},
      {"\"v\"=hex:00,fF", {kRegBinary, {0, 0xFF}}},
      {"\"v\"=hex(2):41,00,\\\r\n  00,\\\r\n\t00", {kRegExpandSz, {0x41, 0, 0, 0}}},
      {"\"v\"=hex(b):", {11, {}}},
  };
  for (const auto& [line, value] : values) {
    const Content content(start + line + "\r\n");
    EXPECT_EQ(content.keys.at(u"HKEY_CURRENT_USER\\K").at(u"v"), value) << line;
    EXPECT_THAT(content.unread, IsEmpty()) << line;
  }
  const QByteArray unreadable =
      R"("v"|"v"=|"v|v="a"|"v"=a|"v"="a|"v"="a\"|"v"="a"b|"v"=-|"v"=dword:|"v"=dword:0000000g|)"
      R"("v"=dword:000000001|"v"=dword:0x1|"v"=hex:0|"v"=hex:0,1|"v"=hex:00,|"v"=hex:00,\|"v"=hex:00 01|)"
      R"("v"=hex|"v"=hex(:00|"v"=hex():00|"v"=hex(g):00|"v"=hex(123456789):00|@|=|[|[]|)"
      R"([HKEY_CURRENT_USER\K\|[HKEY_CURRENT_USER\\K]|[HKEY_CURRENT_USER\K\]|[-HKEY_CURRENT_USER\K])";
  for (const QByteArray& line : unreadable.split('|')) {
    const Content content(start + line + "\r\n\r\n[HKEY_CURRENT_USER\\L]\r\n");
    EXPECT_THAT(content.unread, testing::ElementsAre(4)) << line.data();
    EXPECT_EQ(content.keys, (RegistryKeys{{u"HKEY_CURRENT_USER\\K", {}}, {u"HKEY_CURRENT_USER\\L", {}}}));
  }
}

// Whatever is cut off: the lines in front of the cut count, and the one that is cut never passes for another value.
TEST(RegistryText, FileCutOffAnywhere_KeepsItsWholeLines) {
  for (const QByteArray& bytes : {AsUtf16(kExport), QByteArray(kExport)}) {
    const Content whole(bytes);
    const QByteArray port = bytes.startsWith('W') ? "00002285" : AsUtf16("00002285").sliced(2);
    for (qsizetype size = 2; size < bytes.size(); ++size) {
      const Content cut(bytes.first(size));
      EXPECT_LE(cut.unread.size(), 1U) << size;
      bool has_port = false;
      for (const auto& [path, values] : cut.keys) {
        has_port = has_port || values.contains(u"DMXListenerPort");
        for (const auto& [name, value] : values) EXPECT_EQ(value, whole.keys.at(path).at(name)) << size;
      }
      EXPECT_EQ(has_port, bytes.first(size).contains(port)) << size;
    }
  }
}

}  // namespace
}  // namespace tendril::test
