#include "prefs/network_preferences.h"

#include <array>
#include <limits>
#include <variant>

#include "platform/runtime_error.h"

namespace tendril {
namespace {

// A value's name in the registry and the member that holds it. The member's type is the value's: a number, a number
// kept as a byte, a Boolean or a string.
template <typename Owner>
struct Preference {
  const char* name;
  std::variant<std::int32_t Owner::*, std::uint8_t Owner::*, bool Owner::*, std::string Owner::*> member;
};

template <typename Owner, std::size_t kRows>
using PreferenceTable = std::array<Preference<Owner>, kRows>;

constexpr PreferenceTable<GeneralNetworkPreferences, 4> kGeneralTable = {{
    {"ListNetworks", &GeneralNetworkPreferences::ListNetworks},
    {"NetworkBrisk", &GeneralNetworkPreferences::BriskPort},
    {"NetworkX10", &GeneralNetworkPreferences::X10Port},
    {"DMXListenerPort", &GeneralNetworkPreferences::CommListenerPort},
}};

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

std::int32_t Read(const RegistryBranch& key, const char* name, std::int32_t fallback) {
  return key.GetNumber(name, fallback);
}
// A number that does not fit into a byte counts as missing.
std::uint8_t Read(const RegistryBranch& key, const char* name, std::uint8_t fallback) {
  const std::int32_t number = key.GetNumber(name, fallback);
  const bool fits = number >= 0 && number <= std::numeric_limits<std::uint8_t>::max();
  return fits ? static_cast<std::uint8_t>(number) : fallback;
}
bool Read(const RegistryBranch& key, const char* name, bool fallback) {
  return key.GetBoolean(name, fallback);
}
std::string Read(const RegistryBranch& key, const char* name, const std::string& fallback) {
  return key.GetString(name, fallback);
}

void Write(const RegistryBranch& key, const char* name, std::int32_t value) { key.SetNumber(name, value); }
void Write(const RegistryBranch& key, const char* name, bool value) { key.SetBoolean(name, value); }
void Write(const RegistryBranch& key, const char* name, const std::string& value) {
  key.SetString(name, value);
}

// Reads all values of the table; a missing one becomes what `defaults` holds.
template <typename Owner, std::size_t kRows>
void ReadAll(const PreferenceTable<Owner, kRows>& table, const RegistryBranch& key, const Owner& defaults,
             Owner& owner) {
  for (const auto& row : table) {
    std::visit([&](auto member) { owner.*member = Read(key, row.name, defaults.*member); }, row.member);
  }
}

// Creates the key where it is missing, and writes all values of the table.
template <typename Owner, std::size_t kRows>
void WriteAll(const PreferenceTable<Owner, kRows>& table, const RegistryBranch& key, const Owner& owner) {
  key.CreateKey();
  for (const auto& row : table) {
    std::visit([&](auto member) { Write(key, row.name, owner.*member); }, row.member);
  }
}

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
  ReadAll(kNyxTable, key, defaults, *this);
}

void NyxNetworkPreferences::SaveToRegistry(const RegistryBranch& key) const {
  WriteAll(kNyxTable, key, *this);
}

void DMXUniversePrefs::InitFromRegistry(const RegistryBranch& key) {
  ReadAll(kUniverseTable, key, {}, *this);
}

void DMXUniversePrefs::SaveToRegistry(const RegistryBranch& key) const {
  WriteAll(kUniverseTable, key, *this);
}

NetworkPreferences::NetworkPreferences(Registry& registry)
    : registry_(registry), networks_(kNetworks), universes_(kUniverses) {}

RegistryBranch NetworkPreferences::NetworkKey() const {
  // No key has a longer name, and the paths of a thousand keys contain it.
  constexpr std::size_t kMaxNameLength = 255;
  const RegistryBranch shared = RegistryBranch::Shared(registry_);
  return shared.Below("Network" + shared.Below("NetVersion").GetString("Ver", "").substr(0, kMaxNameLength));
}

void NetworkPreferences::InitFromRegistry(bool force) {
  if (initialised_ && !force) return;
  try {
    registry_.InOneGo([this] { Load(); });
  } catch (...) {
    // All values have been read: only the key that was held open could not be closed.
  }
  RemovePortClashes();
  initialised_ = true;
}

void NetworkPreferences::Load() {
  const RegistryBranch key = NetworkKey();
  ReadAll(kGeneralTable, key, {}, general_);
  const NyxNetworkPreferences defaults;
  for (std::size_t i = 0; i < kNetworks; ++i) {
    constexpr std::uint8_t kRegularPort = 1;
    const bool is_regular = i == 0;
    const bool old_mcp = is_regular && key.GetBoolean("NyxOldMCP", false);
    networks_[i].InitFromRegistry(NyxKey(key, i), is_regular ? kRegularPort : defaults.Port, old_mcp,
                                  defaults.UsesACN, defaults.ACNIPType, defaults.ACNIPAddress,
                                  defaults.ACNSendToPort);
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
    WriteAll(kGeneralTable, key, general_);
    for (std::size_t i = 0; i < kNetworks; ++i) networks_[i].SaveToRegistry(NyxKey(key, i));
    for (std::size_t number = 1; number <= kUniverses; ++number) {
      universes_[number - 1].SaveToRegistry(UniverseKey(key, number));
    }
  });
}

void NetworkPreferences::CopyFrom(const NetworkPreferences& other) {
  initialised_ = other.initialised_;
  general_ = other.general_;
  networks_ = other.networks_;
  universes_ = other.universes_;
}

bool NetworkPreferences::DiffersFrom(const NetworkPreferences& other) const {
  return general_ != other.general_ || networks_ != other.networks_ || universes_ != other.universes_;
}

NyxNetworkPreferences& NetworkPreferences::NyxNetwork(std::size_t index) {
  return ItemAt(networks_, index, 0);
}

DMXUniversePrefs& NetworkPreferences::DMXUniverse(std::size_t number) {
  return ItemAt(universes_, number, 1);
}

}  // namespace tendril
