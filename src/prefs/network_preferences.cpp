#include "prefs/network_preferences.h"

#include "platform/runtime_error.h"
#include "prefs/preference_table.h"

namespace tendril {
namespace {

// The serial port of the regular network, unless it is said otherwise.
constexpr std::uint8_t kRegularPort = 1;

// "NetworkKelvane" is the number of the network's serial port.
constexpr PreferenceTable<NyxNetworkPreferences, 9> kNyxTable = {{
    {"NetworkKelvane", &NyxNetworkPreferences::Port},
    {"NyxSpeed", &NyxNetworkPreferences::Speed},
    {"Enhanced", &NyxNetworkPreferences::Enhanced},
    {"OldMCP-NewRegVal", &NyxNetworkPreferences::OldMCP},
    {"Uses ACN", &NyxNetworkPreferences::UsesACN},
    {"ACN IP Address Type", &NyxNetworkPreferences::ACNIPType},
    {"ACN IP Address", &NyxNetworkPreferences::ACNIPAddress},
    {"ACN Send To Port", &NyxNetworkPreferences::ACNSendToPort},
    {"Comment", &NyxNetworkPreferences::Comment},
}};

constexpr PreferenceTable<DMXUniversePrefs, 7> kUniverseTable = {{
    {"Adapter", &DMXUniversePrefs::Adapter},
    {"Protocol", &DMXUniversePrefs::Protocol},
    {"Uses E131", &DMXUniversePrefs::UsesE131},
    {"E131 IP Address Type", &DMXUniversePrefs::E131IPType},
    {"E131 IP Address", &DMXUniversePrefs::E131IPAddress},
    {"E131 Send To Port", &DMXUniversePrefs::E131SendToPort},
    {"Comment", &DMXUniversePrefs::Comment},
}};

RegistryBranch NyxKey(const RegistryBranch& network_key, std::size_t index) {
  if (index == 0) return network_key;
  return network_key.Below(std::string("Aux") + static_cast<char>('A' + index - 1));
}

RegistryBranch UniverseKey(const RegistryBranch& network_key, std::size_t number) {
  return network_key.Below("DMX" + std::to_string(number));
}

// The item of `items`, of which the first has the number `first`.
template <typename Items>
auto& ItemAt(Items& items, std::size_t number, std::size_t first) {
  if (number < first || number - first >= items.size())
    throw RuntimeError(kErrOutOfRange, "Subscript out of range");
  return items[number - first];
}

template <typename Items>
bool AnyDiffers(const Items& a, const Items& b) {
  for (std::size_t i = 0; i < a.size(); ++i) {
    if (a[i].DiffersFrom(b[i])) return true;
  }
  return false;
}

template <typename Items>
void CopyAll(const Items& from, Items& to) {
  for (std::size_t i = 0; i < from.size(); ++i) to[i].CopyFrom(from[i]);
}

}  // namespace

void NyxNetworkPreferences::InitFromRegistry(const RegistryBranch& key, std::uint8_t default_port,
                                             bool default_old_mcp, bool default_uses_acn,
                                             std::int32_t default_acn_ip_type,
                                             const std::string& default_acn_ip_address,
                                             std::int32_t default_acn_send_to_port) {
  NyxNetworkPreferences defaults;
  defaults.Port = default_port;
  defaults.OldMCP = default_old_mcp;
  defaults.UsesACN = default_uses_acn;
  defaults.ACNIPType = default_acn_ip_type;
  defaults.ACNIPAddress = default_acn_ip_address;
  defaults.ACNSendToPort = default_acn_send_to_port;
  ReadPreferences(kNyxTable, key, defaults, *this);
}

void NyxNetworkPreferences::SaveToRegistry(const RegistryBranch& key) const {
  WritePreferences(kNyxTable, key, *this);
}

void NyxNetworkPreferences::CopyFrom(const NyxNetworkPreferences& other) {
  CopyPreferences(kNyxTable, other, *this);
}

bool NyxNetworkPreferences::DiffersFrom(const NyxNetworkPreferences& other) const {
  return PreferencesDiffer(kNyxTable, *this, other);
}

void DMXUniversePrefs::InitFromRegistry(const RegistryBranch& key) {
  ReadPreferences(kUniverseTable, key, {}, *this);
}

void DMXUniversePrefs::SaveToRegistry(const RegistryBranch& key) const {
  WritePreferences(kUniverseTable, key, *this);
}

void DMXUniversePrefs::CopyFrom(const DMXUniversePrefs& other) {
  CopyPreferences(kUniverseTable, other, *this);
}

bool DMXUniversePrefs::DiffersFrom(const DMXUniversePrefs& other) const {
  return PreferencesDiffer(kUniverseTable, *this, other);
}

const auto& NetworkPreferences::GeneralTable() {
  static constexpr PreferenceTable<General, 4> kTable = {{
      {"ListNetworks", &General::ListNetworks},
      {"NetworkBrisk", &General::BriskPort},
      {"NetworkX10", &General::X10Port},
      {"DMXListenerPort", &General::CommListenerPort},
  }};
  return kTable;
}

NetworkPreferences::NetworkPreferences(Registry& registry)
    : registry_(registry), networks_(kNetworks), universes_(kUniverses) {}

RegistryBranch NetworkPreferences::NetworkKey() const {
  // No key has a longer name, and the paths of a thousand keys are made with it.
  constexpr std::size_t kLongestName = 255;
  const RegistryBranch shared = RegistryBranch::Shared(registry_);
  return shared.Below("Network" + shared.Below("NetVersion").GetString("Ver", "").substr(0, kLongestName));
}

void NetworkPreferences::InitFromRegistry(bool force) {
  if (initialised_ && !force) return;
  try {
    registry_.InOneGo([this] { Load(); });
  } catch (...) {
    // The values are there; only that they were read in one go could not be brought to its end.
  }
  RemovePortClashes();
  initialised_ = true;
}

void NetworkPreferences::Load() {
  const RegistryBranch key = NetworkKey();
  ReadPreferences(GeneralTable(), key, {}, general_);
  const NyxNetworkPreferences other;
  for (std::size_t i = 0; i < kNetworks; ++i) {
    const bool is_regular = i == 0;
    const bool old_mcp = is_regular && key.GetBoolean("NyxOldMCP", false);
    networks_[i].InitFromRegistry(NyxKey(key, i), is_regular ? kRegularPort : other.Port, old_mcp,
                                  other.UsesACN, other.ACNIPType, other.ACNIPAddress, other.ACNSendToPort);
  }
  for (std::size_t number = 1; number <= kUniverses; ++number) {
    DMXUniverse(number).InitFromRegistry(UniverseKey(key, number));
  }
}

void NetworkPreferences::RemovePortClashes() {
  for (std::size_t i = 0; i < kNetworks; ++i) {
    const std::uint8_t port = networks_[i].Port;
    if (port == 0) continue;
    for (std::size_t later = i + 1; later < kNetworks; ++later) {
      if (networks_[later].Port == port) networks_[later].Port = 0;
    }
    if (general_.X10Port == port) general_.X10Port = 0;
    if (general_.BriskPort == port) general_.BriskPort = 0;
  }
  if (general_.X10Port == general_.BriskPort) general_.BriskPort = 0;
}

void NetworkPreferences::SaveToRegistry() const {
  registry_.InOneGo([this] {
    const RegistryBranch key = NetworkKey();
    WritePreferences(GeneralTable(), key, general_);
    for (std::size_t i = 0; i < kNetworks; ++i) networks_[i].SaveToRegistry(NyxKey(key, i));
    for (std::size_t number = 1; number <= kUniverses; ++number) {
      DMXUniverse(number).SaveToRegistry(UniverseKey(key, number));
    }
  });
}

void NetworkPreferences::CopyFrom(const NetworkPreferences& other) {
  initialised_ = other.initialised_;
  CopyPreferences(GeneralTable(), other.general_, general_);
  CopyAll(other.networks_, networks_);
  CopyAll(other.universes_, universes_);
}

bool NetworkPreferences::DiffersFrom(const NetworkPreferences& other) const {
  return PreferencesDiffer(GeneralTable(), general_, other.general_) ||
         AnyDiffers(networks_, other.networks_) || AnyDiffers(universes_, other.universes_);
}

NyxNetworkPreferences& NetworkPreferences::NyxNetwork(std::size_t index) {
  return ItemAt(networks_, index, 0);
}

DMXUniversePrefs& NetworkPreferences::DMXUniverse(std::size_t number) {
  return ItemAt(universes_, number, 1);
}

const DMXUniversePrefs& NetworkPreferences::DMXUniverse(std::size_t number) const {
  return ItemAt(universes_, number, 1);
}

}  // namespace tendril
