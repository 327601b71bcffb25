// Configuration files: read with one sentence when they are refused, and written whole or not at all.
#pragma once

#include <QByteArray>
#include <QJsonObject>
#include <QString>
#include <cstdint>
#include <functional>
#include <span>
#include <variant>

#include "ctl/command_line.h"
#include "exchange/configuration_text.h"

namespace tendril::ctl {

// `path` in a sentence: "-" is standard input.
QString NameOfFile(const QString& path);

// Reads the configuration file `path`; "-" is standard input. Returns why it cannot be used: a sentence that begins
// with the file's name.
std::variant<ConfigurationText, QString> ReadConfigurationFile(const QString& path);

// The text of a configuration as an object of a larger JSON document.
QJsonObject AsJson(const QByteArray& configuration);

// "unit-0A.json".
QString UnitFileName(std::uint8_t unit);
// "unit-0A.json" in `folder`; empty: the current one.
QString UnitFilePath(const QString& folder, std::uint8_t unit);

// Why WriteNewFile() would refuse `path`, as far as that shows beforehand: a sentence; empty when it does
// not. Changes nothing.
QString WhyNotWritable(const QString& path, const CommandLine& line);

// Where a unit's configuration is kept; empty: on standard output.
using PathOfUnit = std::function<QString(std::uint8_t unit)>;
// The same for the files of all `units`: empty when none would be refused.
QString WhyNoneWritable(std::span<const std::uint8_t> units, const PathOfUnit& path_of,
                        const CommandLine& line);

// Writes `path` whole or not at all, and leaves no other file behind. Creates its folder. Replaces a file that exists
// only with --force. Returns why it is not written: a sentence; empty when it is.
QString WriteNewFile(const QString& path, const QByteArray& text, const CommandLine& line);

}  // namespace tendril::ctl
