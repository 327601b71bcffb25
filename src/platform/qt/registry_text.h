// The text form of a registry, as the registry editor exports it:
//
//   Windows Registry Editor Version 5.00
//
//   [HKEY_CURRENT_USER\Software\Kelvane\Shared\Network]
//   "DMXListenerPort"=dword:00002285         one to eight hexadecimal digits
//   "Comment"="text, with \\ and \""         also \n and \r
//   @="the value without a name"
//   "Data"=hex:00,01,02,\                    hex(t): data of the type t; a line that ends with "\" goes on in the
//     03                                     next one, which begins with a space or tab
//   ; comment
#pragma once

#include <QByteArray>
#include <cstddef>
#include <functional>

#include "platform/memory_registry.h"

namespace tendril {

// Gets the number of a line that cannot be read, counted from 1.
using UnreadLineSink = std::function<void(std::size_t line)>;

// The keys of a file: UTF-16, low byte first, with its mark, or UTF-8. A line that cannot be read is skipped. A last line
// without an end may have been cut off: it counts only if that cannot have changed its value. Raises std::runtime_error
// for another encoding, and for more than a million keys and values.
RegistryKeys ReadRegistryText(const QByteArray& bytes, const UnreadLineSink& unread);

// A file with these keys, in UTF-16 as the registry editor writes it.
QByteArray WriteRegistryText(const RegistryKeys& keys);

}  // namespace tendril
