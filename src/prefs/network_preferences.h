// The lighting networks of a show installation, as the maker's programs keep them in the current user's registry.
#pragma once

#include <cstddef>
#include <cstdint>
#include <string>
#include <vector>

#include "prefs/registry.h"

namespace tendril {

// One serial lighting network. Members have the defaults of a network other than the regular one.
struct NyxNetworkPreferences {
  std::uint8_t Port = 0;   // number of its serial port; 0 = the network is not used
  std::int32_t Speed = 2;  // index of the network's baud rate
  bool Enhanced = false;
  bool OldMCP = false;
  bool UsesACN = false;
  std::int32_t ACNIPType = 1;
  std::string ACNIPAddress;
  std::int32_t ACNSendToPort = 0;
  std::string Comment;

  // Reads the values of `key`; a missing one becomes the default given here, 2 (Speed), false (Enhanced) or ""
  // (Comment). Does not fail.
  void InitFromRegistry(const RegistryBranch& key, std::uint8_t default_port, bool default_old_mcp,
                        bool default_uses_acn, std::int32_t default_acn_ip_type,
                        const std::string& default_acn_ip_address, std::int32_t default_acn_send_to_port);
  // Creates the key where it is missing and writes all values. Raises the registry's failures.
  void SaveToRegistry(const RegistryBranch& key) const;
  void CopyFrom(const NyxNetworkPreferences& other) { *this = other; }
  bool DiffersFrom(const NyxNetworkPreferences& other) const { return *this != other; }

  bool operator==(const NyxNetworkPreferences&) const = default;
};

// One DMX universe.
struct DMXUniversePrefs {
  std::string Adapter;
  std::int32_t Protocol = 0;
  bool UsesE131 = false;
  std::int32_t E131IPType = 1;
  std::string E131IPAddress;
  std::int32_t E131SendToPort = 0;
  std::string Comment;

  // As for a serial network, with the defaults above.
  void InitFromRegistry(const RegistryBranch& key);
  void SaveToRegistry(const RegistryBranch& key) const;
  void CopyFrom(const DMXUniversePrefs& other) { *this = other; }
  bool DiffersFrom(const DMXUniversePrefs& other) const { return *this != other; }

  bool operator==(const DMXUniversePrefs&) const = default;
};

// The values of the network key that belong to no single network.
struct GeneralNetworkPreferences {
  bool ListNetworks = false;
  std::uint8_t BriskPort = 0;
  std::uint8_t X10Port = 0;
  std::int32_t CommListenerPort = 8837;

  bool operator==(const GeneralNetworkPreferences&) const = default;
};

// All of them.
class NetworkPreferences {
 public:
  static constexpr std::size_t kNetworks = 16;    // the regular one, 0, and the auxiliary ones
  static constexpr std::size_t kUniverses = 999;  // numbered from 1

  // Holds the defaults of a fresh description, with no network in use, until it is loaded. `registry` must outlive it.
  explicit NetworkPreferences(Registry& registry);
  NetworkPreferences(const NetworkPreferences&) = delete;
  NetworkPreferences& operator=(const NetworkPreferences&) = delete;

  // Loads everything; what is missing gets its default. A serial port that several networks claim is left to the
  // first of them: of the serial networks the lower number comes first, then X10, then Brisk. Does nothing when the
  // object was loaded before, unless `force`. Never fails.
  void InitFromRegistry(bool force);
  // Writes everything to where InitFromRegistry() would read it. Raises the registry's failures.
  void SaveToRegistry() const;
  // Copies the values, and whether they were loaded; not the registry.
  void CopyFrom(const NetworkPreferences& other);
  bool DiffersFrom(const NetworkPreferences& other) const;

  bool ListNetworks() const { return general_.ListNetworks; }
  void SetListNetworks(bool list) { general_.ListNetworks = list; }
  // Serial port number of the Brisk network; 0 = none.
  std::uint8_t BriskPort() const { return general_.BriskPort; }
  void SetBriskPort(std::uint8_t port) { general_.BriskPort = port; }
  // Serial port number of the X10 interface; 0 = none.
  std::uint8_t X10Port() const { return general_.X10Port; }
  void SetX10Port(std::uint8_t port) { general_.X10Port = port; }
  // TCP port of the Control Panel's comm listener, as it is stored: any 32-bit number.
  std::int32_t CommListenerPort() const { return general_.CommListenerPort; }
  void SetCommListenerPort(std::int32_t port) { general_.CommListenerPort = port; }

  // Networks 0 to 15. Raises kErrOutOfRange for another one.
  NyxNetworkPreferences& NyxNetwork(std::size_t index);
  // Universes 1 to 999. Raises kErrOutOfRange for another one.
  DMXUniversePrefs& DMXUniverse(std::size_t number);

 private:
  RegistryBranch NetworkKey() const;
  void Load();
  void RemovePortClashes();

  Registry& registry_;
  bool initialised_ = false;
  GeneralNetworkPreferences general_;
  std::vector<NyxNetworkPreferences> networks_;
  std::vector<DMXUniversePrefs> universes_;
};

}  // namespace tendril
