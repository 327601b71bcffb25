// Packets of the network in words and in hexadecimal, for the user to read.
#pragma once

#include <cstddef>
#include <cstdint>
#include <span>
#include <string>
#include <utility>

#include "platform/bytes.h"

namespace tendril {

// What a packet that the program sent means, given with or without its zero bytes: "set options of port 3 of unit 01".
std::string DescribeSent(std::span<const std::uint8_t> bytes);
// The same of a packet that arrived: "reply to '0': acknowledged", "noise".
std::string DescribeReceived(std::span<const std::uint8_t> bytes);

// Whether this is a reply to the program, whatever it answers.
bool IsReply(std::span<const std::uint8_t> bytes);

// Zero bytes at the beginning of `bytes`: the rest of the line's frame, or the pads of a patient unit.
std::size_t LeadingZeros(std::span<const std::uint8_t> bytes);

// At most `shown` bytes in hexadecimal; `all` is how many there were, of which `bytes` are the first. Many zero bytes at
// the beginning are given as a count: "45 x 00 FE 30 01 0A 00".
std::string ShownBytes(std::span<const std::uint8_t> bytes, std::size_t shown, std::size_t all);

// Takes the bytes of one direction and cuts them into packets: each ends with the zero byte after its content.
class PacketSplitter {
 public:
  // True: the byte ends a packet.
  bool Push(std::uint8_t byte) {
    bytes_.push_back(byte);
    if (byte == 0) return std::exchange(has_content_, false);
    has_content_ = true;
    return false;
  }
  // What came since the last packet was taken.
  const Bytes& Seen() const { return bytes_; }
  // Takes it.
  Bytes Take() {
    has_content_ = false;
    return std::exchange(bytes_, {});
  }
  // Whether one of the bytes that came since is not zero.
  bool HasContent() const { return has_content_; }
  bool Empty() const { return bytes_.empty(); }
  std::size_t Size() const { return bytes_.size(); }

 private:
  Bytes bytes_;
  bool has_content_ = false;
};

}  // namespace tendril
