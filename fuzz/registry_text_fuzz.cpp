// Input: a registry file. A short one that ends in 1A is repeated up to 64 KiB, which shows what takes more time than it
// should.
#include "platform/registry_text.h"

#include <ctime>
#include <stdexcept>

#include "fuzz/fuzz_input.h"

namespace tendril::fuzz {
namespace {

constexpr std::size_t kLongestRepeated = 64;
constexpr std::size_t kLargest = 65536;
constexpr double kMostSeconds =
    0.5;  // of the processor, for reading it twice; some ten times of what it takes

void CheckSame(const RegistryKey& a, const RegistryKey& b, bool top) {
  Check(a.other_lines == b.other_lines, "other lines are read as they were written");
  const auto same = [](const auto& x, const auto& y) {
    return x.first == y.first && x.second.type == y.second.type && x.second.data == y.second.data;
  };
  Check(std::equal(a.values.begin(), a.values.end(), b.values.begin(), b.values.end(), same),
        "values are read as they were written");
  auto read = b.subkeys.begin();
  for (const auto& [name, key] : a.subkeys) {
    if (top && key->subkeys.empty() && key->values.empty() && key->other_lines.empty())
      continue;  // needs no line
    Check(read != b.subkeys.end() && read->first == name, "keys are read as they were written");
    CheckSame(*key, *read++->second, false);
  }
  Check(read == b.subkeys.end(), "no key is read that was not written");
}

}  // namespace
}  // namespace tendril::fuzz

extern "C" int LLVMFuzzerTestOneInput(const std::uint8_t* data, std::size_t size) {
  using namespace tendril;
  using namespace tendril::fuzz;
  Bytes bytes(data, data + size);
  if (size > 1 && size <= kLongestRepeated && bytes.back() == 0x1A) {
    bytes.pop_back();
    while (bytes.size() < kLargest) bytes.insert(bytes.end(), data, data + size - 1);
  }
  const std::clock_t start = std::clock();
  const std::size_t lines = 1 + static_cast<std::size_t>(std::count(bytes.begin(), bytes.end(), '\n'));
  RegistryTree tree;
  RegistryForm form;
  try {
    form = ReadRegistryText(bytes, tree, [&](std::size_t line) {
      Check(line >= 1 && line <= lines, "a line that is not read is one of the file's");
    });
  } catch (const std::runtime_error&) {
    return 0;  // another encoding
  }
  const Bytes written = WriteRegistryText(form, tree);
  RegistryTree tree_again;
  const RegistryForm form_again = ReadRegistryText(written, tree_again, [](std::size_t /*line*/) {});
  Check(form_again.encoding == form.encoding && form_again.line_end == form.line_end &&
            form_again.lines_outside == form.lines_outside,
        "the form is read as it was written");
  CheckSame(tree.top(), tree_again.top(), true);
  Check(WriteRegistryText(form_again, tree_again) == written, "what was read again is written as before");
  const auto ticks = static_cast<double>(std::clock() - start);
  Check(ticks < kMostSeconds * CLOCKS_PER_SEC, "time grows with the number of bytes, not faster");
  return 0;
}
