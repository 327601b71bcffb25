#include "prefs/registry.h"

#include <gmock/gmock.h>

#include <functional>
#include <limits>

#include "platform/bytes.h"
#include "platform/memory_registry.h"
#include "platform/runtime_error.h"
#include "platform/system_registry.h"
#include "prefs/failing_store.h"

#ifdef _WIN32
#include <windows.h>
#endif

namespace tendril::test {
namespace {

constexpr RootKey kUser = RootKey::kCurrentUser;

// What `operation` fails with: "number description"; "" when it does not.
std::string FailureOf(const std::function<void()>& operation) {
  try {
    operation();
    return "";
  } catch (const RuntimeError& error) {
    return std::to_string(error.number()) + " " + error.description();
  }
}

#ifdef _WIN32
// While it lives, the current user's hive is an empty key, which goes with it.
class EmptyHive {
 public:
  EmptyHive() {
    RegCreateKeyExA(HKEY_CURRENT_USER, path_.c_str(), 0, nullptr, REG_OPTION_NON_VOLATILE, KEY_ALL_ACCESS,
                    nullptr, &key_, nullptr);
    RegOverridePredefKey(HKEY_CURRENT_USER, key_);
  }
  ~EmptyHive() {
    RegOverridePredefKey(HKEY_CURRENT_USER, nullptr);
    RegCloseKey(key_);
    RegDeleteTreeA(HKEY_CURRENT_USER, path_.c_str());
  }

 private:
  // Tests that run at the same time have a key each.
  const std::string path_ = "Software\\Tendril test " + std::to_string(GetCurrentProcessId());
  HKEY key_ = nullptr;
};
#endif

// On an empty registry: the system's on Windows, one in memory elsewhere.
class RegistryTest : public testing::Test {
 protected:
#ifdef _WIN32
  EmptyHive hive;
  std::unique_ptr<RegistryStore> store = OpenSystemRegistry({});
#else
  std::unique_ptr<RegistryStore> store = std::make_unique<MemoryRegistry>();
#endif
  std::vector<std::string> warnings;
  Registry registry{*store, [this](const std::string& warning) { warnings.push_back(warning); }};
  RegistryBranch company = RegistryBranch::Company(registry);
  RegistryBranch shared = RegistryBranch::Shared(registry);
};

TEST_F(RegistryTest, ValuesOfEachType_ComeBack) {
  const RegistryBranch key = shared.Below("Network");
  key.CreateKey();
  for (const std::int32_t number : {0, 1, -1, std::numeric_limits<std::int32_t>::min(), 0x12345678}) {
    key.SetNumber("Number", number);
    EXPECT_EQ(key.GetNumber("number", 7), number);
    EXPECT_EQ(key.GetBoolean("NUMBER", number == 0), number != 0);
  }
  key.SetBoolean("Set", true);
  EXPECT_EQ(key.GetNumber("Set", 7), 1);
  key.SetBoolean("Flag", false);
  for (const std::string text : {"", "a", "Grüße, \"2 €\" \\ \r\n", " ends with a blank "}) {
    key.SetString("Größe", text);
    EXPECT_EQ(key.GetString("Größe", "default"), text);
  }
  key.SetString("Foreign", "\xE4\xB8\x96");
  EXPECT_EQ(key.GetString("Foreign", ""), "?") << "the ANSI code has no such character";
  EXPECT_THAT(warnings, testing::IsEmpty());

  EXPECT_EQ(registry.GetNumber(kUser, "software\\KELVANE\\Shared\\Network", "Flag", 7), 0);
  EXPECT_EQ(company.Below("Shared\\Network").GetNumber("Flag", 7), 0);
  for (const RootKey other :
       {RootKey::kClassesRoot, RootKey::kLocalMachine, RootKey::kUsers, RootKey::kCurrentConfig}) {
    EXPECT_EQ(registry.GetNumber(other, "Software\\Kelvane\\Shared\\Network", "Flag", 7), 7);
  }
}

TEST_F(RegistryTest, MissingKeysAndValues_AreNormalToReadAndFailToChange) {
  for (int round = 0; round < 2; ++round) {  // without the key, then without the value
    EXPECT_EQ(company.GetNumber("X", -5), -5);
    EXPECT_TRUE(company.GetBoolean("X", true));
    EXPECT_EQ(company.GetString("X", "default"), "default");
    if (round == 0) {
      EXPECT_EQ(FailureOf([&] { company.SetNumber("X", 1); }), "2 RegOpenKeyEx failure");
      EXPECT_EQ(FailureOf([&] { company.DeleteKey("Y"); }), "2 RegOpenKeyEx failure");
    }
    company.CreateKey();
  }
  EXPECT_THAT(warnings, testing::IsEmpty());
  EXPECT_EQ(FailureOf([&] { company.DeleteKey("Y"); }), "2 RegDeleteKey failure");
  company.Below("Y\\Z").CreateKey();
  EXPECT_EQ(FailureOf([&] { company.DeleteKey("Y"); }), "5 RegDeleteKey failure") << "it has a subkey";
  company.SetNumber("X", 1);
  company.Below("Y").DeleteKey("Z");
  company.DeleteKey("Y");
  EXPECT_EQ(FailureOf([&] { company.Below("Y").OpenKey(kKeyRead); }), "2 RegOpenKeyEx failure");
  EXPECT_EQ(company.GetNumber("X", 7), 1);
}

#ifndef _WIN32
TEST_F(RegistryTest, PathThatNoFileCanHold_IsRefused) {
  for (const char* path : {"a\\", "\\a", "a\\\\b", "a\nb"})
    EXPECT_EQ(FailureOf([&] { company.Below(path).CreateKey(); }), "161 RegCreateKeyEx failure") << path;
}
#endif

TEST_F(RegistryTest, ValuesThatCannotBeUsed_GiveTheDefaultAndAWarning) {
  struct Case {
    const char* name;
    std::uint32_t type;
    Bytes data;
    std::int32_t number;
    std::string text;
  };
  const Case cases[] = {
      {"text without terminator", kRegSz, {'1', '2', '3'}, -7, "123"},
      {"text that ends with a zero", kRegSz, {'1', 0, 0}, -7, std::string("1\0", 2)},
      {"text without anything", kRegSz, {}, -7, ""},
      {"text with variables", kRegExpandSz, {'%', 'X', '%', 0}, -7, "default"},
      {"number", kRegDword, {1, 2, 3, 4}, 0x04030201, "default"},
      {"number of 3 bytes", kRegDword, {1, 2, 3}, -7, "default"},
      {"number of 8 bytes", 11, {1, 2, 3, 4, 5, 6, 7, 8}, -7, "default"},
      {"4 bytes", kRegBinary, {1, 2, 3, 4}, -7, "default"},
  };
  company.CreateKey();
  for (const Case& value : cases) {
    const RegistryHandle key = company.OpenKey(kKeyWrite);
    EXPECT_EQ(store->SetValue(key, value.name, value.type, value.data), kRegSuccess);
    registry.CloseKey(key);
    EXPECT_EQ(company.GetNumber(value.name, -7), value.number) << value.name;
    EXPECT_TRUE(company.GetString(value.name, "default") == value.text) << value.name;
    const std::string where =
        "Registry key \"Software\\Kelvane\", value \"" + std::string(value.name) + "\": ";
    std::vector<std::string> expected;
    if (value.number == -7) expected.push_back(where + "Error getting registry value (error 37).");
    if (value.text == "default") expected.push_back(where + "RegQueryValueEx failure (length) (error 1630).");
    EXPECT_EQ(std::exchange(warnings, {}), expected);
  }
  const std::string longest(Registry::kMaxTextBytes - 1, 'x');
  company.SetString("Longest", longest);
  EXPECT_TRUE(company.GetString("Longest", "default") == longest);
  company.SetString("Longest", longest + "x");
  EXPECT_EQ(company.GetString("Longest", "default"), "default");
}

TEST(Registry, FailureOfEachCall_IsReportedWithItsTextOnceTheKeyIsClosed) {
  struct Case {
    std::function<void(const RegistryBranch&)> operation;
    std::vector<std::string> texts;  // for the failure of the first call, the second ...
  };
  const std::string open = "1016 RegOpenKeyEx failure", set = "1016 RegSetValueEx failure";
  const std::string create = "1016 RegCreateKeyEx failure", remove = "1016 RegDeleteKey failure";
  const std::string get_open = "RegOpenKeyEx failure (error 1016).";
  const std::string get_number = "Error getting registry value (error 37).";
  const Case cases[] = {
      {[](const auto& key) { key.OpenKey(kKeyRead); }, {open}},
      {[](const auto& key) { key.CreateKey(); }, {create, create}},
      {[](const auto& key) { key.SetNumber("N", 1); }, {open, set, set}},
      {[](const auto& key) { key.SetString("S", "x"); }, {open, set, set}},
      {[](const auto& key) { key.DeleteKey("K"); }, {open, remove, remove}},
      {[](const auto& key) { EXPECT_EQ(key.GetNumber("N", 5), 5); }, {get_open, get_number}},
      {[](const auto& key) { EXPECT_EQ(key.GetString("S", "z"), "z"); },
       {get_open, "RegQueryValueEx failure (length) (error 1016).", "RegQueryValueEx failure (error 1016)."}},
  };
  for (const auto& [operation, texts] : cases) {
    for (std::size_t i = 0; i < texts.size(); ++i) {
      FailingStore store;
      store.failing_call = static_cast<int>(i + 1);
      std::string warning;
      Registry registry(store, [&](const std::string& text) { warning = text; });
      const std::string failure = FailureOf([&] { operation(RegistryBranch::Company(registry)); });
      EXPECT_THAT(failure + warning, testing::EndsWith(texts[i]));
      EXPECT_EQ(store.open_keys, 0) << texts[i];
    }
  }
}

}  // namespace
}  // namespace tendril::test
