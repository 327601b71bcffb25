#include "platform/qt/registry_text.h"

#include <gmock/gmock.h>

#include <QString>
#include <QStringEncoder>
#include <string>
#include <vector>

namespace tendril::test {
namespace {

using testing::ElementsAre;
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
    "\"Nothing\"=hex:\r\n"
    "\"Nothing typed\"=hex(80000001):\r\n"
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

  const RegistryValue* Value(const std::u16string& key, const std::u16string& name) const {
    const auto found = keys.find(key);
    if (found == keys.end()) return nullptr;
    const auto value = found->second.find(name);
    return value != found->second.end() ? &value->second : nullptr;
  }
};

TEST(RegistryText, Export_IsReadInEveryEncodingAndComesBackWhenWritten) {
  const Content exported(AsUtf16(kExport));
  const std::u16string network = u"hkey_current_user\\SOFTWARE\\kelvane\\Shared\\Network";
  for (const QByteArray& bytes : {AsUtf16(kExport), QByteArray(kExport), "\xEF\xBB\xBF" + QByteArray(kExport),
                                  QByteArray(kExport).replace("\r", ""), WriteRegistryText(exported.keys)}) {
    const Content content(bytes);
    EXPECT_THAT(content.unread, IsEmpty());
    EXPECT_EQ(content.keys, exported.keys);
    EXPECT_EQ(content.keys.size(), 3U);
    const RegistryValue* port = content.Value(network, u"dmxlistenerport");
    ASSERT_NE(port, nullptr);
    EXPECT_EQ(port->type, kRegDword);
    EXPECT_THAT(port->data, ElementsAre(0x85, 0x22, 0, 0));
  }
  EXPECT_TRUE(
      WriteRegistryText(exported.keys).startsWith(AsUtf16("Windows Registry Editor Version 5.00\r\n")));
}

TEST(RegistryText, Line_IsAValueOrIsSkipped) {
  struct Case {
    const char* line;
    std::uint32_t type;
    Bytes data;
  };
  const Case values[] = {
      {"\"v\"=\"\"", kRegSz, {0, 0}},
      {" \"V\" = \"a\" \t", kRegSz, {'a', 0, 0, 0}},
      {R"("v"="a\nb\r\t\\\"")",
       kRegSz,
       {'a', 0, '\n', 0, 'b', 0, '\r', 0, '\\', 0, 't', 0, '\\', 0, '"', 0, 0, 0}},
      {"\"v\"=dword:0000Ffff", kRegDword, {0xFF, 0xFF, 0, 0}},
      {"\"v\"=dword:1234", kRegDword, {0x34, 0x12, 0, 0}},
      {"\"v\"=hex:00,fF", kRegBinary, {0, 0xFF}},
      {"\"v\"=hex(2):41,00,\\\r\n  00,\\\r\n\t00", kRegExpandSz, {0x41, 0, 0, 0}},
      {"\"v\"=hex(b):", 11, {}},
  };
  const QByteArray start = "Windows Registry Editor Version 5.00\r\n; first\r\n[HKEY_CURRENT_USER\\K]\r\n";
  for (const Case& value : values) {
    const Content content(start + value.line + "\r\n");
    const RegistryValue* found = content.Value(u"HKEY_CURRENT_USER\\K", u"v");
    ASSERT_NE(found, nullptr) << value.line;
    EXPECT_EQ(found->type, value.type) << value.line;
    EXPECT_EQ(found->data, value.data) << value.line;
    EXPECT_THAT(content.unread, IsEmpty()) << value.line;
  }
  for (const char* line : {"\"v\"",
                           "\"v\"=",
                           "\"v",
                           "v=\"a\"",
                           "\"v\"=a",
                           "\"v\"=\"a",
                           "\"v\"=\"a\\\"",
                           "\"v\"=\"a\"b",
                           "\"v\"=-",
                           "\"v\"=dword:",
                           "\"v\"=dword:0000000g",
                           "\"v\"=dword:000000001",
                           "\"v\"=dword:0x1",
                           "\"v\"=hex:0",
                           "\"v\"=hex:0,1",
                           "\"v\"=hex:00,",
                           "\"v\"=hex:00,\\",
                           "\"v\"=hex:00,\\\r\n  zz",
                           "\"v\"=hex:00 01",
                           "\"v\"=hex",
                           "\"v\"=hex(:00",
                           "\"v\"=hex():00",
                           "\"v\"=hex(g):00",
                           "\"v\"=hex(123456789):00",
                           "@",
                           "=",
                           "[",
                           "[]",
                           "[HKEY_CURRENT_USER\\K\\",
                           "[HKEY_CURRENT_USER\\\\K]",
                           "[HKEY_CURRENT_USER\\K\\]",
                           "[-HKEY_CURRENT_USER\\K]"}) {
    const Content content(start + line + "\r\n\r\n[HKEY_CURRENT_USER\\L]\r\n");
    EXPECT_EQ(content.Value(u"HKEY_CURRENT_USER\\K", u"v"), nullptr) << line;
    EXPECT_THAT(content.unread, ElementsAre(4)) << line;
    EXPECT_EQ(content.keys.size(), 2U) << line;
  }
}

// Whatever is cut off: the lines in front of the cut count, and the one that is cut never passes for another value.
TEST(RegistryText, FileCutOffAnywhere_KeepsItsWholeLines) {
  const std::u16string network = u"HKEY_CURRENT_USER\\Software\\Kelvane\\Shared\\Network";
  for (const bool utf16 : {false, true}) {
    const QByteArray bytes = utf16 ? AsUtf16(kExport) : QByteArray(kExport);
    const Content whole(bytes);
    for (qsizetype size = 2; size < bytes.size(); ++size) {
      const Content cut(bytes.first(size));
      const bool has_port = bytes.first(size).contains(utf16 ? AsUtf16("00002285").sliced(2) : "00002285");
      EXPECT_EQ(cut.Value(network, u"DMXListenerPort") != nullptr, has_port) << size;
      EXPECT_LE(cut.unread.size(), 1U) << size;
      for (const auto& [path, values] : whole.keys) {
        for (const auto& [name, value] : values) {
          const RegistryValue* found = cut.Value(path, name);
          EXPECT_TRUE(found == nullptr || *found == value) << size;
        }
      }
    }
  }
}

}  // namespace
}  // namespace tendril::test
