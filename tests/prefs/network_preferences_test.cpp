#include "prefs/network_preferences.h"

#include <gmock/gmock.h>

#include <string>
#include <variant>

#include "platform/runtime_error.h"
#include "prefs/scratch_registry.h"

namespace tendril::test {
namespace {

// A value in the registry: its key below "Network", its name, what is there and what else might be.
struct StoredValue {
  const char* key;
  const char* name;
  std::variant<std::int32_t, std::string> value, another;
};

const StoredValue kStoredValues[] = {
    {"", "ListNetworks", 1, 0},
    {"", "NetworkBrisk", 61, 64},
    {"", "NetworkX10", 62, 65},
    {"", "DMXListenerPort", 63, 70000},
    {"AuxO", "NetworkKelvane", 11, 255},
    {"", "NyxSpeed", 12, -1},
    {"AuxO", "Enhanced", 1, 0},
    {"AuxO", "OldMCP-NewRegVal", 0, 1},
    {"AuxO", "Uses ACN", 1, 0},
    {"AuxO", "ACN IP Address Type", 13, 0},
    {"AuxO", "ACN IP Address", "10.0.0.14", ""},
    {"AuxO", "ACN Send To Port", 15, 16},
    {"AuxO", "Comment", "Dachboden", "Dachböden"},
    {"DMX999", "Adapter", "adapter 21", ""},
    {"DMX1", "Protocol", 22, -2},
    {"DMX999", "Uses E131", 1, 0},
    {"DMX999", "E131 IP Address Type", 23, 0},
    {"DMX999", "E131 IP Address", "10.0.0.24", "10.0.0.25"},
    {"DMX999", "E131 Send To Port", 26, 27},
    {"DMX999", "Comment", "universe 28", ""},
};

void FillWithStoredValues(NetworkPreferences& preferences) {
  preferences.SetListNetworks(true);
  preferences.SetBriskPort(61);
  preferences.SetX10Port(62);
  preferences.SetCommListenerPort(63);
  NyxNetworkPreferences& network = preferences.NyxNetwork(15);
  network.Port = 11;
  preferences.NyxNetwork(0).Speed = 12;
  network.Enhanced = true;
  network.UsesACN = true;
  network.ACNIPType = 13;
  network.ACNIPAddress = "10.0.0.14";
  network.ACNSendToPort = 15;
  network.Comment = "Dachboden";
  DMXUniversePrefs& universe = preferences.DMXUniverse(999);
  universe.Adapter = "adapter 21";
  preferences.DMXUniverse(1).Protocol = 22;
  universe.UsesE131 = true;
  universe.E131IPType = 23;
  universe.E131IPAddress = "10.0.0.24";
  universe.E131SendToPort = 26;
  universe.Comment = "universe 28";
}

void Set(const RegistryBranch& key, const char* name, const std::variant<std::int32_t, std::string>& value) {
  key.CreateKey();
  if (const auto* number = std::get_if<std::int32_t>(&value)) {
    key.SetNumber(name, *number);
  } else {
    key.SetString(name, std::get<std::string>(value));
  }
}

class Preferences : public EveryRegistry {
 protected:
  RegistryBranch shared = RegistryBranch::Shared(registry);
  RegistryBranch network_key = shared.Below("Network");
  NetworkPreferences preferences{registry};
};

INSTANTIATE_TEST_SUITE_P(Stores, Preferences, testing::Values("memory", "system"));

TEST_P(Preferences, NothingInTheRegistry_GivesTheDefaults) {
  preferences.InitFromRegistry(false);
  EXPECT_EQ(preferences.CommListenerPort(), 8837);
  EXPECT_FALSE(preferences.ListNetworks());
  EXPECT_EQ(preferences.BriskPort(), 0);
  EXPECT_EQ(preferences.X10Port(), 0);
  for (const std::size_t i : {0U, 1U, 15U}) {
    EXPECT_EQ(preferences.NyxNetwork(i).Port, i == 0 ? 1 : 0);
    EXPECT_EQ(preferences.NyxNetwork(i).Speed, 2);
    EXPECT_EQ(preferences.NyxNetwork(i).ACNIPType, 1);
  }
  EXPECT_EQ(preferences.DMXUniverse(1).E131IPType, 1);
  EXPECT_THAT(warnings, testing::IsEmpty());
  EXPECT_THROW(preferences.NyxNetwork(16), RuntimeError);
  EXPECT_THROW(preferences.DMXUniverse(0), RuntimeError);
  EXPECT_THROW(preferences.DMXUniverse(1000), RuntimeError);
}

TEST_P(Preferences, Saved_StandUnderTheirNamesAndLoadAgain) {
  FillWithStoredValues(preferences);
  preferences.SaveToRegistry();
  for (const StoredValue& stored : kStoredValues) {
    const RegistryBranch key = network_key.Below(stored.key);
    if (const auto* number = std::get_if<std::int32_t>(&stored.value)) {
      EXPECT_EQ(key.GetNumber(stored.name, -1), *number) << stored.name;
    } else {
      EXPECT_EQ(key.GetString(stored.name, "-"), std::get<std::string>(stored.value)) << stored.name;
    }
  }
  NetworkPreferences loaded(registry);
  EXPECT_TRUE(loaded.DiffersFrom(preferences));
  loaded.InitFromRegistry(false);
  EXPECT_FALSE(loaded.DiffersFrom(preferences));
}

TEST(NetworkPreferences, EachValue_IsLoadedComparedAndCopied) {
  MemoryRegistry store;
  Registry registry(store, {});
  const RegistryBranch network_key = RegistryBranch::Shared(registry).Below("Network");
  for (const StoredValue& stored : kStoredValues) {
    Set(network_key.Below(stored.key), stored.name, stored.value);
  }
  NetworkPreferences before(registry);
  before.InitFromRegistry(false);
  for (const StoredValue& stored : kStoredValues) {
    Set(network_key.Below(stored.key), stored.name, stored.another);
    NetworkPreferences after(registry);
    after.InitFromRegistry(false);
    EXPECT_TRUE(after.DiffersFrom(before)) << stored.name;
    before.CopyFrom(after);
    EXPECT_FALSE(after.DiffersFrom(before)) << stored.name;
  }
}

TEST_P(Preferences, Version_IsPartOfTheNetworkKey) {
  Set(shared.Below("NetVersion"), "Ver", "2");
  Set(shared.Below("Network"), "DMXListenerPort", 1);
  Set(shared.Below("Network2"), "DMXListenerPort", 2);
  Set(shared.Below("Network2\\AuxA"), "NyxSpeed", 3);
  Set(shared.Below("Network2\\DMX1"), "Protocol", 4);
  preferences.InitFromRegistry(false);
  EXPECT_EQ(preferences.CommListenerPort(), 2);
  EXPECT_EQ(preferences.NyxNetwork(1).Speed, 3);
  EXPECT_EQ(preferences.DMXUniverse(1).Protocol, 4);

  preferences.SetCommListenerPort(5);
  preferences.SaveToRegistry();
  EXPECT_EQ(shared.Below("Network2").GetNumber("DMXListenerPort", 0), 5);
  EXPECT_EQ(shared.Below("Network").GetNumber("DMXListenerPort", 0), 1);
}

TEST(NetworkPreferences, SerialPortThatSeveralClaim_IsLeftToTheFirst) {
  struct Case {
    std::int32_t regular, third, fifteenth, x10, brisk;
    int regular_left, third_left, fifteenth_left, x10_left, brisk_left;
  };
  const Case cases[] = {
      {4, 4, 4, 4, 4, 4, 0, 0, 0, 0},         {1, 2, 3, 4, 5, 1, 2, 3, 4, 5},
      {1, 2, 2, 3, 3, 1, 2, 0, 3, 0},         {1, 2, 3, 2, 3, 1, 2, 3, 0, 0},
      {0, 0, 255, 0, 0, 0, 0, 255, 0, 0},     {0, 0, 0, 9, 9, 0, 0, 0, 9, 0},
      {256, 256, -1, 300, -1, 1, 0, 0, 0, 0},  // no bytes: as if they were missing
  };
  for (const Case& ports : cases) {
    MemoryRegistry store;
    Registry registry(store, {});
    const RegistryBranch key = RegistryBranch::Shared(registry).Below("Network");
    Set(key, "NetworkKelvane", ports.regular);
    Set(key.Below("AuxC"), "NetworkKelvane", ports.third);
    Set(key.Below("AuxO"), "NetworkKelvane", ports.fifteenth);
    Set(key, "NetworkX10", ports.x10);
    Set(key, "NetworkBrisk", ports.brisk);
    NetworkPreferences preferences(registry);
    preferences.InitFromRegistry(false);
    EXPECT_EQ(preferences.NyxNetwork(0).Port, ports.regular_left);
    EXPECT_EQ(preferences.NyxNetwork(1).Port, 0) << "only the regular network is in use by default";
    EXPECT_EQ(preferences.NyxNetwork(3).Port, ports.third_left);
    EXPECT_EQ(preferences.NyxNetwork(15).Port, ports.fifteenth_left);
    EXPECT_EQ(preferences.X10Port(), ports.x10_left);
    EXPECT_EQ(preferences.BriskPort(), ports.brisk_left);
  }
}

TEST(NetworkPreferences, NetworkLoadedAlone_HasTheDefaultsThatItWasGiven) {
  MemoryRegistry store;
  Registry registry(store, {});
  NyxNetworkPreferences network;
  network.InitFromRegistry(RegistryBranch::Shared(registry), 5, true, true, 6, "10.0.0.1", 7);
  EXPECT_EQ(network.Port, 5);
  EXPECT_TRUE(network.OldMCP);
  EXPECT_TRUE(network.UsesACN);
  EXPECT_EQ(network.ACNIPType, 6);
  EXPECT_EQ(network.ACNIPAddress, "10.0.0.1");
  EXPECT_EQ(network.ACNSendToPort, 7);
}

TEST(NetworkPreferences, OldMcpOfTheRegularNetwork_HasADefaultOfItsOwn) {
  MemoryRegistry store;
  Registry registry(store, {});
  const RegistryBranch key = RegistryBranch::Shared(registry).Below("Network");
  NetworkPreferences preferences(registry);
  Set(key, "NyxOldMCP", 1);
  preferences.InitFromRegistry(true);
  EXPECT_TRUE(preferences.NyxNetwork(0).OldMCP);
  EXPECT_FALSE(preferences.NyxNetwork(1).OldMCP);
  Set(key, "OldMCP-NewRegVal", 0);
  preferences.InitFromRegistry(true);
  EXPECT_FALSE(preferences.NyxNetwork(0).OldMCP);
}

TEST_P(Preferences, LoadedBefore_ReadOnlyByForce) {
  UnreliableStore counting(*store);
  Registry counted(counting, {});
  NetworkPreferences loaded(counted);
  loaded.InitFromRegistry(false);
  Set(network_key, "DMXListenerPort", 2);
  counting.calls = 0;
  loaded.InitFromRegistry(false);
  EXPECT_EQ(counting.calls, 0);
  EXPECT_EQ(loaded.CommListenerPort(), 8837);
  loaded.InitFromRegistry(true);
  EXPECT_EQ(loaded.CommListenerPort(), 2);
}

TEST(NetworkPreferences, RegistryThatFails_NeverFailsTheLoading) {
  MemoryRegistry memory;
  UnreliableStore store(memory);
  int warnings = 0;
  Registry registry(store, [&](const std::string& /*warning*/) { ++warnings; });
  NetworkPreferences preferences(registry);
  Set(RegistryBranch::Shared(registry).Below("Network"), "DMXListenerPort", 3);
  const int all_calls = [&] {
    store.calls = 0;
    preferences.InitFromRegistry(true);
    return store.calls;
  }();
  // Every call of the beginning, and the last, which ends the reading in one go.
  for (int call = 1; call <= all_calls; call = call == 12 ? all_calls : call + 1) {
    store.calls = 0;
    store.failing_call = call;
    preferences.InitFromRegistry(true);
    EXPECT_EQ(store.open_keys, 0) << call;
  }
  EXPECT_EQ(preferences.CommListenerPort(), 3);
  store.failing_call = -1;
  preferences.InitFromRegistry(true);
  EXPECT_EQ(preferences.CommListenerPort(), 8837);
  EXPECT_LE(warnings, Registry::kMostWarnings);
}

}  // namespace
}  // namespace tendril::test
