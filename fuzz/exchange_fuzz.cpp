// Input: a configuration as text; or a zero byte, then a place in a text, what to put there, and the configuration that the
// text is made of.
#include <QByteArray>
#include <QString>

#include "exchange/configuration_text.h"
#include "fuzz/fuzz_input.h"

namespace tendril::fuzz {
namespace {

// What is taken is written, and read again to the same.
void CheckText(const QByteArray& text) {
  const auto read = ReadConfiguration(text);
  if (const auto* refusal = std::get_if<Refusal>(&read)) {
    const QString sentence = refusal->Sentence();
    Check(!refusal->reason.isEmpty() && sentence.size() < 200, "a refusal is a sentence");
    return Check(std::all_of(sentence.begin(), sentence.end(), [](QChar c) { return c >= u' '; }),
                 "of one line");
  }
  const auto& taken = std::get<ConfigurationText>(read);
  const auto written = WriteConfiguration(taken);
  Check(std::holds_alternative<QByteArray>(written), "what is taken can be written");
  const auto again = ReadConfiguration(std::get<QByteArray>(written));
  const auto* same = std::get_if<ConfigurationText>(&again);
  Check(same != nullptr && *same == taken, "what is written is read to the same");
}

// Any configuration that can be sent.
ConfigurationText Configuration(Input& input) {
  ConfigurationText configuration;
  const auto width = [&input] {
    return kMinPulseWidth + input.Byte() * 10 % (kMaxPulseWidth - kMinPulseWidth + 1);
  };
  for (std::size_t slot = 0; slot < kPortCount; ++slot) {
    ChannelConfig& record = configuration.records.At(slot);
    record.PortType = static_cast<std::int16_t>(input.Byte() % 3);
    for (PulsePair* pair : {&record.ActualRange, &record.VirtualRange, &record.VirtualStops})
      *pair = {width(), width()};
    record.DefaultPosition = record.NeutralPosition = width();
    record.PowerUPOpt = 1 + input.Byte() % 3;
    record.LostCommOption = 1 + input.Byte() % 4;
  }
  const Bytes note = input.Take(input.Byte());
  configuration.note = QString::fromUtf8(reinterpret_cast<const char*>(note.data()), std::ssize(note));
  return configuration;
}

}  // namespace
}  // namespace tendril::fuzz

// Patterns that are compiled to machine code for each text would take most of the time.
extern "C" int LLVMFuzzerInitialize(int* /*argc*/, char*** /*argv*/) {
  qputenv("QT_ENABLE_REGEXP_JIT", "0");
  return 0;
}

extern "C" int LLVMFuzzerTestOneInput(const std::uint8_t* bytes, std::size_t size) {
  using namespace tendril;
  using namespace tendril::fuzz;
  if (size == 0 || bytes[0] != 0) {
    CheckText(QByteArray(reinterpret_cast<const char*>(bytes), static_cast<qsizetype>(size)));
    return 0;
  }
  Input input(bytes + 1, size - 1);
  const qsizetype place = input.Byte() * 256 + input.Byte();
  const qsizetype length = input.Byte() % 8;
  const Bytes instead = input.Take(input.Byte() % 8);
  const ConfigurationText configuration = Configuration(input);
  QByteArray text = std::get<QByteArray>(WriteConfiguration(configuration));
  Check(std::get<ConfigurationText>(ReadConfiguration(text)) == configuration, "a text is its configuration");
  text.replace(place % text.size(), length,
               QByteArray(reinterpret_cast<const char*>(instead.data()), std::ssize(instead)));
  CheckText(text);
  return 0;
}
