#include "platform/registry_text.h"

#include <gmock/gmock.h>

#include <algorithm>
#include <string>

#include "platform/registry_store.h"
#include "platform/unicode.h"

namespace tendril::test {
namespace {

using testing::ElementsAre;
using testing::IsEmpty;

constexpr char kHeader[] = "Windows Registry Editor Version 5.00\r\n";

// As the editor exports it.
constexpr char kExport[] =
    "Windows Registry Editor Version 5.00\r\n"
    "\r\n"
    "[HKEY_CURRENT_USER\\Software\\Kelvane]\r\n"
    "@=\"the nameless value\"\r\n"
    "\"Empty\"=\"\"\r\n"
    "\"Path\"=\"C:\\\\NYX\\\\\\\"quoted\\\"\"\r\n"
    "\r\n"
    "[HKEY_CURRENT_USER\\Software\\Kelvane\\Shared\\NetVersion]\r\n"
    "\r\n"
    "[HKEY_CURRENT_USER\\Software\\Kelvane\\Shared\\Network]\r\n"
    "\"Binary\"=hex:00,01,02,03,04,05,06,07,08,09,0a,0b,0c,0d,0e,0f,10,11,12,13,14,15,16,17,18,\\\r\n"
    "  19,1a\r\n"
    "\"Comment\"=\"B\xC3\xBChne \xF0\x9F\x92\xA1\"\r\n"
    "\"DMXListenerPort\"=dword:00002285\r\n"
    "\"Line\\nend\\r\"=\"\"\r\n"
    "\"Lines\"=hex(1):61,00,0d,00,0a,00,62,00,00,00\r\n"
    "\"List\"=hex(7):61,00,00,00,62,00,00,00,00,00\r\n"
    "\"Nothing\"=hex:\r\n"
    "\"Nothing typed\"=hex(80000001):\r\n"
    "\"Odd\"=hex(1):61\r\n"
    "\r\n"
    "[HKEY_USERS\\.DEFAULT\\Console]\r\n"
    "\"x\"=dword:fffffffe\r\n"
    "\r\n";

Bytes AsUtf8(const std::string& text) { return {text.begin(), text.end()}; }

Bytes AsUtf16(const std::string& text) {
  Bytes bytes{0xFF, 0xFE};
  for (const char16_t unit : Utf16(text)) {
    bytes.push_back(static_cast<std::uint8_t>(unit & 0xFF));
    bytes.push_back(static_cast<std::uint8_t>(unit >> 8));
  }
  return bytes;
}

struct Content {
  RegistryTree tree;
  std::vector<std::size_t> unread;
  RegistryForm form;

  explicit Content(const Bytes& bytes)
      : form(ReadRegistryText(bytes, tree, [this](std::size_t line) { unread.push_back(line); })) {}

  const RegistryValue* Value(const std::u16string& key, const std::u16string& name) {
    const RegistryKey* found = tree.Find(key);
    if (found == nullptr) return nullptr;
    const auto value = found->values.find(name);
    return value != found->values.end() ? &value->second : nullptr;
  }
  // The value "v" of a key "HKEY_CURRENT_USER\K".
  const RegistryValue* Value() { return Value(u"HKEY_CURRENT_USER\\K", u"v"); }
  std::string Written() const {
    const Bytes bytes = WriteRegistryText(form, tree);
    return {bytes.begin(), bytes.end()};
  }
};

TEST(RegistryText, Export_IsReadAndWrittenAsItIsInEveryEncoding) {
  std::string with_line_feeds(kExport);
  std::erase(with_line_feeds, '\r');
  EXPECT_EQ(Content(AsUtf8("\n[HKEY_USERS]\n[HKEY_USERS\\K]\n")).Written(),
            "Windows Registry Editor Version 5.00\n\n[HKEY_USERS\\K]\n\n");
  EXPECT_EQ(Content(AsUtf8("[HKEY_USERS]\n")).Written(), "Windows Registry Editor Version 5.00\n\n");
  for (const Bytes& bytes : {AsUtf16(kExport), AsUtf8(kExport), AsUtf8("\xEF\xBB\xBF" + std::string(kExport)),
                             AsUtf8(with_line_feeds), AsUtf16(with_line_feeds)}) {
    Content content(bytes);
    EXPECT_THAT(content.unread, IsEmpty());
    const RegistryValue* port =
        content.Value(u"hkey_current_user\\SOFTWARE\\kelvane\\Shared\\Network", u"dmxlistenerport");
    ASSERT_NE(port, nullptr);
    EXPECT_EQ(port->type, kRegDword);
    EXPECT_THAT(port->data, ElementsAre(0x85, 0x22, 0, 0));
    EXPECT_EQ(WriteRegistryText(content.form, content.tree), bytes);
  }
}

TEST(RegistryText, Line_IsAValueOrIsPassedOver) {
  struct Case {
    const char* line;
    std::uint32_t type;
    Bytes data;
  };
  const Case values[] = {
      {"\"v\"=\"\"", kRegSz, {0, 0}},
      {" \"V\" = \"a\" \t", kRegSz, {'a', 0, 0, 0}},
      {R"("v"="\\\"")", kRegSz, {'\\', 0, '"', 0, 0, 0}},
      {R"("v"="a\nb\r\t")", kRegSz, {'a', 0, '\n', 0, 'b', 0, '\r', 0, '\\', 0, 't', 0, 0, 0}},
      {"\"v\"=dword:0000Ffff", kRegDword, {0xFF, 0xFF, 0, 0}},
      {"\"v\"=dword:1234", kRegDword, {0x34, 0x12, 0, 0}},
      {"\"v\"=hex:00,fF", kRegBinary, {0, 0xFF}},
      {"\"v\"=hex(2):41,00,\\\r\n  00,\\\r\n\t00", kRegExpandSz, {0x41, 0, 0, 0}},
      {"\"v\"=hex(b):", 11, {}},
  };
  for (const Case& value : values) {
    Content content(AsUtf8(kHeader + std::string("[HKEY_CURRENT_USER\\K]\r\n") + value.line + "\r\n"));
    ASSERT_NE(content.Value(), nullptr) << value.line;
    EXPECT_EQ(content.Value()->type, value.type) << value.line;
    EXPECT_EQ(content.Value()->data, value.data) << value.line;
    EXPECT_THAT(content.unread, IsEmpty()) << value.line;
  }
  for (const std::string line : {"\"v\"",
                                 "\"v\"=",
                                 "\"v",
                                 "v=\"a\"",
                                 "\"v\"=a",
                                 "\"v\"=\"a",
                                 "\"v\"=\"a\\\"",
                                 "\"v\"=\"a\"b",
                                 "\"v\"=dword:",
                                 "\"v\"=dword:0000000g",
                                 "\"v\"=dword:000000001",
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
                                 "[HKEY_CURRENT_USER\\K\\]"}) {
    const std::string text = kHeader + std::string("; first\r\n[HKEY_CURRENT_USER\\K]\r\n") + line +
                             "\r\n\r\n[HKEY_CURRENT_USER\\L]\r\n";
    Content content(AsUtf8(text));
    EXPECT_EQ(content.Value(), nullptr) << line;
    EXPECT_THAT(content.unread, ElementsAre(4)) << line;
    EXPECT_NE(content.tree.Find(u"HKEY_CURRENT_USER\\L"), nullptr) << line;
    EXPECT_THAT(content.Written(), testing::HasSubstr("\r\n" + line + "\r\n")) << "it stays in the file";
    EXPECT_EQ(Content(AsUtf8(content.Written())).Written(), content.Written()) << line;
  }
}

TEST(RegistryText, LaterLines_ReplaceAndDeleteWhatWasThere) {
  Content content(AsUtf8(
      "[HKEY_CURRENT_USER\\K]\n\"v\"=\"old\"\n\"gone\"=\"x\"\n"
      "[HKEY_CURRENT_USER\\K\\Sub\\Sub]\n[HKEY_CURRENT_USER\\K\\Kept]\n"
      "[-HKEY_CURRENT_USER\\k\\SUB]\n\"lost\"=\"x\"\n[hkey_current_user\\k]\n\"V\"=dword:1\n\"Gone\"=-\n"));
  EXPECT_THAT(content.unread, ElementsAre(7)) << "a value below a key that is deleted";
  EXPECT_EQ(content.Written(),
            "Windows Registry Editor Version 5.00\n\"lost\"=\"x\"\n\n"
            "[HKEY_CURRENT_USER\\K]\n\"v\"=dword:00000001\n\n[HKEY_CURRENT_USER\\K\\Kept]\n\n");
}

// Whatever is cut off: the lines in front of the cut count, and the one that is cut never passes for another value.
TEST(RegistryText, FileCutOffAnywhere_KeepsItsWholeLines) {
  const std::string text = kExport;
  for (const bool utf16 : {false, true}) {
    Content whole(utf16 ? AsUtf16(text) : AsUtf8(text));
    const Bytes bytes = utf16 ? AsUtf16(text) : AsUtf8(text);
    const std::u16string network = u"HKEY_CURRENT_USER\\Software\\Kelvane\\Shared\\Network";
    const std::size_t port_ends = text.find("00002285") + 8;
    const std::size_t port_ends_in_bytes = utf16 ? AsUtf16(text.substr(0, port_ends)).size() : port_ends;
    for (std::size_t size = 0; size < bytes.size(); ++size) {
      Content cut(Bytes(bytes.begin(), bytes.begin() + static_cast<std::ptrdiff_t>(size)));
      EXPECT_EQ(cut.Value(network, u"DMXListenerPort") != nullptr, size >= port_ends_in_bytes) << size;
      EXPECT_LE(cut.unread.size(), 1U) << size;
      for (const std::u16string& key : {network, std::u16string(u"HKEY_CURRENT_USER\\Software\\Kelvane")}) {
        if (cut.tree.Find(key) == nullptr) continue;
        for (const auto& [name, value] : cut.tree.Find(key)->values) {
          ASSERT_NE(whole.Value(key, name), nullptr) << size;
          EXPECT_EQ(value.data, whole.Value(key, name)->data) << size;
        }
      }
    }
  }
}

TEST(RegistryText, PathThatNoKeyCanHave_IsPassedOver) {
  std::string deepest = "HKEY_CURRENT_USER";
  for (std::size_t part = 1; part < RegistryTree::kMostParts; ++part) deepest += "\\a";
  const std::string longest = "HKEY_CURRENT_USER\\" + std::string(RegistryTree::kMostNameUnits, 'a');
  for (const std::string& path : {deepest, longest}) {
    EXPECT_THAT(Content(AsUtf8("[" + path + "]\n")).unread, IsEmpty());
    EXPECT_THAT(Content(AsUtf8("[" + path + "a\\a]\n")).unread, ElementsAre(1));
    EXPECT_THAT(Content(AsUtf8("[" + path + "\\" + std::string(1U << 20, '\\') + "]\n")).unread,
                ElementsAre(1));
  }
}

}  // namespace
}  // namespace tendril::test
