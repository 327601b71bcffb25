// Input: which unit listens, then what it hears. A line printer writes all of it down.
#include <memory>
#include <string>

#include "bench/faulty_units.h"
#include "bench/line_printer.h"
#include "fuzz/fuzz_input.h"

namespace tendril::fuzz {
namespace {

class Run {
 public:
  explicit Run(std::unique_ptr<VirtualUnit> unit) : unit_(std::move(unit)) {}

  // The replies to the last of these bytes.
  std::vector<Transmission> Hear(const Bytes& bytes) {
    std::vector<Transmission> replies;
    for (const std::uint8_t byte : bytes) {
      at_us_ += 521;
      Note(LineSide::kProgram, byte);
      replies = unit_->Hear(byte, at_us_);
      Check(replies.empty() || byte == 0, "a unit answers nothing but whole packets");
      for (const Transmission& reply : replies) {
        Check(reply.start_us >= at_us_ && !reply.bytes.empty(), "a unit answers after it was asked");
        for (const std::uint8_t said : reply.bytes) Note(LineSide::kUnit, said);
      }
    }
    return replies;
  }
  // Whatever it has heard, a proper unit obeys and answers.
  void CheckObeys() {
    const std::uint8_t id = unit_->id();
    Hear({0, id, 0x8A, 0x56, 0, 0, id, 0x0A, 17, 3, 1, 60, 240, 100, 200, 100, 200, 150, 150, 0x91, 0});
    Check(unit_->PortOptions(3) == kFreshPortOptions, "a unit takes options");
    const std::vector<Transmission> replies = Hear({0, id, 0x88, '0', 0x2D, 0});
    Check(replies.size() == 1 && replies[0].bytes == Bytes{0, 0, 0, 0xFE, '0', 1, 10, 0},
          "a unit acknowledges what it took");
  }
  void CheckPrinted() {
    printer_.Flush();
    Check(printed_bytes_ == noted_bytes_, "every byte is printed once");
  }

 private:
  void Note(LineSide from, std::uint8_t byte) {
    ++noted_bytes_;
    printer_.Note({.from = from, .value = byte, .at_us = at_us_});
  }
  // Behind the time and who sent it: "00 05 88", "7 x 00 05 88" or "00 05 88 ... (99 bytes)".
  void Print(const std::string& line) {
    Check(std::all_of(line.begin(), line.end(), [](char c) { return c >= ' ' && c < 0x7F; }),
          "a line is text");
    const std::string hex = line.substr(23, line.find("  ", 23) - 23);
    const std::size_t count = hex.find("... (");
    const std::size_t zeros = hex.find(" x 00");
    if (count != hex.npos) {
      printed_bytes_ += std::stoul(hex.substr(count + 5));
    } else if (zeros != hex.npos) {
      printed_bytes_ += std::stoul(hex) + (hex.size() - zeros - 5) / 3;
    } else {
      printed_bytes_ += (hex.size() + 1) / 3;
    }
  }

  std::unique_ptr<VirtualUnit> unit_;
  std::uint64_t at_us_ = 0;
  std::size_t noted_bytes_ = 0;
  std::size_t printed_bytes_ = 0;
  LinePrinter printer_{[this](const std::string& line) { Print(line); }};
};

}  // namespace
}  // namespace tendril::fuzz

extern "C" int LLVMFuzzerTestOneInput(const std::uint8_t* bytes, std::size_t size) {
  using namespace tendril;
  using namespace tendril::fuzz;
  Input input(bytes, size);
  const std::size_t kind = input.Byte() % (FaultKinds().size() + 1);
  const bool proper = kind == FaultKinds().size();
  Run run(proper ? std::make_unique<VirtualUnit>(std::uint8_t{5}) : FaultKinds()[kind].make(5));
  run.Hear(input.TakeAll());
  if (proper) run.CheckObeys();
  run.CheckPrinted();
  return 0;
}
