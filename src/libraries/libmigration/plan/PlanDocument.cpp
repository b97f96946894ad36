#include "PlanDocument.h"

#include <algorithm>
#include <map>
#include <nlohmann/json.hpp>
#include <set>
#include <unordered_set>

#include "Content.h"
#include "Digest.h"
#include "PlanSuperiors.h"
#include "Questions.h"
#include "Settings.h"
#include "ToldClauses.h"

namespace migration {

namespace {

// Members keep the order in which they are given.
using Json = nlohmann::ordered_json;

// The version of the document: it is raised when what is there changes its meaning or goes.
constexpr int kDocumentVersion = 1;

Json placeOf(const Entry* entry) {
  if (entry == nullptr) {
    return nullptr;
  }
  return {{"file", entry->file->source->path()}, {"line", entry->place().line}};
}

Json textOrNull(const std::string& text) { return text.empty() ? Json(nullptr) : Json(text); }

Json clausesOf(const Verdict& row) {
  Json clauses = Json::array();
  for (const ClauseChange& change : row.clauses) {
    for (const ToldClause& clause : toldClauses(change)) {
      clauses.push_back({{"clause", clause.name},
                         {"base", textOrNull(clause.base)},
                         {"old", textOrNull(clause.old)},
                         {"new", textOrNull(clause.latest)},
                         {"result", textOrNull(clause.result)},
                         {"decided", clause.isDecided},
                         {"risk", wordOf(clause.risk)}});
    }
  }
  return clauses;
}

// What it says beside the clauses that differ, so that a reader has the whole of it.
Json otherClausesOf(const Verdict& row) {
  const Entry& entry = row.match.latest != nullptr ? *row.match.latest : row.entry();
  const Content content = contentOf(*entry.kept);
  std::set<std::string> told;
  for (const ClauseChange& change : row.clauses) {
    for (const ToldClause& clause : toldClauses(change)) {
      told.insert(clause.name);
    }
  }
  Json clauses = Json::array();
  for (const Aspect aspect : aspectsOf(row.kind())) {
    for (const ToldValue& clause : toldValues(aspect, content[aspect])) {
      if (told.count(clause.name) == 0) {
        clauses.push_back({{"clause", clause.name}, {"value", clause.value}});
      }
    }
  }
  return clauses;
}

// The files of the result are those of the output directory, wherever that is.
Json placeInResult(const Entry* entry) {
  if (entry == nullptr) {
    return nullptr;
  }
  return {{"file", entry->file->name}, {"line", entry->place().line}};
}

const Entry* inResult(const MigrationPlan& plan, const Verdict& row) {
  if (!row.isInResult() || !plan.result) {
    return nullptr;
  }
  const std::string& oid =
      row.isCarried() ? row.result->oid() : row.match.latest->kept->object->oidInPlace();
  return plan.result->byOid(row.kind(), oid);
}

// What a decisions file may say of an undecided definition, as a template of decisions asks it.
Json questionOf(const Questionnaire& questionnaire, const Verdict& row) {
  const Question question = questionnaire.about(row);
  Json takes = Json::array();
  for (const Choice& choice : question.choices) {
    takes.push_back(wordOf(choice.take));
  }
  Json clauses = Json::array();
  for (const ClauseChoices& choices : question.clauses) {
    if (!choices.change->isDecided) {
      Json words = Json::array();
      for (const Take take : choices.takes) {
        words.push_back(wordOf(take));
      }
      for (const ToldClause& clause : toldClauses(*choices.change)) {
        clauses.push_back({{"clause", clause.name}, {"take", words}});
      }
    }
  }
  return {{"by", questionnaire.decisionAbout(row).oid.empty() ? "name" : "oid"},
          {"take", takes},
          {"clauses", clauses},
          {"move", question.mayMove}};
}

Json definitionOf(const MigrationPlan& plan, const Verdict& row) {
  return {{"kind", wordOf(row.kind())},
          {"oid", row.entry().kept->object->oidInPlace()},
          {"name", firstNameOf(row, plan.threeWay.differences)},
          {"class", wordOf(row.change)},
          {"renamed", row.isRenamed},
          {"renumbered", row.isRenumbered},
          {"risk", wordOf(row.risk)},
          {"outcome", wordOf(row.outcome)},
          {"reason", row.reason},
          {"notes", row.notes},
          {"decision", row.decision.empty() ? Json(nullptr) : Json(row.decision)},
          {"question", nullptr},
          {"fingerprint", fingerprintOf(row)},
          {"text", row.isCarried() ? Json(textOf(*row.result)) : Json(nullptr)},
          {"clauses", clausesOf(row)},
          {"otherClauses", otherClausesOf(row)},
          {"places",
           {{"base", placeOf(row.match.base)},
            {"old", placeOf(row.match.old)},
            {"new", placeOf(row.match.latest)},
            {"result", placeInResult(inResult(plan, row))}}}};
}

// To those of the definitions that somebody has to decide.
void addQuestions(const MigrationPlan& plan, const std::vector<const Verdict*>& shown,
                  Json* definitions) {
  if (plan.undecidedCount == 0) {
    return;
  }
  const Questionnaire questionnaire(plan);
  const std::unordered_set<const Verdict*> open(questionnaire.open().begin(),
                                                questionnaire.open().end());
  for (std::size_t at = 0; at < shown.size(); ++at) {
    if (open.count(shown[at]) != 0) {
      (*definitions)[at]["question"] = questionOf(questionnaire, *shown[at]);
    }
  }
}

Json superiorsOf(const MigrationPlan& plan, const std::vector<const Verdict*>& shown) {
  Json array = Json::array();
  for (const SuperiorNode& node : superiorsAround(plan, shown)) {
    array.push_back({{"kind", wordOf(node.row->kind())},
                     {"oid", node.row->entry().kept->object->oidInPlace()},
                     {"name", firstNameOf(*node.row, plan.threeWay.differences)},
                     {"superiors", *node.superiors}});
  }
  return array;
}

Json findingsOf(const Findings& findings) {
  Json array = Json::array();
  for (const Finding& finding : findings) {
    array.push_back({{"rule", finding.rule},
                     {"severity", wordOf(finding.severity)},
                     {"file", finding.file},
                     {"line", finding.line},
                     {"column", finding.column},
                     {"text", finding.text},
                     {"definition", finding.definition}});
  }
  return array;
}

Json failuresOf(const Failures& failures) {
  Json array = Json::array();
  for (const Failure& failure : failures) {
    array.push_back({{"file", failure.file},
                     {"line", failure.line},
                     {"column", failure.column},
                     {"rule", failure.rule},
                     {"text", failure.text}});
  }
  return array;
}

Json countsOf(const MigrationPlan& plan) {
  std::map<std::string, std::size_t> classes;
  std::map<std::string, std::size_t> outcomes;
  std::map<std::string, std::size_t> risks;
  for (const Verdict& row : plan.threeWay.differences) {
    ++classes[wordOf(row.change)];
    ++outcomes[std::string(wordOf(row.outcome))];
    ++risks[std::string(wordOf(row.risk))];
  }
  return {{"definitions", plan.threeWay.differences.size()},
          {"class", classes},
          {"outcome", outcomes},
          {"risk", risks}};
}

Json optionsOf(const PlanRequest& asked) {
  const Json prefer = asked.prefer == Prefer::kOld   ? Json("old")
                      : asked.prefer == Prefer::kNew ? Json("new")
                                                     : Json(nullptr);
  return {{"base", textOrNull(asked.base)},
          {"from", asked.old},
          {"to", asked.latest},
          {"excludeOids", asked.excludeLists},
          {"withdraw", textOrNull(asked.withdrawList)},
          {"decisions", asked.decisions},
          {"prefer", prefer},
          {"acceptBase", asked.acceptBase},
          {"allowUnused", asked.allowUnused},
          {"repair", asked.isRepaired}};
}

Json inputsOf(const MigrationPlan& plan) {
  Json inputs = Json::array();
  for (const PlanInput& input : plan.inputs) {
    inputs.push_back({{"role", input.role}, {"path", input.path}, {"sha256", input.sha256}});
  }
  return inputs;
}

// Nothing is written by a plan that is not ready.
Json outputsOf(const MigrationPlan& plan) {
  Json outputs = Json::array();
  if (plan.isReady()) {
    for (const NamedText& text : plan.resultTexts) {
      outputs.push_back({{"file", text.name}, {"sha256", sha256Of(text.bytes)}});
    }
  }
  return outputs;
}

bool isUtf8(const std::string& text) {
  try {
    static_cast<void>(Json(text).dump());
    return true;
  } catch (const Json::exception&) {
    return false;
  }
}

}  // namespace

std::string planDocument(const MigrationPlan& plan, const std::vector<const Verdict*>& shown,
                         const DocumentOrigin& origin) {
  Json definitions = Json::array();
  for (const Verdict* const row : shown) {
    definitions.push_back(definitionOf(plan, *row));
  }
  addQuestions(plan, shown, &definitions);
  const Json document = {
      {"version", kDocumentVersion},
      {"program", {{"name", "schema-migrate"}, {"version", origin.programVersion}}},
      {"command", origin.command},
      {"ready", plan.isReady()},
      {"options", optionsOf(plan.asked)},
      {"inputs", inputsOf(plan)},
      {"outputs", outputsOf(plan)},
      {"definitions", definitions},
      {"superiors", superiorsOf(plan, shown)},
      {"repairs", findingsOf(plan.repairs)},
      {"findings", findingsOf(plan.ofInputs)},
      {"newInResult", findingsOf(plan.newInResult)},
      {"refusals", failuresOf(plan.refusals)},
      {"failures", failuresOf(plan.failures)},
      {"counts", countsOf(plan)}};
  return document.dump(2, ' ', true, Json::error_handler_t::replace) + "\n";
}

std::string planDocument(const MigrationPlan& plan, const DocumentOrigin& origin) {
  std::vector<const Verdict*> all;
  all.reserve(plan.threeWay.differences.size());
  for (const Verdict& row : plan.threeWay.differences) {
    all.push_back(&row);
  }
  return planDocument(plan, all, origin);
}

std::string pathNotForDocuments(const MigrationPlan& plan) {
  const PlanRequest& asked = plan.asked;
  for (const std::string* const path :
       {&asked.base, &asked.old, &asked.latest, &asked.withdrawList}) {
    if (!isUtf8(*path)) {
      return *path;
    }
  }
  for (const PlanInput& input : plan.inputs) {
    if (!isUtf8(input.path)) {
      return input.path;
    }
  }
  return "";
}

}  // namespace migration
