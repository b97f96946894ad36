#include "DecisionsTemplate.h"

#include "Questions.h"
#include "ToldClauses.h"

namespace migration {

namespace {

std::string sideOf(const char* name, const Entry* entry) {
  if (entry == nullptr) {
    return tomlComment(std::string(name) + "  does not have it");
  }
  return tomlComment(std::string(name) + "  " + textOf(contentOf(*entry->kept)) + "  (" +
                     entry->file->name + ":" + std::to_string(entry->place().line) + ")");
}

std::string choicesOf(const Question& question) {
  std::string choices;
  for (const Choice& choice : question.choices) {
    choices += (choices.empty() ? "\"" : " or \"") + std::string(wordOf(choice.take)) + "\"";
  }
  return choices;
}

// Those that have to be decided.
std::string clausesOf(const Question& question) {
  std::string clauses;
  for (const ClauseChoices& choices : question.clauses) {
    if (choices.change->isDecided) {
      continue;
    }
    for (const ToldClause& clause : toldClauses(*choices.change)) {
      clauses.append(clauses.empty() ? "" : ", ").append(clause.name).append(" = \"\"");
    }
  }
  return clauses;
}

std::string dependentsOf(const std::vector<Reference>& references) {
  std::string text;
  for (const Reference& reference : references) {
    text += (text.empty() ? "" : ", ") + describe(reference);
  }
  return text;
}

std::string entryOf(const Questionnaire& questionnaire, const Verdict& row,
                    const MigrationPlan& plan) {
  const Question question = questionnaire.about(row);
  const Decision decision = questionnaire.decisionAbout(row);
  std::string text = "\n[[definition]]\n" +
                     tomlComment(describe(row, plan.threeWay.differences) + ": " + row.reason);
  text += (plan.base ? sideOf("BASE", row.match.base) : std::string()) +
          sideOf("OLD ", row.match.old) + sideOf("NEW ", row.match.latest);
  const std::string dependents = dependentsOf(referrersInOld(row, plan));
  if (!dependents.empty()) {
    text += tomlComment("In OLD, these refer to it: " + dependents);
  }
  text += "kind = " + tomlQuoted(wordOf(row.kind())) + "\n";
  text += decision.oid.empty() ? "name = " + tomlQuoted(decision.name)
                               : "oid = " + tomlQuoted(decision.oid);
  text += "\nfingerprint = " + tomlQuoted(decision.fingerprint) + "\n";
  text += tomlComment("take: " + choicesOf(question));
  const std::string clauses = clausesOf(question);
  if (!clauses.empty()) {
    text += tomlComment("or, clause by clause (old, new, base, of lists union):");
    text += tomlComment("clauses = { " + clauses + " }");
  }
  if (question.mayMove) {
    text += tomlComment("or, beside NEW's: rename = \"\", renumber = \"\"");
  }
  return text + "reason = \"\"\n";
}

}  // namespace

std::string decisionsTemplate(const MigrationPlan& plan) {
  std::string text =
      "# What nobody has decided yet. Below each definition write your choice, as in\n"
      "#   take = \"old\"\n"
      "# and give this file to --decisions. A decision about an attribute type covers its vendor\n"
      "# extension where that goes with it.\n";
  const Questionnaire questionnaire(plan);
  for (const Verdict* const row : questionnaire.open()) {
    text += entryOf(questionnaire, *row, plan);
  }
  return text;
}

}  // namespace migration
