// What a plan leaves to a person: which definitions are undecided, what can be chosen for each, and
// the entry of a decisions file that tells the choice.

#ifndef LIBSCHEMA_MIGRATION_QUESTIONS_H
#define LIBSCHEMA_MIGRATION_QUESTIONS_H

#include <memory>
#include <set>
#include <string>
#include <string_view>
#include <utility>
#include <vector>

#include "MigrationPlan.h"

namespace migration {

// Something that may be taken of the whole definition, and what would come of it.
struct Choice {
  Take take = Take::kNothing;
  Verdict after;
};

// A clause that OLD and NEW do not have alike, and whose value it may get. One that is merged
// already may also be left to that.
struct ClauseChoices {
  const ClauseChange* change = nullptr;
  std::vector<Take> takes;
};

// An undecided definition, and what can be decided about it.
struct Question {
  const Verdict* difference = nullptr;
  std::vector<Choice> choices;         // in the order old, new, base, merged, drop
  std::vector<ClauseChoices> clauses;  // empty when it cannot be decided clause by clause
  bool mayMove = false;                // OLD's may stand beside NEW's, under another name or OID
  bool mayBeWritten = false;           // a text may be given
};

// The questions of a plan. They refer to it, and mean nothing once it is decided anew.
class Questionnaire {
 public:
  // Collects what is undecided in the plan, which must stay in place.
  explicit Questionnaire(const MigrationPlan& plan);
  Questionnaire(const Questionnaire&) = delete;
  Questionnaire& operator=(const Questionnaire&) = delete;
  ~Questionnaire();

  // What is undecided, in the plan's order, but for vendor extensions that one decision about their
  // attribute type covers.
  const std::vector<const Verdict*>& open() const { return m_open; }

  // What can be chosen for one of them: what the plan would carry out as it stands.
  Question about(const Verdict& difference) const;

  // A decision about it that decides nothing yet: its kind, by what it is called, and the
  // fingerprint.
  Decision decisionAbout(const Verdict& difference) const;

 private:
  std::vector<const Verdict*> m_open;
  std::unique_ptr<const ResultIndex> m_result;
  Prefer m_prefer;
  std::set<std::pair<Kind, std::string>> m_sharedOids;  // that are no name for one definition alone
};

// Who refers to it in OLD and in NEW.
std::vector<Reference> referrersInOld(const Verdict& difference, const MigrationPlan& plan);
std::vector<Reference> referrersInNew(const Verdict& difference, const MigrationPlan& plan);

// A [[definition]] with this decision, to stand at the end of a decisions file, behind a line that
// is empty. `about` is what it is a decision about, for a comment.
std::string decisionEntry(const Decision& decision, const std::string& about);

// A text in TOML's quotes, and as a line of comment that nothing in it can end.
std::string tomlQuoted(std::string_view text);
std::string tomlComment(std::string_view text);

}  // namespace migration

#endif  // LIBSCHEMA_MIGRATION_QUESTIONS_H
