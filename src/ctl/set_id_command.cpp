#include <optional>
#include <string>

#include "ctl/commands.h"
#include "ctl/find_command.h"
#include "ctl/unit_ids.h"
#include "serial/packets.h"
#include "trace/trace_text.h"

namespace tendril::ctl {
namespace {

using namespace Qt::StringLiterals;

constexpr int kCleanReplies = 3;

Report NotGiven(const QString& sentences) {
  return {.exit_code = kExitNotAsWished,
          .members = {{u"changed"_s, u"no"_s}},
          .problem = sentences + u" No ID has changed."_s};
}

// Any answer counts, also one that is late or garbled.
std::optional<Report> RefuseOtherUnits(Job& job) {
  const CommandResult result = FindWithProgress(job, kFirstUnitId, kLastUnitId);
  const UnitSearch& search = job.units.Search();
  const QString sentence = SearchSentence(result, search);
  if (!result.Done()) return NotGiven(sentence);
  if (search.found.empty()) return std::nullopt;
  return NotGiven(sentence +
                  u" Every unit that is connected would take the ID: disconnect all but the one that "
                  "is to have it; then --alone leaves out this search."_s);
}

// Whether the last poll brought one reply, and nothing else has arrived: since the poll, if it is the first one, since
// opening a port may bring a stray byte; otherwise since the poll before.
bool CleanReply(const LineTrace& trace, bool first) {
  int replies = 0;
  bool counts = !first;
  bool others = false;
  for (const TraceEntry& entry : trace.Entries()) {
    counts |= entry.kind == TraceEntry::Kind::kSent;
    replies += entry.kind == TraceEntry::Kind::kReply ? 1 : 0;
    others |= counts && IsNoise(entry);
  }
  return replies == 1 && !others;
}

// Polls FF several times: one of two replies may hide the other once, or come so late that only the next poll shows it.
// `id` becomes the unit's own ID.
std::optional<Report> RefuseUncleanReplies(Job& job, std::uint8_t& id) {
  for (int replies = 0; replies < kCleanReplies; ++replies) {
    const CommandResult result = job.units.Find(kAllUnits, kAllUnits);
    const UnitSearch& search = job.units.Search();
    if (!result.Done() || (replies == 0 && search.found.empty()))
      return NotGiven(SearchSentence(result, search));
    const bool answer = search.found.size() == 1 && search.found.front().what == FoundUnit::What::kAnswers;
    const bool same = answer && (replies == 0 || search.found.front().id == id);
    if (!same || !CleanReply(job.units.Trace(), replies == 0)) {
      return NotGiven(
          u"Each poll of FF must bring one clean reply and nothing else, and this one did not: connect one "
          "unit alone, and check the wiring."_s);
    }
    id = search.found.front().id;
  }
  return std::nullopt;
}

// Returns the report when the user does not want it.
std::optional<Report> Confirm(Job& job, std::uint8_t id) {
  const QString port = QString::fromStdString(CommName(job.port.Number()));
  const QString now = id == kAllUnits ? QString() : u", now %1,"_s.arg(IdText(id));
  const QString question =
      u"Give the unit on %1%2 the ID %3? [y/N] "_s.arg(port, now, IdText(job.line.new_id));
  const std::optional<QString> answer = job.environment.terminal.Ask(question.toUtf8());
  if (answer && (answer->toLower() == u"y" || answer->toLower() == u"yes")) return std::nullopt;
  if (!answer) job.environment.terminal.PrintError("\n");  // ends the question's line
  return NotGiven(job.environment.stop.Made() ? u"Stopped."_s : u"Not confirmed."_s);
}

Report Given(const Job& job) {
  return {.text = u"The unit has the ID %1.\n"_s.arg(IdText(job.line.new_id)).toUtf8(),
          .members = {{u"changed"_s, u"yes"_s}}};
}

// The ID of the unit that answers at FF; nothing when none does, or not clearly.
std::optional<std::uint8_t> IdNow(Job& job) {
  const CommandResult result = job.units.Find(kAllUnits, kAllUnits);
  const auto& found = job.units.Search().found;
  const bool answer = result.Done() && found.size() == 1 && found.front().what == FoundUnit::What::kAnswers;
  return answer ? std::optional(found.front().id) : std::nullopt;
}

Report Write(Job& job) {
  const CommandResult result = job.units.SetId(job.line.new_id);
  if (result.Done()) return Given(job);
  const auto not_confirmed = [](const QString& changed, const QString& problem) {
    return Report{.exit_code = kExitNotAsWished, .members = {{u"changed"_s, changed}}, .problem = problem};
  };
  const bool stopped = result.kind == CommandResult::Kind::kCancelled;
  const QString how_it_ended =
      QString::fromStdString((stopped ? "Stopped." : result.reason) + " " + result.aftermath);
  if (!job.units.IdPerhapsChanged()) return not_confirmed(u"no"_s, how_it_ended);
  if (stopped) return not_confirmed(u"perhaps"_s, how_it_ended);
  const std::optional<std::uint8_t> id = IdNow(job);
  if (!id) return not_confirmed(u"perhaps"_s, how_it_ended + u" Run set-id again, or find."_s);
  if (id == job.line.new_id) return Given(job);
  return not_confirmed(u"no"_s,
                       u"The unit is still at %1: it has not taken the ID. Run set-id again; if that fails, "
                       "too, it is faulty."_s.arg(IdText(*id)));
}

Report CheckAndWrite(Job& job) {
  if (!job.line.alone) {
    if (auto refusal = RefuseOtherUnits(job)) return *refusal;
  }
  std::uint8_t id = kAllUnits;
  if (auto refusal = RefuseUncleanReplies(job, id)) return *refusal;
  if (id == job.line.new_id) {
    return {.text = u"The unit has the ID %1 already.\n"_s.arg(IdText(id)).toUtf8(),
            .members = {{u"changed"_s, u"no"_s}}};
  }
  if (!job.line.yes) {
    if (auto refusal = Confirm(job, id)) return *refusal;
    // The user may have connected something meanwhile.
    std::uint8_t id_now = kAllUnits;
    if (auto refusal = RefuseUncleanReplies(job, id_now)) return *refusal;
    if (id_now != id) {
      return NotGiven(u"Unit %1 answers now, and the question was about unit %2: start again."_s.arg(
          IdText(id_now), IdText(id)));
    }
  }
  return Write(job);
}

}  // namespace

Report SetId(Job& job) {
  if (!job.line.yes && !job.environment.terminal.CanAsk()) {
    return {.exit_code = kExitUsage,
            .problem = u"set-id asks before it writes the ID: without a terminal, --yes is needed."_s};
  }
  if (auto problem = job.port.Open()) return *problem;
  Report report = CheckAndWrite(job);
  report.members[u"unit"_s] = IdText(job.line.new_id);
  return report;
}

}  // namespace tendril::ctl
