#include "prefs/network_preferences.h"

#include <gmock/gmock.h>

#include <string>

#include "platform/memory_registry.h"
#include "platform/runtime_error.h"
#include "platform/unicode.h"
#include "prefs/failing_store.h"

namespace tendril::test {
namespace {

void SetNumber(const RegistryBranch& key, const char* name, std::int32_t value) {
  key.CreateKey();
  key.SetNumber(name, value);
}

class Preferences : public testing::Test {
 protected:
  // The values of the key "Network" followed by `path`: "Name=1, Name=text, ".
  std::string Stored(const std::u16string& path) const {
    std::string text;
    for (const auto& [name, value] :
         store.keys().at(u"HKEY_CURRENT_USER\\Software\\Kelvane\\Shared\\Network" + path)) {
      text += Utf8(name) + "=";
      if (value.type == kRegDword) {
        text += std::to_string(value.data[0] + 0x100 * value.data[1]);
      } else {
        for (std::size_t i = 0; i + 2 < value.data.size(); i += 2) text += static_cast<char>(value.data[i]);
      }
      text += ", ";
    }
    return text;
  }

  MemoryRegistry store;
  Registry registry{store, [](const std::string& warning) { FAIL() << warning; }};
  RegistryBranch shared = RegistryBranch::Shared(registry);
  RegistryBranch network_key = shared.Below("Network");
  NetworkPreferences preferences{registry};
};

TEST_F(Preferences, NothingInTheRegistry_GivesTheDefaults) {
  preferences.InitFromRegistry(false);
  EXPECT_EQ(preferences.CommListenerPort(), 8837);
  EXPECT_FALSE(preferences.ListNetworks());
  EXPECT_EQ(preferences.BriskPort(), 0);
  EXPECT_EQ(preferences.X10Port(), 0);
  EXPECT_EQ(preferences.NyxNetwork(0).Port, 1);
  EXPECT_EQ(preferences.NyxNetwork(1), (NyxNetworkPreferences{0, 2, false, false, false, 1, "", 0, ""}));
  EXPECT_EQ(preferences.DMXUniverse(1), (DMXUniversePrefs{"", 0, false, 1, "", 0, ""}));
  EXPECT_THROW(preferences.NyxNetwork(16), RuntimeError);
  EXPECT_THROW(preferences.DMXUniverse(0), RuntimeError);
  EXPECT_THROW(preferences.DMXUniverse(1000), RuntimeError);
}

TEST_F(Preferences, Saved_StandUnderTheirNamesInTheKeyOfTheVersionAndLoadAgain) {
  SetNumber(network_key, "DMXListenerPort", 1);
  shared.Below("NetVersion").CreateKey();
  shared.Below("NetVersion").SetString("Ver", "2");
  preferences.SetListNetworks(true);
  preferences.SetBriskPort(61);
  preferences.SetX10Port(62);
  preferences.SetCommListenerPort(63);
  preferences.NyxNetwork(15) = {11, 12, true, false, true, 13, "10.0.0.14", 15, "sixteen"};
  preferences.DMXUniverse(999) = {"adapter 21", 22, true, 23, "10.0.0.24", 25, "universe 26"};
  preferences.SaveToRegistry();
  EXPECT_THAT(Stored(u"2"),
              testing::StartsWith("ACN IP Address=, ACN IP Address Type=1, ACN Send To Port=0, "
                                  "Comment=, DMXListenerPort=63, Enhanced=0, ListNetworks=1, "
                                  "NetworkBrisk=61, NetworkKelvane=0, NetworkX10=62, NyxSpeed=2, "));
  EXPECT_EQ(Stored(u"2\\AuxO"),
            "ACN IP Address=10.0.0.14, ACN IP Address Type=13, ACN Send To Port=15, Comment=sixteen, "
            "Enhanced=1, NetworkKelvane=11, NyxSpeed=12, OldMCP-NewRegVal=0, Uses ACN=1, ");
  EXPECT_EQ(Stored(u"2\\DMX999"),
            "Adapter=adapter 21, Comment=universe 26, E131 IP Address=10.0.0.24, E131 IP Address Type=23, "
            "E131 Send To Port=25, Protocol=22, Uses E131=1, ");

  NetworkPreferences loaded(registry), copy(registry);
  loaded.InitFromRegistry(false);
  EXPECT_FALSE(loaded.DiffersFrom(preferences));
  copy.CopyFrom(loaded);
  EXPECT_FALSE(copy.DiffersFrom(loaded));
  loaded.SetX10Port(9);
  EXPECT_TRUE(copy.DiffersFrom(loaded));
  copy.CopyFrom(loaded);
  loaded.NyxNetwork(0).Comment = "x";
  EXPECT_TRUE(copy.DiffersFrom(loaded));
  copy.CopyFrom(loaded);
  loaded.DMXUniverse(999).Adapter = "x";
  EXPECT_TRUE(copy.DiffersFrom(loaded));
}

TEST_F(Preferences, SerialPortThatSeveralClaim_IsLeftToTheFirst) {
  struct Case {
    std::int32_t regular, third, fifteenth, x10, brisk;
    std::vector<int> left;
  };
  const Case cases[] = {
      {4, 4, 4, 4, 4, {4, 0, 0, 0, 0}},         {1, 2, 3, 4, 5, {1, 2, 3, 4, 5}},
      {1, 2, 2, 3, 3, {1, 2, 0, 3, 0}},         {1, 2, 3, 2, 3, {1, 2, 3, 0, 0}},
      {0, 0, 255, 0, 0, {0, 0, 255, 0, 0}},     {0, 0, 0, 9, 9, {0, 0, 0, 9, 0}},
      {256, 256, -1, 300, -1, {1, 0, 0, 0, 0}},  // no bytes: as if they were missing
  };
  for (const Case& ports : cases) {
    SetNumber(network_key, "NetworkKelvane", ports.regular);
    SetNumber(network_key.Below("AuxC"), "NetworkKelvane", ports.third);
    SetNumber(network_key.Below("AuxO"), "NetworkKelvane", ports.fifteenth);
    SetNumber(network_key, "NetworkX10", ports.x10);
    SetNumber(network_key, "NetworkBrisk", ports.brisk);
    preferences.InitFromRegistry(true);
    EXPECT_EQ(preferences.NyxNetwork(1).Port, 0) << "only the regular network is in use by default";
    EXPECT_EQ(ports.left, (std::vector<int>{preferences.NyxNetwork(0).Port, preferences.NyxNetwork(3).Port,
                                            preferences.NyxNetwork(15).Port, preferences.X10Port(),
                                            preferences.BriskPort()}));
  }
}

TEST_F(Preferences, NetworkLoadedAlone_HasTheDefaultsThatItWasGiven) {
  NyxNetworkPreferences network;
  network.InitFromRegistry(shared, 5, true, true, 6, "10.0.0.1", 7);
  EXPECT_EQ(network, (NyxNetworkPreferences{5, 2, false, true, true, 6, "10.0.0.1", 7, ""}));
}

TEST_F(Preferences, OldMcpOfTheRegularNetwork_HasADefaultOfItsOwn) {
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
  FailingStore store;
  int warnings = 0;
  Registry registry(store, [&](const std::string& /*warning*/) { ++warnings; });
  NetworkPreferences preferences(registry);
  preferences.InitFromRegistry(false);
  // Every call of the beginning, the last, which ends the reading in one go, and all.
  for (const int call : {1, 2, 3, 4, 5, 6, 7, 8, 9, store.calls, -1}) {
    store.calls = 0;
    store.failing_call = call;
    preferences.InitFromRegistry(true);
    EXPECT_EQ(store.open_keys, 0) << call;
    EXPECT_EQ(preferences.CommListenerPort(), 8837);
  }
  EXPECT_EQ(warnings, Registry::kMaxWarnings);
}

}  // namespace
}  // namespace tendril::test
