// The text form of a registry, as the registry editor exports it:
//
//   Windows Registry Editor Version 5.00
//
//   [HKEY_CURRENT_USER\Software\Kelvane\Shared\Network]
//   "DMXListenerPort"=dword:00002285         one to eight hexadecimal digits
//   "Comment"="text, with \\ and \""
//   @="the value without a name"
//   "Data"=hex:00,01,02,\                  hex(t): data of the type t; a line that ends with "\" goes on in the
//     03                                   next one, which begins with a space
//   "Old"=-                                takes a value away; [-key] a key with all below it
//   ; comment
#pragma once

#include <cstdint>
#include <functional>
#include <span>
#include <string>
#include <string_view>
#include <vector>

#include "platform/bytes.h"
#include "platform/registry_tree.h"

namespace tendril {

enum class RegistryEncoding {
  kUtf16,         // low byte first, with a byte order mark, as the editor exports
  kUtf8,          // without a mark
  kUtf8WithMark,  // a mark that is no text
};

// How a file says what it says, apart from its keys.
struct RegistryForm {
  RegistryEncoding encoding = RegistryEncoding::kUtf16;
  std::u16string line_end = u"\r\n";
  std::u16string header = u"Windows Registry Editor Version 5.00";
  // Lines that belong to no key: comments in front of the first one, and what cannot be read.
  std::vector<std::u16string> lines_outside;
};

// Who is told of a line that cannot be read: its number, counted from 1.
using UnreadLineSink = std::function<void(std::size_t line)>;

// Adds what a file's bytes say to `tree`, in time that grows with their number. What cannot be read is passed over, and
// kept as a line of its key; of a file that ends in the middle of a line, the whole lines count, and that line becomes a
// comment. Raises std::runtime_error for another encoding than those above, and std::length_error for more than a
// million keys and lines, which no installation has.
RegistryForm ReadRegistryText(std::span<const std::uint8_t> bytes, RegistryTree& tree,
                              const UnreadLineSink& unread);

// The bytes of a file of this form that says the same: keys and values in the order of their names, other lines in
// front of them.
Bytes WriteRegistryText(const RegistryForm& form, const RegistryTree& tree);

}  // namespace tendril
