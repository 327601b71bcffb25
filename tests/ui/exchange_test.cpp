// The configuration as text on the clipboard, and the summary's table.
#include <QClipboard>

#include "window_fixture.h"

namespace tendril::test {
namespace {

using testing::EndsWith;
using testing::HasSubstr;
using testing::MatchesRegex;
using testing::Not;
using testing::StartsWith;

class Exchange : public Window {
 protected:
  void Paste(const std::string& text) {
    QGuiApplication::clipboard()->setText(QString::fromStdString(text));
    Keys("Ctrl+Shift+V");
  }
  static std::string Replaced(std::string text, const std::string& old, const std::string& with) {
    return text.replace(text.find(old), old.size(), with);
  }
};

TEST_F(Exchange, CopyEditPasteUndo) {
  auto& unit = ConnectUnit();
  unit.SetPortOptions(2, {1, 70, 230, 90, 190, 95, 180, 130, 140});
  Run("Command3_1");
  const ChannelTable read = window_->WorkingConfiguration();
  Keys("Ctrl+Shift+C");
  EXPECT_EQ(Text("lblStatus"), "Copied the configuration: 8 channels");
  const std::string text = Copied();
  EXPECT_THAT(text, HasSubstr("\n  \"unit\": \"01\",\n  \"read\": \"20"));

  Click("ServoSimulator2_4");
  TypeOver("spnDefaultPos", "-100");
  Keys("Ctrl+Shift+C");
  EXPECT_THAT(Copied(), testing::AllOf(HasSubstr("\"defaultPosition\": 1400"), Not(HasSubstr("\"unit\""))))
      << "typed";
  const ChannelTable edited = window_->WorkingConfiguration();
  ChooseByKeys("CmbUnitID_1", 7);
  Paste(Replaced(Replaced(text, "[900, 1900]", "[905, 1900]"), "\"unit\": \"01\"",
                 "\"unit\": \"22\", \"note\": \"\""));
  EXPECT_EQ(Record(1).VirtualRange, (PulsePair{905, 1900}));
  EXPECT_EQ(Record(4), read.At(4));
  EXPECT_EQ(Text("lblStatus"), "Paste: channels 2 and 5 changed");
  EXPECT_THAT(Text("lblOrigin"), MatchesRegex("Read from 01 at .....; channel 2 changed since"));
  EXPECT_EQ(Spin("spnDefaultPos").value(), 0);
  EXPECT_EQ(Find<QComboBox>("CmbUnitID_1").currentIndex(), 7);
  Keys("Ctrl+Shift+V");
  EXPECT_EQ(Text("lblStatus"), "Paste: no channel changed");
  Keys("Ctrl+Z");
  EXPECT_TRUE(window_->WorkingConfiguration() == edited);
  Paste(text);
  EXPECT_TRUE(window_->WorkingConfiguration() == read);
  Keys("Ctrl+Shift+C");
  EXPECT_EQ(Copied(), text) << "it is again what was read";
}

TEST_F(Exchange, RefusedTextChangesNothing) {
  Keys("Ctrl+Shift+C");
  const std::string text = Copied();
  Click("ServoSimulator2_4");
  const ChannelTable before = window_->WorkingConfiguration();
  for (const auto& [pasted, sentence] :
       {std::pair(Replaced(text, "1500", "5"),
                  "port 1, defaultPosition: 5 is not a whole number from 10 to 2550"),
        {"Hello", "line 1: this is no configuration, which begins with {"},
        {std::string(2'000'000, ' '), "the text is larger than 1 MiB"},
        {"", "there is no text on the clipboard"}}) {
    Paste(pasted);
    EXPECT_EQ(Text("lblStatus"), std::string("Not pasted: ") + sentence);
    EXPECT_TRUE(window_->WorkingConfiguration() == before);
  }
  EXPECT_TRUE(world_.boxes.shown.empty());
}

TEST_F(Exchange, RecordThatCannotBeSent_IsNotCopied) {
  ConnectUnit().SetPortOptions(3, {4, 60, 240, 100, 200, 100, 200, 150, 150});
  Run("Command3_1");
  QGuiApplication::clipboard()->setText(QStringLiteral("kept"));
  Keys("Ctrl+Shift+C");
  EXPECT_EQ(Text("lblStatus"), "Not copied: port 3: output kind -1 cannot be sent");
  EXPECT_EQ(Copied(), "kept");
}

TEST_F(Exchange, InTheSummary) {
  Click("ServoSimulator2_6");
  Press("optChannelType_1");
  Keys("Ctrl+Shift+C");
  const std::string text = Copied();
  ShowSummary();
  Paste(Replaced(text, "[600, 2400]", "[600, 2405]"));
  EXPECT_EQ(Text("txtSumActualRange_0"), "600-2405") << "as it is in the text";
  EXPECT_EQ(Record(0).ActualRange, (PulsePair{600, 2405}));
  ASSERT_EQ(window_->focusWidget(), &Find("txtSumActualRange_0"));
  Keys("Ctrl+C");
  EXPECT_EQ(Text("lblStatus"), "Copied the table: 8 channels");
  EXPECT_THAT(Copied(),
              StartsWith("Channel\tOutput\tActual Range low\tActual Range high\tVirtual Range low\t"));
  EXPECT_THAT(Copied(),
              HasSubstr("\n1\tServo\t600\t2405\t1000\t2000\t1000\t2000\t1500\t1500\t"
                        "Start Pulse on First Command\tStop Pulse / Start on First Command\n2\tServo"));
  EXPECT_THAT(Copied(), HasSubstr("\n7\tDigital\t\t\t\t\t\t\t\t\t\t\n8\tServo\t600"));
  Click("txtSumNeutralPosition_3");
  Spin("spnSumValue_0").selectAll();
  Keys("Ctrl+C");
  EXPECT_EQ(Copied(), "0") << "what is selected";
}

}  // namespace
}  // namespace tendril::test
