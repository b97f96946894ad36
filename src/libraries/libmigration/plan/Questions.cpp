#include "Questions.h"

#include <algorithm>
#include <string_view>

#include "ResultIndex.h"
#include "RuleSupport.h"
#include "Utf8.h"

namespace migration {

namespace {

bool goesWithAnUndecidedAttribute(const Verdict& row, const MigrationPlan& plan) {
  return row.kind() == Kind::kVendorExtension && row.match.attribute != kNoRow &&
         plan.threeWay.differences[row.match.attribute].isUndecided() &&
         row.reason.rfind("goes with its attribute type", 0) == 0;
}

// Whose value a clause may get, each value once.
std::vector<Take> takesOf(const ClauseChange& change, const MatchRow& match) {
  const Aspect aspect = change.aspect;
  std::vector<Take> takes = {Take::kOld, Take::kNew};
  if (match.base != nullptr && !areEqual(aspect, change.base, change.old) &&
      !areEqual(aspect, change.base, change.latest)) {
    takes.push_back(Take::kBase);
  }
  if (isList(match.kind, aspect)) {
    const Values both = unionOf(change.old, change.latest);
    if (!areEqual(aspect, both, change.old) && !areEqual(aspect, both, change.latest)) {
      takes.push_back(Take::kUnion);
    }
  }
  return takes;
}

std::vector<ClauseChoices> clausesOf(const Verdict& row) {
  std::vector<ClauseChoices> clauses;
  if (row.match.old == nullptr || row.match.latest == nullptr) {
    return clauses;
  }
  for (const ClauseChange& change : row.clauses) {
    if (!change.isDecided || !areEqual(change.aspect, change.old, change.latest)) {
      clauses.push_back({&change, takesOf(change, row.match)});
    }
  }
  return clauses;
}

}  // namespace

Questionnaire::Questionnaire(const MigrationPlan& plan)
    : m_result(std::make_unique<ResultIndex>(plan.threeWay.differences, ResultIndex::Of::kAll)),
      m_prefer(plan.request.prefer) {
  std::set<std::pair<Kind, std::string>> seen;
  for (const Verdict& row : plan.threeWay.differences) {
    if (row.isUndecided() && !goesWithAnUndecidedAttribute(row, plan)) {
      m_open.push_back(&row);
    }
    if (row.match.old != nullptr) {
      const auto [place, isNew] = seen.emplace(row.kind(), oidOf(*row.match.old));
      if (!isNew) {
        m_sharedOids.insert(*place);
      }
    }
  }
}

Questionnaire::~Questionnaire() = default;

Question Questionnaire::about(const Verdict& difference) const {
  Question question;
  question.difference = &difference;
  const bool isMissingInNew = difference.match.latest == nullptr;
  for (const Take take : {Take::kOld, Take::kNew, Take::kBase, Take::kMerged, Take::kDrop}) {
    if (take == Take::kDrop && isMissingInNew) {
      continue;  // NEW's is nothing
    }
    Decision decision;
    decision.take = take;
    Choice choice{take, difference};
    if (tryDecision(decision, m_prefer, *m_result, difference, &choice.after).empty()) {
      question.choices.push_back(std::move(choice));
    }
  }
  if (!difference.isNewsOnly) {
    question.clauses = clausesOf(difference);
    question.mayMove = difference.match.old != nullptr &&
                       difference.kind() != Kind::kVendorExtension &&
                       (difference.isTaken || difference.isRenumbered);
    question.mayBeWritten = true;
  }
  return question;
}

Decision Questionnaire::decisionAbout(const Verdict& difference) const {
  Decision decision;
  decision.kind = difference.kind();
  decision.oid = difference.entry().kept->object->oidInPlace();
  const Values& names = difference.entry().kept->object->namesInPlace();
  const bool isShared = m_sharedOids.count({decision.kind, decision.oid}) != 0;
  if ((decision.oid.empty() || isShared) && !names.empty()) {
    decision.oid.clear();
    decision.name = names.front();
  }
  decision.fingerprint = fingerprintOf(difference);
  return decision;
}

namespace {

std::vector<Reference> referrersOf(const Entry* entry, const Installation& installation) {
  return entry == nullptr || entry->kind() == Kind::kVendorExtension
             ? std::vector<Reference>()
             : installation.referrersOf(*entry);
}

}  // namespace

std::vector<Reference> referrersInOld(const Verdict& difference, const MigrationPlan& plan) {
  return referrersOf(difference.match.old, *plan.old);
}

std::vector<Reference> referrersInNew(const Verdict& difference, const MigrationPlan& plan) {
  return referrersOf(difference.match.latest, *plan.latest);
}

std::string decisionEntry(const Decision& decision, const std::string& about) {
  std::string text = "\n[[definition]]\n" + tomlComment(about);
  const auto add = [&](const char* key, const std::string& value) {
    if (!value.empty()) {
      text.append(key).append(" = ").append(tomlQuoted(value)).append("\n");
    }
  };
  add("kind", std::string(wordOf(decision.kind)));
  add("oid", decision.oid);
  add("name", decision.name);
  add("fingerprint", decision.fingerprint);
  add("take", std::string(wordOf(decision.take)));
  add("text", decision.text);
  std::string clauses;
  for (const auto& [clause, take] : decision.clauses) {
    clauses += (clauses.empty() ? " " : ", ") + clause + " = " + tomlQuoted(wordOf(take));
  }
  text += clauses.empty() ? "" : "clauses = {" + clauses + " }\n";
  add("rename", decision.rename);
  add("renumber", decision.renumber);
  add("reason", decision.reason);
  return text;
}

std::string tomlQuoted(std::string_view text) {
  constexpr std::string_view kDigits = "0123456789ABCDEF";
  std::string result = "\"";
  for (const char c : text) {
    const auto byte = static_cast<unsigned char>(c);
    if (c == '"' || c == '\\') {
      result += '\\';
      result += c;
    } else if (byte < ' ' || byte == 127) {
      result.append("\\u00").append(1, kDigits[byte >> 4U]).append(1, kDigits[byte & 15U]);
    } else {
      result += c;
    }
  }
  return result + "\"";
}

std::string tomlComment(std::string_view text) {
  std::string line = "# ";
  while (!text.empty()) {
    const auto byte = static_cast<unsigned char>(text.front());
    const std::size_t length = byte < ' ' || byte == 127 ? 0 : firstCharacter(text).length;
    line += length == 0 ? "?" : text.substr(0, length);
    text.remove_prefix(std::max<std::size_t>(length, 1));
  }
  return line + "\n";
}

}  // namespace migration
