#include "HtmlNames.h"

#include <libschema-migration/Content.h>

namespace html {

namespace {

bool isQuoted(std::string_view clause) { return clause == "NAME" || clause == "ALIASES"; }

// What stands between two members of a clause.
std::string separatorOf(std::string_view clause) { return isQuoted(clause) ? " " : " $ "; }

// Of which kind the definitions are that a clause names; empty when it names none.
std::string_view namedKind(std::string_view clause, std::string_view kind) {
  if (clause == "SUP") {
    return kind;
  }
  return clause == "MUST" || clause == "MAY" ? "attribute-type" : "";
}

std::string_view unquoted(std::string_view name) {
  const bool hasQuotes = name.size() >= 2 && name.front() == '\'' && name.back() == '\'';
  return hasQuotes ? name.substr(1, name.size() - 2) : name;
}

void addPart(const char* section, const std::string& text, std::size_t definition, char mark,
             Dictionary* dictionary) {
  if (text.empty()) {
    return;
  }
  Dictionary* const part = dictionary->AddSectionDictionary(section);
  setText(part, "TEXT", text);
  linkTo(definition, part);
  if (mark == '+') {
    part->ShowSection("ADDED");
    part->ShowSection("ADDED_END");
  } else if (mark == '-') {
    part->ShowSection("LOST");
    part->ShowSection("LOST_END");
  }
}

}  // namespace

bool isList(std::string_view clause) {
  return clause == "ALIASES" || clause == "SUP" || clause == "MUST" || clause == "MAY";
}

std::vector<std::string> membersOf(std::string_view clause, const std::string& value) {
  const std::string separator = separatorOf(clause);
  std::vector<std::string> members;
  std::size_t begin = 0;
  for (std::size_t end = 0; end != std::string::npos; begin = end + separator.size()) {
    end = value.find(separator, begin);
    members.push_back(value.substr(begin, end == std::string::npos ? end : end - begin));
  }
  return members;
}

Names::Names(const Json& definitions) {
  for (std::size_t at = 0; at < definitions.size(); ++at) {
    const Json& definition = definitions[at];
    const std::string kind = definition.at("kind");
    m_tables[kind].try_emplace(migration::folded(definition.at("oid").get<std::string>()), at);
    for (const Json& other : definition.at("otherClauses")) {
      enterClause(kind, other.at("clause"), other.at("value"), at);
    }
    for (const Json& change : definition.at("clauses")) {
      for (const char* const side : {"base", "old", "new", "result"}) {
        enterClause(kind, change.at("clause"), change.at(side), at);
      }
    }
  }
}

void Names::enterClause(const std::string& kind, const std::string& clause, const Json& value,
                        std::size_t at) {
  if (value.is_string() && (isQuoted(clause) || clause == "OID")) {
    for (const std::string& member : membersOf(clause, value.get<std::string>())) {
      m_tables[kind].try_emplace(migration::folded(unquoted(member)), at);
    }
  }
}

std::size_t Names::find(std::string_view kind, std::string_view nameOrOid) const {
  const auto table = m_tables.find(kind);
  if (table == m_tables.end()) {
    return kNowhere;
  }
  const auto found = table->second.find(migration::folded(nameOrOid));
  return found == table->second.end() ? kNowhere : found->second;
}

std::size_t Names::findOid(std::string_view oid) const {
  const std::size_t type = find("attribute-type", oid);
  return type == kNowhere ? find("object-class", oid) : type;
}

void Names::addValue(std::string_view kind, std::string_view clause, const std::string& value,
                     const Mark& mark, Dictionary* dictionary) const {
  if (!isList(clause)) {
    addPart("PART", value, kNowhere, ' ', dictionary);
    return;
  }
  const std::string_view named = namedKind(clause, kind);
  const std::string separator = separatorOf(clause);
  // What is neither a link nor marked is one part with its neighbours.
  std::string plain;
  bool isFirst = true;
  for (const std::string& member : membersOf(clause, value)) {
    plain += isFirst ? "" : separator;
    isFirst = false;
    const char marked = mark ? mark(member) : ' ';
    const bool isLink = !named.empty() && marked != kNoLink;
    const std::size_t definition = isLink ? find(named, member) : kNowhere;
    if (definition == kNowhere && marked != '+' && marked != '-') {
      plain += member;
      continue;
    }
    addPart("PART", plain, kNowhere, ' ', dictionary);
    plain.clear();
    addPart("PART", member, definition, marked, dictionary);
  }
  addPart("PART", plain, kNowhere, ' ', dictionary);
}

void Names::addSentence(const char* section, const std::string& text, std::size_t itself,
                        Dictionary* dictionary) const {
  std::size_t told = 0;
  for (std::size_t open = text.find('('); open != std::string::npos;
       open = text.find('(', open + 1)) {
    const std::size_t close = text.find(')', open);
    if (close == std::string::npos) {
      break;
    }
    const std::size_t found = findOid(std::string_view(text).substr(open + 1, close - open - 1));
    if (found != kNowhere && found != itself) {
      addPart(section, text.substr(told, open + 1 - told), kNowhere, ' ', dictionary);
      addPart(section, text.substr(open + 1, close - open - 1), found, ' ', dictionary);
      told = close;
    }
  }
  addPart(section, text.substr(told), kNowhere, ' ', dictionary);
}

void linkTo(std::size_t definition, Dictionary* section) {
  if (definition != Names::kNowhere) {
    setNumber(section->AddSectionDictionary("TO"), "N", definition);
    section->ShowSection("TO_END");
  }
}

}  // namespace html
