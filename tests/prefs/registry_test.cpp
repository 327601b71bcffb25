#include "prefs/registry.h"

#include <gmock/gmock.h>

#include <functional>
#include <limits>

#include "platform/runtime_error.h"
#include "prefs/scratch_registry.h"

namespace tendril::test {
namespace {

using testing::HasSubstr;
using testing::IsEmpty;

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

INSTANTIATE_TEST_SUITE_P(Stores, EveryRegistry, kEveryStore);

TEST_P(EveryRegistry, ValuesOfEachType_ComeBack) {
  const RegistryBranch key = RegistryBranch::Shared(registry).Below("Network");
  key.CreateKey();
  for (const std::int32_t number : {0, 1, -1, std::numeric_limits<std::int32_t>::min(), 0x12345678}) {
    key.SetNumber("Number", number);
    EXPECT_EQ(key.GetNumber("number", 7), number);
    EXPECT_EQ(key.GetBoolean("NUMBER", number == 0), number != 0);
  }
  for (const bool value : {true, false}) {
    key.SetBoolean("Flag", value);
    EXPECT_EQ(key.GetBoolean("Flag", !value), value);
    EXPECT_EQ(key.GetNumber("Flag", 7), value ? 1 : 0);
  }
  for (const std::string text : {"", "a", "Grüße, \"2 €\" \\ \r\n", " ends with a blank "}) {
    key.SetString("Größe", text);
    EXPECT_EQ(key.GetString("Größe", "default"), text);
  }
  key.SetString("Foreign", "\xE4\xB8\x96");
  EXPECT_EQ(key.GetString("Foreign", ""), "?") << "the ANSI code has no such character";
  EXPECT_THAT(warnings, IsEmpty());

  EXPECT_EQ(registry.GetNumber(kUser, "software\\KELVANE\\Shared\\Network", "Flag", 7), 0);
  EXPECT_EQ(RegistryBranch::Company(registry).Below("Shared\\Network").GetNumber("Flag", 7), 0);
  for (const RootKey other :
       {RootKey::kClassesRoot, RootKey::kLocalMachine, RootKey::kUsers, RootKey::kCurrentConfig}) {
    EXPECT_EQ(registry.GetNumber(other, "Software\\Kelvane\\Shared\\Network", "Flag", 7), 7);
  }
  RegistryBranch::Shared(registry).Below("Network2").CreateKey();
  RegistryBranch::Shared(registry).DeleteKey("Network2");
  EXPECT_EQ(key.GetNumber("Flag", 7), 0);
  RegistryBranch::Shared(registry).DeleteKey("Network");
  EXPECT_EQ(key.GetNumber("Flag", 7), 7);
  RegistryBranch::Shared(registry).SetNumber("Flag", 1);  // the key above stays
}

TEST_P(EveryRegistry, MissingKeysAndValues_AreNormalToReadAndFailToChange) {
  const RegistryBranch company = RegistryBranch::Company(registry);
  for (int round = 0; round < 2; ++round) {  // without the key, then without the value
    EXPECT_EQ(company.GetNumber("X", -5), -5);
    EXPECT_TRUE(company.GetBoolean("X", true));
    EXPECT_FALSE(company.GetBoolean("X", false));
    EXPECT_EQ(company.GetString("X", "default"), "default");
    if (round == 0) {
      EXPECT_EQ(FailureOf([&] { company.SetNumber("X", 1); }), "2 RegOpenKeyEx failure");
      EXPECT_EQ(FailureOf([&] { company.SetString("X", ""); }), "2 RegOpenKeyEx failure");
      EXPECT_EQ(FailureOf([&] { company.DeleteKey("Y"); }), "2 RegOpenKeyEx failure");
      EXPECT_EQ(FailureOf([&] { company.OpenKey(kKeyRead); }), "2 RegOpenKeyEx failure");
    }
    company.CreateKey();
  }
  EXPECT_THAT(warnings, IsEmpty());
  EXPECT_EQ(FailureOf([&] { company.DeleteKey("Y"); }), "2 RegDeleteKey failure");
  company.Below("Y\\Z").CreateKey();
  EXPECT_EQ(FailureOf([&] { company.DeleteKey("Y"); }), "5 RegDeleteKey failure") << "it has a subkey";
}

TEST_P(EveryRegistry, ValuesThatCannotBeUsed_GiveTheDefaultAndAWarning) {
  const Bytes too_long(Registry::kMaxTextBytes + 1, 'x');
  Bytes longest = too_long;
  longest.pop_back();
  longest.back() = 0;
  struct Case {
    const char* name;
    std::uint32_t type;
    Bytes data;
    std::int32_t number;
    std::string text;
  };
  const Case cases[] = {
      {"text", kRegSz, {'1', '2', '3', 0}, -7, "123"},
      {"text without terminator", kRegSz, {'1', '2', '3'}, -7, "123"},
      {"text that ends with a zero", kRegSz, {'1', 0, 0}, -7, std::string("1\0", 2)},
      {"text without anything", kRegSz, {}, -7, ""},
      {"longest text", kRegSz, longest, -7, std::string(longest.size() - 1, 'x')},
      {"too long a text", kRegSz, too_long, -7, "default"},
      {"text with variables", kRegExpandSz, {'%', 'X', '%', 0}, -7, "default"},
      {"list of texts", kRegMultiSz, {'a', 0, 'b', 0, 0}, -7, "default"},
      {"number", kRegDword, {1, 2, 3, 4}, 0x04030201, "default"},
      {"number of 3 bytes", kRegDword, {1, 2, 3}, -7, "default"},
      {"number of 8 bytes", 11, {1, 2, 3, 4, 5, 6, 7, 8}, -7, "default"},
      {"4 bytes", kRegBinary, {1, 2, 3, 4}, -7, "default"},
  };
  const RegistryBranch company = RegistryBranch::Company(registry);
  company.CreateKey();
  for (const Case& value : cases) {
    SCOPED_TRACE(value.name);
    const RegistryHandle key = company.OpenKey(kKeyWrite);
    EXPECT_EQ(store->SetValue(key, value.name, value.type, value.data), kRegSuccess);
    registry.CloseKey(key);
    EXPECT_EQ(company.GetNumber(value.name, -7), value.number);
    EXPECT_TRUE(company.GetString(value.name, "default") == value.text);
    std::vector<std::string> expected;
    const std::string where =
        "Registry key \"Software\\Kelvane\", value \"" + std::string(value.name) + "\": ";
    if (value.number == -7) expected.push_back(where + "Error getting registry value (error 37).");
    if (value.text == "default") {
      const char* code = value.type == kRegSz ? "234" : "1630";
      expected.push_back(where + "RegQueryValueEx failure (length) (error " + code + ").");
    }
    EXPECT_EQ(warnings, expected);
    warnings.clear();
  }
}

TEST(Registry, FailureOfEachCall_IsRaisedWithItsTextOnceTheKeyIsClosed) {
  struct Case {
    const char* name;
    std::function<void(const RegistryBranch&)> operation;
    std::vector<std::string> texts;  // for the failure of the first call, the second ...
  };
  const std::string close = "RegCloseKey failure";
  const std::string open = "RegOpenKeyEx failure";
  const std::string set = "RegSetValueEx failure";
  const std::string number = "Error getting registry value";
  const Case changes[] = {
      {"open", [](const auto& key) { key.OpenKey(kKeyRead); }, {open}},
      {"create",
       [](const auto& key) { key.CreateKey(); },
       {"RegCreateKeyEx failure", "RegCreateKeyEx failure"}},
      {"set number", [](const auto& key) { key.SetNumber("Number", 1); }, {open, set, set}},
      {"set Boolean", [](const auto& key) { key.SetBoolean("Number", true); }, {open, set, set}},
      {"set string", [](const auto& key) { key.SetString("Text", "x"); }, {open, set, set}},
      {"delete",
       [](const auto& key) { key.DeleteKey("Sub"); },
       {open, "RegDeleteKey failure", "RegDeleteKey failure"}},
  };
  const Case gets[] = {
      {"get number", [](const auto& key) { EXPECT_EQ(key.GetNumber("Number", 5), 5); }, {open, number}},
      {"get Boolean", [](const auto& key) { EXPECT_TRUE(key.GetBoolean("Number", true)); }, {open, number}},
      {"get string",
       [](const auto& key) { EXPECT_EQ(key.GetString("Text", "z"), "z"); },
       {open, "RegQueryValueEx failure (length)", "RegQueryValueEx failure"}},
  };
  UnreliableStore store;
  std::string warning;
  Registry registry(store, [&](const std::string& text) { warning = text; });
  const RegistryBranch company = RegistryBranch::Company(registry);
  const auto prepare = [&](std::size_t failing_call) {
    store.failing_call = 0;
    company.Below("Sub").CreateKey();
    company.SetNumber("Number", 0);
    company.SetString("Text", "");
    store.calls = 0;
    store.failing_call = static_cast<int>(failing_call);
    store.open_keys = 0;
  };
  for (const Case& change : changes) {
    for (std::size_t i = 0; i < change.texts.size(); ++i) {
      prepare(i + 1);
      EXPECT_EQ(FailureOf([&] { change.operation(company); }), "1016 " + change.texts[i]) << change.name;
      EXPECT_EQ(store.open_keys, 0) << change.name;
    }
  }
  store.failing_call = 0;
  EXPECT_EQ(FailureOf([&] { company.Below("a\\").CreateKey(); }), "161 RegCreateKeyEx failure");
  EXPECT_EQ(FailureOf([&] { registry.DeleteKey(kUser, "", ""); }), "5 RegDeleteKey failure");
  company.Below("Gone").CreateKey();
  const RegistryHandle deleted = company.Below("Gone").OpenKey(kKeyAllAccess);
  company.DeleteKey("Gone");
  EXPECT_EQ(store.SetValue(deleted, "X", kRegSz, {}), kRegKeyDeleted);
  registry.CloseKey(deleted);
  for (const Case& get : gets) {
    for (std::size_t i = 0; i < get.texts.size(); ++i) {
      prepare(i + 1);
      get.operation(company);
      const char* code = get.texts[i] == number ? " (error 37)" : " (error 1016)";
      EXPECT_THAT(warning, HasSubstr(get.texts[i] + code)) << get.name;
      EXPECT_EQ(store.open_keys, 0) << get.name;
    }
  }
}

}  // namespace
}  // namespace tendril::test
