#include "prefs/network_preferences.h"

#include <gmock/gmock.h>

#include <string>

#include "platform/runtime_error.h"
#include "prefs/scratch_registry.h"

namespace tendril::test {
namespace {

void SetNumber(const RegistryBranch& key, const char* name, std::int32_t value) {
  key.CreateKey();
  key.SetNumber(name, value);
}

class Preferences : public EveryRegistry {
 protected:
  RegistryBranch shared = RegistryBranch::Shared(registry);
  RegistryBranch network_key = shared.Below("Network");
  NetworkPreferences preferences{registry};
};

INSTANTIATE_TEST_SUITE_P(Stores, Preferences, kEveryStore);

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
  preferences.SetListNetworks(true);
  preferences.SetBriskPort(61);
  preferences.SetX10Port(62);
  preferences.SetCommListenerPort(70000);
  preferences.NyxNetwork(0).Speed = -1;
  preferences.NyxNetwork(15) = {11,
                                12,
                                true,
                                false,
                                true,
                                13,
                                "10.0.0.14",
                                15,
                                "Dachb\xC3\xB6"
                                "den"};
  preferences.DMXUniverse(1).Protocol = 22;
  preferences.DMXUniverse(999) = {"adapter 21", 29, true, 23, "10.0.0.24", 26, "universe 28"};
  preferences.SaveToRegistry();
  struct StoredNumber {
    const char* key;
    const char* name;
    std::int32_t number;
  };
  for (const auto& [key, name, number] : {StoredNumber{"", "ListNetworks", 1},
                                          {"", "NetworkBrisk", 61},
                                          {"", "NetworkX10", 62},
                                          {"", "DMXListenerPort", 70000},
                                          {"", "NyxSpeed", -1},
                                          {"AuxO", "NetworkKelvane", 11},
                                          {"AuxO", "NyxSpeed", 12},
                                          {"AuxO", "Enhanced", 1},
                                          {"AuxO", "OldMCP-NewRegVal", 0},
                                          {"AuxO", "Uses ACN", 1},
                                          {"AuxO", "ACN IP Address Type", 13},
                                          {"AuxO", "ACN Send To Port", 15},
                                          {"DMX1", "Protocol", 22},
                                          {"DMX999", "Protocol", 29},
                                          {"DMX999", "Uses E131", 1},
                                          {"DMX999", "E131 IP Address Type", 23},
                                          {"DMX999", "E131 Send To Port", 26}}) {
    EXPECT_EQ(network_key.Below(key).GetNumber(name, -7), number) << key << name;
  }
  const RegistryBranch aux = network_key.Below("AuxO"), universe = network_key.Below("DMX999");
  EXPECT_EQ(aux.GetString("ACN IP Address", ""), "10.0.0.14");
  EXPECT_EQ(aux.GetString("Comment", ""),
            "Dachb\xC3\xB6"
            "den");
  EXPECT_EQ(universe.GetString("Adapter", ""), "adapter 21");
  EXPECT_EQ(universe.GetString("E131 IP Address", ""), "10.0.0.24");
  EXPECT_EQ(universe.GetString("Comment", ""), "universe 28");

  NetworkPreferences loaded(registry), copy(registry);
  loaded.InitFromRegistry(false);
  EXPECT_FALSE(loaded.DiffersFrom(preferences));
  for (const std::function<void()>& change : {std::function<void()>([&] { loaded.SetX10Port(9); }),
                                              {[&] { loaded.NyxNetwork(0).Comment = "x"; }},
                                              {[&] { loaded.DMXUniverse(999).Adapter = "x"; }}}) {
    copy.CopyFrom(loaded);
    EXPECT_FALSE(copy.DiffersFrom(loaded));
    change();
    EXPECT_TRUE(copy.DiffersFrom(loaded));
  }
}

TEST_P(Preferences, Version_IsPartOfTheNetworkKey) {
  shared.Below("NetVersion").CreateKey();
  shared.Below("NetVersion").SetString("Ver", "2");
  SetNumber(shared.Below("Network"), "DMXListenerPort", 1);
  SetNumber(shared.Below("Network2"), "DMXListenerPort", 2);
  SetNumber(shared.Below("Network2\\AuxA"), "NyxSpeed", 3);
  SetNumber(shared.Below("Network2\\DMX1"), "Protocol", 4);
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
    SetNumber(key, "NetworkKelvane", ports.regular);
    SetNumber(key.Below("AuxC"), "NetworkKelvane", ports.third);
    SetNumber(key.Below("AuxO"), "NetworkKelvane", ports.fifteenth);
    SetNumber(key, "NetworkX10", ports.x10);
    SetNumber(key, "NetworkBrisk", ports.brisk);
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

TEST_P(Preferences, NetworkLoadedAlone_HasTheDefaultsThatItWasGiven) {
  NyxNetworkPreferences network;
  network.InitFromRegistry(shared, 5, true, true, 6, "10.0.0.1", 7);
  EXPECT_EQ(network, (NyxNetworkPreferences{5, 2, false, true, true, 6, "10.0.0.1", 7, ""}));
}

TEST_P(Preferences, OldMcpOfTheRegularNetwork_HasADefaultOfItsOwn) {
  SetNumber(network_key, "NyxOldMCP", 1);
  preferences.InitFromRegistry(true);
  EXPECT_TRUE(preferences.NyxNetwork(0).OldMCP);
  EXPECT_FALSE(preferences.NyxNetwork(1).OldMCP);
  SetNumber(network_key, "OldMCP-NewRegVal", 0);
  preferences.InitFromRegistry(false);
  EXPECT_TRUE(preferences.NyxNetwork(0).OldMCP) << "loaded before: read only by force";
  preferences.InitFromRegistry(true);
  EXPECT_FALSE(preferences.NyxNetwork(0).OldMCP);
}

TEST(NetworkPreferences, RegistryThatFails_NeverFailsTheLoading) {
  UnreliableStore store;
  int warnings = 0;
  Registry registry(store, [&](const std::string& /*warning*/) { ++warnings; });
  NetworkPreferences preferences(registry);
  SetNumber(RegistryBranch::Shared(registry).Below("Network"), "DMXListenerPort", 3);
  store.calls = 0;
  preferences.InitFromRegistry(true);
  const int all_calls = store.calls;
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
  EXPECT_LE(warnings, Registry::kMaxWarnings);
}

}  // namespace
}  // namespace tendril::test
