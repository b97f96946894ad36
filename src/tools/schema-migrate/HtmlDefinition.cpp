#include "HtmlDefinition.h"

#include <libschema-migration/Content.h>

#include <set>
#include <string>
#include <vector>

#include "HtmlWords.h"

namespace html {

namespace {

constexpr const char* kSides[] = {"base", "old", "new", "result"};
constexpr const char* kSideNames[] = {"Base", "Old", "New", "Result"};

using Members = std::set<std::string>;

Members membersOn(const Json& clause, const char* side) {
  Members members;
  if (clause.at(side).is_string()) {
    const std::string name = clause.at("clause");
    for (const std::string& member : membersOf(name, clause.at(side).get<std::string>())) {
      members.insert(migration::folded(member));
    }
  }
  return members;
}

bool isThere(const Json& definition, const char* side) {
  return !definition.at("places").at(side).is_null();
}

// How a member of a list on one side differs: from BASE where there is one, else between OLD and
// NEW. A member that the result has, too, is a link there alone: a page with thousands of lists
// opens the sooner.
Names::Mark markOn(const Json& definition, const Json& clause, const std::string& side) {
  if (side == "result" || !isList(clause.at("clause").get<std::string>())) {
    return nullptr;
  }
  const bool isFromBase = isThere(definition, "base");
  const std::string from = isFromBase ? "base" : "old";
  const bool isFrom = side == from;
  std::vector<Members> others;
  for (const char* const other : {"base", "old", "new"}) {
    const bool isCompared = isFrom ? other != from : other == from;
    if (isCompared && isThere(definition, other)) {
      others.push_back(membersOn(clause, other));
    }
  }
  const Members result = membersOn(clause, "result");
  const char differs = isFrom ? '-' : '+';
  return [others, result, differs](const std::string& member) {
    const std::string name = migration::folded(member);
    for (const Members& other : others) {
      if (other.count(name) == 0) {
        return differs;
      }
    }
    return result.count(name) == 0 ? ' ' : Names::kNoLink;
  };
}

std::string textAt(const Json& json, const char* member) { return json.at(member); }

std::string joined(const Json& words) {
  std::string text;
  for (const Json& word : words) {
    text.append(text.empty() ? "" : ", ").append(word.get<std::string>());
  }
  return text;
}

// "take: old, new; clauses: SYNTAX (old, new, base); rename, renumber".
std::string choicesOf(const Json& question) {
  std::string text = "take: " + joined(question.at("take"));
  std::string clauses;
  for (const Json& clause : question.at("clauses")) {
    clauses += (clauses.empty() ? "; clauses: " : ", ") + textAt(clause, "clause") + " (" +
               joined(clause.at("take")) + ")";
  }
  return text + clauses + (question.at("move").get<bool>() ? "; rename, renumber" : "");
}

}  // namespace

void DefinitionWriter::addHead(const Json& definition, std::size_t at, Dictionary* row) const {
  const Word& word = wordIn(classWords(), textAt(definition, "class"));
  setNumber(row, "N", at);
  row->SetValue("STYLE_CLASS", word.style);
  row->SetValue("SIGN", word.sign);
  row->SetValue("CLASS_WORD", word.said);
  setText(row, "CLASS", textAt(definition, "class"));
  setText(row, "RISK", textAt(definition, "risk"));
  setText(row, "KIND", textAt(definition, "kind"));
  row->SetValue("KIND_WORD", wordIn(kindWords(), textAt(definition, "kind")).said);
  setText(row, "NAME", textAt(definition, "name"));
  setText(row, "OID", "(" + textAt(definition, "oid") + ")");
  setText(row, "OUTCOME", textAt(definition, "outcome"));
}

void DefinitionWriter::addReason(const Json& definition, std::size_t at, Dictionary* row) const {
  m_names.addSentence("REASON", textAt(definition, "reason"), at, row);
  if (definition.at("kind") == "vendor-extension") {
    const std::size_t type = m_names.find("attribute-type", textAt(definition, "oid"));
    if (type != Names::kNowhere) {
      linkTo(type, row->AddSectionDictionary("EXTENDS"));
    }
  }
  if (!definition.at("notes").empty()) {
    Dictionary* const notes = row->AddSectionDictionary("NOTES");
    for (const Json& note : definition.at("notes")) {
      m_names.addSentence("PART", note, at, notes->AddSectionDictionary("NOTE"));
    }
  }
  if (definition.at("question").is_object()) {
    addText(row, "ASKED", "CHOICES", choicesOf(definition.at("question")));
  }
  if (definition.at("decision").is_string()) {
    addText(row, "DECIDED", "PLACE", textAt(definition, "decision"));
  }
}

void DefinitionWriter::addCell(const Json& definition, const Json& clause, const char* side,
                               Dictionary* row) const {
  Dictionary* const cell = row->AddSectionDictionary("CELL");
  const Json& value = clause.at(side);
  const auto put = [&](const char* style, const char* text) {
    addText(cell, "STYLED", "CELL_CLASS", style);
    addText(cell, "PART", "TEXT", text);
  };
  if (std::string_view(side) == "result" && !clause.at("decided").get<bool>()) {
    put("open", "? undecided");
  } else if (value.is_string()) {
    m_names.addValue(textAt(definition, "kind"), textAt(clause, "clause"), value,
                     markOn(definition, clause, side), cell);
  } else {
    put("none", isThere(definition, side) ? "none" : "not there");
  }
}

void DefinitionWriter::addClause(const Json& definition, const Json& clause,
                                 Dictionary* row) const {
  Dictionary* const line = row->AddSectionDictionary("CLAUSE");
  setText(line, "CLAUSE_NAME", textAt(clause, "clause"));
  const Word& risk = wordIn(riskWords(), textAt(clause, "risk"));
  Dictionary* const told = line->AddSectionDictionary("CLAUSE_RISK");
  told->SetValue("SIGN", risk.sign);
  told->SetValue("WORD", risk.said);
  for (const char* const side : kSides) {
    if (m_hasBase || side != kSides[0]) {
      addCell(definition, clause, side, line);
    }
  }
}

void DefinitionWriter::addOthers(const Json& definition, Dictionary* row) const {
  for (const Json& other : definition.at("otherClauses")) {
    Dictionary* const clause = row->AddSectionDictionary("OTHER");
    setText(clause, "CLAUSE_NAME", textAt(other, "clause"));
    // The value of a flag is the clause itself.
    if (other.at("value") != other.at("clause")) {
      m_names.addValue(textAt(definition, "kind"), textAt(other, "clause"), other.at("value"),
                       nullptr, clause);
    }
  }
}

void DefinitionWriter::addWhole(std::size_t at, Dictionary* section) const {
  const Json& definition = m_definitions[at];
  Dictionary* const row = section->AddSectionDictionary("DEFINITION");
  addHead(definition, at, row);
  for (const char* const also : {"renamed", "renumbered"}) {
    if (definition.at(also).get<bool>()) {
      addText(row, "ALSO", "WORD", also);
    }
  }
  const Word& risk = wordIn(riskWords(), textAt(definition, "risk"));
  if (risk.word != std::string_view("none")) {
    addText(row, "RISKY", "RISK_SIGN", risk.sign);
  }
  addReason(definition, at, row);
  if (!m_hasBase) {
    row->ShowSection("NO_BASE");
  }
  std::size_t width = 0;
  for (std::size_t i = m_hasBase ? 0 : 1; i < 4; ++i, ++width) {
    Dictionary* const side = row->AddSectionDictionary("SIDE");
    side->SetValue("SIDE_NAME", kSideNames[i]);
    setText(side, "PLACE", shortPlace(definition.at("places").at(kSides[i])));
  }
  for (const Json& clause : definition.at("clauses")) {
    addClause(definition, clause, row);
  }
  if (!definition.at("otherClauses").empty()) {
    Dictionary* const alike = row->AddSectionDictionary("ALIKE");
    alike->SetValue("ALIKE_NAME", definition.at("clauses").empty() ? "Definition" : "= alike");
    setNumber(alike, "WIDTH", width);
    addOthers(definition, alike);
  }
}

void DefinitionWriter::addLine(std::size_t at, Dictionary* section) const {
  const Json& definition = m_definitions[at];
  Dictionary* const row = section->AddSectionDictionary("DEFINITION");
  addHead(definition, at, row);
  setText(row, "WHY", textAt(definition, "reason"));
  for (const char* const side : {"new", "old", "base"}) {
    if (isThere(definition, side)) {
      setText(row, "PLACE", shortPlace(definition.at("places").at(side)));
      break;
    }
  }
  addOthers(definition, row);
}

}  // namespace html
