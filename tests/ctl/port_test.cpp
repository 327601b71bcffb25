// The port: which one is opened, why it is not, and what the Control Panel gets of it.
#include <csignal>
#include <functional>

#include "ctl/ctl_fixture.h"

namespace tendril::test {
namespace {

using testing::HasSubstr;

class PortTest : public CtlTest {
 protected:
  PortTest() { world_.bench.Attach<VirtualUnit>(3, 0x01); }
};

TEST_F(PortTest, PortThatCannotBeOpened_IsExplainedAndListed) {
  struct Case {
    std::function<void()> set_up;
    std::string arguments;
    const char* said;
  };
  const auto held = [this](const PortHolder& holder) {
    return [this, holder] { world_.bench.SetHeldByAnother(3, true, holder); };
  };
  const auto panel = [this](const char* program) {
    return [this, program] { panel_.processes.running = program; };
  };
  const Case cases[] = {
      {panel(""), "find --port 9", "There is no Comm 9; there are Comm 1, Comm 2, Comm 3 and Comm 4."},
      {held({"minicom", 4321}), "find --port 3", "Comm 3 is in use by minicom (process 4321): close it."},
      {held({"ModemManager", 0}), "find --port 3",
       "Comm 3 is in use, perhaps by ModemManager: try again in a moment."},
      {held({}), "find --port 3", "Comm 3 is in use by another program: close it."},
      {[] {}, "find --port 3 --take-port",
       "Comm 3 is in use by another program; the Control Panel, which --take-port asks, does not run."},
      {panel("NyxTray.exe"), "find --port 3",
       "Comm 3 is in use by the Control Panel: --take-port asks it for the port."},
      {held({"NyxTray.exe", 7}), "find --port 3",
       "Comm 3 is in use by NyxTray.exe (process 7), and the Control Panel runs: --take-port asks it for the "
       "port."},
      {[this] { world_.bench.SetAllowed(3, false); }, "find --port 3 --take-port",
       "You are not allowed to use Comm 3. Its device belongs to the group \"dialout\": ask for your user "
       "to be added to that group, then log in again."}};
  for (const Case& each : cases) {
    each.set_up();
    EXPECT_EQ(Run(each.arguments), 3);
    EXPECT_EQ(terminal_.error, std::string("tendril-ctl: ") + each.said + "\n");
  }
  EXPECT_TRUE(panel_.panel.requests().empty());
  EXPECT_EQ(Run("ports"), 0);
  EXPECT_THAT(terminal_.out,
              HasSubstr("\nComm 3  -       Virtual serial line 3  -      NyxTray.exe (process 7)\n"
                        "Comm 4  -       Virtual serial line 4  -      -\n"));
}

// Whatever it replies, and when, it has the port again at the end.
TEST_F(PortTest, ControlPanel_GetsBackWhatWasAskedFor) {
  const std::string refusal = "Comm 3 is in use, and the Control Panel refuses to give it up.";
  const std::string silence =
      "Comm 3 is in use, and the Control Panel gives no answer: try again, or restart it.";
  panel_.Take(3);
  const auto take_port = [this](const std::string& name, const std::string& said) {
    SCOPED_TRACE(name);
    panel_.panel.SetPortHandler([this](std::uint8_t port, bool held) {
      EXPECT_THROW(world_.device->PendingOutput(), RuntimeError) << "the port is still open";
      world_.bench.SetHeldByAnother(port, held);
    });
    EXPECT_EQ(Run("find 01 --port 3 --take-port"), said.empty() ? 0 : 3);
    EXPECT_THAT(terminal_.error, HasSubstr(said));
    EXPECT_TRUE(panel_.panel.Holds(3));
    EXPECT_EQ(panel_.panel.connections(), 0u);
  };
  take_port("proper", "");
  EXPECT_THAT(panel_.PortRequests(), testing::ElementsAre("3:0", "3:1"));
  for (const PanelBehaviourKind& kind : PanelBehaviourKinds()) {
    panel_.panel.SetBehaviour(kind.behaviour);
    const bool answers = kind.name == "slow" || kind.name == "byte-by-byte";
    take_port(std::string(kind.name), answers ? "" : kind.name == "refuse" ? refusal : silence);
    EXPECT_EQ(panel_.PortRequests().back(), "3:1");
  }
  panel_.panel.SetBehaviour(PanelBehaviour::kProper);
  for (const PanelListener listener : {PanelListener::kOff, PanelListener::kStuck}) {
    panel_.panel.SetListener(listener);
    take_port("away", silence);
  }
}

TEST_F(PortTest, Stop_GivesThePortBack) {
  panel_.Take(3);
  // While the Control Panel is asked, and while units are searched for.
  for (const auto& [behaviour, after_ms] :
       {std::pair(PanelBehaviour::kSlow, 900), {PanelBehaviour::kProper, 500}}) {
    stop_ = {};
    In(after_ms, [this] { stop_.Make(SIGTERM); });
    panel_.panel.SetBehaviour(behaviour);
    EXPECT_EQ(Run("find --port 3 --take-port --json"), 143);
    EXPECT_TRUE(panel_.panel.Holds(3));
    EXPECT_EQ(panel_.PortRequests().back(), "3:1");
  }
  EXPECT_THAT(terminal_.out, HasSubstr("Stopped. Only IDs up to 06 were polled. 1 unit found: 01."));
}

}  // namespace
}  // namespace tendril::test
