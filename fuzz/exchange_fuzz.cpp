// Input: a configuration as text. What is taken is written, and read again, to the same.
#include <QByteArray>

#include "exchange/configuration_text.h"
#include "fuzz/fuzz_input.h"

extern "C" int LLVMFuzzerTestOneInput(const std::uint8_t* bytes, std::size_t size) {
  using namespace tendril;
  const auto read =
      ReadConfiguration(QByteArray(reinterpret_cast<const char*>(bytes), static_cast<qsizetype>(size)));
  if (const auto* refusal = std::get_if<Refusal>(&read)) {
    const QString sentence = refusal->Sentence();
    fuzz::Check(!refusal->reason.isEmpty() && sentence.size() < 200, "a refusal is a sentence");
    for (const QChar c : sentence) fuzz::Check(c >= u' ', "a sentence is one line");
    return 0;
  }
  const auto& taken = std::get<ConfigurationText>(read);
  const auto written = WriteConfiguration(taken);
  fuzz::Check(std::holds_alternative<QByteArray>(written), "what is taken can be written");
  const auto again = ReadConfiguration(std::get<QByteArray>(written));
  const auto* same = std::get_if<ConfigurationText>(&again);
  fuzz::Check(same != nullptr && *same == taken, "what is written is read to the same");
  return 0;
}
