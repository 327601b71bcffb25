// The configuration as text: JSON for mail, version control and programs. docs/configuration-format.md describes it.
#pragma once

#include <QByteArray>
#include <QString>
#include <array>
#include <cstdint>
#include <optional>
#include <variant>

#include "config/channel_config.h"
#include "exchange/refusal.h"

namespace tendril {

// No longer text is read or written, in bytes.
inline constexpr qsizetype kMaxConfigurationText = qsizetype{1024} * 1024;

// What a text holds. All strings are valid Unicode.
struct ConfigurationText {
  std::optional<std::uint8_t> unit;  // 01 to FF: the records were read from it
  std::optional<QString> read;       // when: "2026-11-22T14:02:31+01:00", or with Z
  std::optional<QString> note;
  std::array<std::optional<QString>, kPortCount> names;  // of the ports: "jaw, left"
  ChannelTable records;

  friend bool operator==(const ConfigurationText&, const ConfigurationText&) = default;
};

// The same configuration gives the same text, in UTF-8, a field a line. Refuses records that EncodeOptions() refuses.
std::variant<QByteArray, Refusal> WriteConfiguration(const ConfigurationText& configuration);

// Takes a text as a whole or not at all. It is UTF-8, and may begin with its mark.
std::variant<ConfigurationText, Refusal> ReadConfiguration(const QByteArray& text);

}  // namespace tendril
