#include "FleetTemplate.h"

#include <algorithm>

#include "Questions.h"

namespace migration {

namespace {

std::string sideOf(const char* name, const std::string& value) {
  return value.empty() ? "" : tomlComment(std::string("  ") + name + "  " + value);
}

std::string joined(const std::vector<std::string>& words, const char* between, const char* behind) {
  std::string text;
  for (const std::string& word : words) {
    text.append(text.empty() ? "" : between).append(word).append(behind);
  }
  return text;
}

std::string whereOf(const Fleet& fleet, const FleetQuestion& question) {
  std::string text;
  for (const std::size_t at : question.installations) {
    text += (text.empty() ? "" : ", ") + fleet.installations[at].name;
  }
  return tomlComment("At " + std::to_string(question.installations.size()) + " of " +
                     std::to_string(fleet.installations.size()) + " installations: " + text);
}

std::string textsOf(const FleetQuestion& question) {
  std::string text;
  for (const FleetClause& clause : question.clauses) {
    text += tomlComment(clause.clause);
    text +=
        sideOf("BASE", clause.base) + sideOf("OLD ", clause.old) + sideOf("NEW ", clause.latest);
  }
  std::string values;
  for (const auto& [clause, value] : question.values) {
    values.append(values.empty() ? "" : " ").append(clause);
    values += clause == value ? "" : " " + value;
  }
  return text + (values.empty()
                     ? ""
                     : tomlComment((text.empty() ? "" : "and alike wherever it is: ") + values));
}

std::string choicesOf(const FleetQuestion& question) {
  std::string text;
  if (!question.takes.empty()) {
    text += tomlComment("take: \"" + joined(question.takes, "\" or \"", "") + "\"");
  } else if (question.openClauses.empty() && !question.mayMove) {
    text += tomlComment("take, text or clauses, as schema-migrate-decisions(5) has them");
  }
  if (!question.openClauses.empty()) {
    text += tomlComment("or, clause by clause (old, new, base, of lists union):");
    text += tomlComment("clauses = { " + joined(question.openClauses, ", ", " = \"\"") + " }");
  }
  if (question.mayMove) {
    text += tomlComment("or, beside NEW's: rename = \"\", renumber = \"\"");
  }
  return text;
}

std::string entryOf(const Fleet& fleet, const FleetQuestion& question) {
  std::string kind = question.kind;
  std::replace(kind.begin(), kind.end(), '-', ' ');
  return "\n[[definition]]\n" +
         tomlComment(kind + " " + question.name + " (" + question.oid + "): " + question.reason) +
         whereOf(fleet, question) + textsOf(question) + "kind = " + tomlQuoted(question.kind) +
         (question.isByName ? "\nname = " + tomlQuoted(question.name)
                            : "\noid = " + tomlQuoted(question.oid)) +
         "\nfingerprint = " + tomlQuoted(question.fingerprint) + "\n" + choicesOf(question) +
         "reason = \"\"\n";
}

}  // namespace

std::string decisionsTemplate(const Fleet& fleet) {
  std::string text =
      "# What nobody has decided yet, once for all installations where it is the same question.\n"
      "# Below each definition write your choice, as in\n"
      "#   take = \"old\"\n"
      "# and give this file, with --allow-unused, to --decisions for each installation. A decision\n"
      "# about an attribute type covers its vendor extension where that goes with it.\n";
  for (const FleetQuestion& question : fleet.questions) {
    text += entryOf(fleet, question);
  }
  return text;
}

}  // namespace migration
