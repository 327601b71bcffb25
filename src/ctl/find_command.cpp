#include "ctl/find_command.h"

#include <QJsonArray>
#include <algorithm>
#include <cstddef>
#include <vector>

#include "ctl/commands.h"
#include "ctl/progress.h"
#include "ctl/unit_ids.h"

namespace tendril::ctl {
namespace {

using namespace Qt::StringLiterals;

QString Line(const FoundUnit& unit) { return IdText(unit.id) + u' ' + QString::fromStdString(unit.Words()); }

QString AnswerName(FoundUnit::What what) {
  switch (what) {
    case FoundUnit::What::kAnswers:
      return u"clean"_s;
    case FoundUnit::What::kAnswersLate:
      return u"late"_s;
    case FoundUnit::What::kOtherAnswer:
      return u"other"_s;
    case FoundUnit::What::kPerhapsSeveral:
      return u"perhapsSeveral"_s;
  }
  return {};
}

}  // namespace

CommandResult FindWithProgress(Job& job, std::uint8_t first, std::uint8_t last) {
  Progress progress(job.line, job.environment);
  const UnitSearch& search = job.units.Search();
  std::size_t noted = 0;
  job.units.SetStepHandler([&](const std::string& step, double part) {
    progress.Show(u"finding units: "_s + QString::fromStdString(step), part);
    for (noted = std::min(noted, search.found.size()); noted < search.found.size(); ++noted)
      progress.Note(u"finding units: "_s + Line(search.found[noted]));
  });
  CommandResult result = job.units.Find(first, last);
  job.units.SetStepHandler(nullptr);
  return result;
}

QString SearchSentence(const CommandResult& result, const UnitSearch& search) {
  QString found = QString::fromStdString(search.Sentence());
  switch (result.kind) {
    case CommandResult::Kind::kDone:
      return found;
    case CommandResult::Kind::kFailed:
      return QString::fromStdString(result.reason) + u' ' + found;
    case CommandResult::Kind::kCancelled:
      return u"Stopped. "_s + found;
  }
  return {};
}

Report Find(Job& job) {
  if (auto problem = job.port.Open()) return *problem;
  const CommandResult result = FindWithProgress(job, job.line.first, job.line.last);
  std::vector<FoundUnit> found = job.units.Search().found;
  std::ranges::sort(found, {}, &FoundUnit::id);  // a late reply names an ID that was polled before
  QJsonArray rows;
  QString text;
  bool clean = result.Done() && !found.empty();
  for (const FoundUnit& unit : found) {
    rows += QJsonObject{{u"unit"_s, IdText(unit.id)}, {u"answer"_s, AnswerName(unit.what)}};
    text += Line(unit) + u'\n';
    clean = clean && unit.what == FoundUnit::What::kAnswers;
  }
  const QString sentence = SearchSentence(result, job.units.Search());
  return {
      .exit_code = clean ? kExitSuccess : kExitNotAsWished,
      .text = (clean ? text + sentence + u'\n' : text).toUtf8(),
      .members = {{u"found"_s, rows}, {u"polled"_s, job.units.Search().polled}, {u"sentence"_s, sentence}},
      .problem = clean ? QString() : sentence};
}

}  // namespace tendril::ctl
