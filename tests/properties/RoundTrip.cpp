#include "RoundTrip.h"

#include <sys/stat.h>

#include <algorithm>
#include <cstddef>
#include <fstream>
#include <functional>
#include <sstream>
#include <vector>

namespace properties {

namespace {

// ---- Texts as the lexical analyser reads them ----

bool isDigit(char c) { return c >= '0' && c <= '9'; }
bool isLetter(char c) { return (c >= 'a' && c <= 'z') || (c >= 'A' && c <= 'Z'); }

// A keyword is a word, too.
bool isWord(const std::string& text) {
  return !text.empty() && (isLetter(text[0]) || text[0] == '-') &&
         std::all_of(text.begin(), text.end(), [](char c) {
           return isLetter(c) || isDigit(c) || c == '_' || c == '-' || c == '\t';
         });
}

bool isNumber(const std::string& text) {
  return !text.empty() && isDigit(text[0]) &&
         std::all_of(text.begin(), text.end(), [](char c) { return isDigit(c) || c == '.'; });
}

// A number, "{" and digits. Whether "}" follows is up to the caller.
bool isNumberWithBrace(const std::string& text) {
  const std::size_t brace = std::min(text.find('{'), text.size());
  return brace < text.size() && isNumber(text.substr(0, brace)) &&
         std::all_of(text.begin() + static_cast<std::ptrdiff_t>(brace) + 1, text.end(), isDigit);
}

bool isNumberWithLength(const std::string& text) {
  return text.size() > 2 && text.back() == '}' && text[text.size() - 2] != '{' &&
         isNumberWithBrace(text.substr(0, text.size() - 1));
}

bool isValue(const std::string& text) { return isWord(text) || isNumber(text); }

bool isAnyToken(const std::string& text) {
  return isValue(text) || isNumberWithLength(text) || isNumberWithBrace(text);
}

// A text equal to the one stored last is the same token, of the same kind: here the OID. Keywords
// are not stored.
bool isTakenForOid(const std::string& oid, const std::vector<std::string>& quoted) {
  const auto stored = std::find_if(quoted.begin(), quoted.end(), [](const std::string& text) {
    return text != "objectclasses" && text != "attributetypes" && text != "ORVAttributetypes";
  });
  return isNumber(oid) && stored != quoted.end() && *stored == oid;
}

bool canBeOid(const std::string& oid) { return oid.empty() || isValue(oid); }

// The protected members of an attribute type.
struct OpenAttribute : Attribute {
  explicit OpenAttribute(const Attribute& definition) : Attribute(definition) {}
  bool hasPlainValues() const {
    const auto isRule = [](const std::string& rule) { return rule.empty() || isValue(rule); };
    return superiors.size() <= 1 && std::all_of(superiors.begin(), superiors.end(), isValue) &&
           isRule(equality) && isRule(ordering) && isRule(substr) &&
           (isRule(syntax) || isNumberWithLength(syntax)) && isWord(usage);
  }
};

std::vector<std::string> quotedTexts(const ORVSchema& definition) {
  std::vector<std::string> quoted = definition.namesInPlace();
  if (!definition.descriptionInPlace().empty()) {
    quoted.push_back(definition.descriptionInPlace());
  }
  return quoted;
}

bool areWords(const std::vector<std::string>& texts) {
  return std::all_of(texts.begin(), texts.end(), isWord);
}

// ---- What is written ----

const OidSet& setOf(const State& state, const std::string& file) {
  for (std::size_t i = 0; i < kFileNames.size(); ++i) {
    if (file == kFileNames[i]) {
      return state.fileSets[i];
    }
  }
  return state.modSchemaOids;
}

template <typename Definition>
void addByNameAndOid(Definition* definition, Table<Definition>* byName, Table<Definition>* byOid) {
  byName->emplace(definition->getFirstNameLower(), definition);
  byOid->emplace(definition->getOid(), definition);
}

// The definitions that writeFile writes, entered as a new manager enters them.
State writtenOf(const State& state, const std::string& file) {
  State written;
  for (const std::string& oid : setOf(state, file)) {
    if (state.ocOidTable.count(oid) != 0) {
      addByNameAndOid(state.ocOidTable.at(oid), &written.ocTable, &written.ocOidTable);
    } else if (state.attrOidTable.count(oid) != 0) {
      addByNameAndOid(state.attrOidTable.at(oid), &written.attrTable, &written.attrOidTable);
      if (state.orvAttrTable.count(oid) != 0) {
        written.orvAttrTable.emplace(oid, state.orvAttrTable.at(oid));
      }
    }
  }
  return written;
}

// ---- Comparison of definitions ----

template <typename Definition>
std::string lineOf(const Definition& definition) {
  std::string line;
  definition.appendLine(&line);
  return line;
}

bool areEqual(const Attribute& left, const Attribute& right) { return left.isEqualTo(right); }
bool areEqual(const ObjectClass& left, const ObjectClass& right) { return left.isEqualTo(right); }
bool areEqual(const ORVAttribute& left, const ORVAttribute& right) { return left.isEqualTo(right); }

template <typename Definition>
std::string differenceOf(const char* name, const Table<Definition>& expected,
                         const Table<Definition>& actual) {
  std::string text;
  for (const auto& [key, definition] : expected) {
    if (actual.count(key) == 0) {
      text += std::string(name) + " lacks '" + key + "'\n";
    } else if (const Definition& back = *actual.at(key); !areEqual(*definition, back) ||
                                                         !areEqual(back, *definition) ||
                                                         lineOf(*definition) != lineOf(back)) {
      text += std::string(name) + " '" + key + "': wrote " + lineOf(*definition) + "has " +
              lineOf(back);
    }
  }
  for (const auto& entry : actual) {
    if (expected.count(entry.first) == 0) {
      text += std::string(name) + " has '" + entry.first + "'\n";
    }
  }
  return text;
}

OidSet oidsOf(const State& written) {
  OidSet oids;
  for (const auto& entry : written.attrOidTable) {
    oids.insert(entry.first);
  }
  for (const auto& entry : written.ocOidTable) {
    oids.insert(entry.first);
  }
  return oids;
}

std::string readWhole(const std::string& path) {
  std::ifstream in(path, std::ios::binary);
  std::ostringstream text;
  text << in.rdbuf();
  return text.str();
}

template <typename Definition>
bool allIn(const Table<Definition>& table) {
  return std::all_of(table.begin(), table.end(),
                     [](const auto& entry) { return readsBack(*entry.second); });
}

}  // namespace

bool readsBack(const Attribute& definition) {
  return canBeOid(definition.oidInPlace()) && OpenAttribute(definition).hasPlainValues() &&
         !isTakenForOid(definition.oidInPlace(), quotedTexts(definition));
}

bool readsBack(const ObjectClass& definition) {
  return canBeOid(definition.oidInPlace()) && areWords(definition.superiorsInPlace()) &&
         areWords(definition.reqAttrsInPlace()) && areWords(definition.optAttrsInPlace()) &&
         !isTakenForOid(definition.oidInPlace(), quotedTexts(definition));
}

bool readsBack(const ORVAttribute& definition) {
  return canBeOid(definition.oidInPlace()) && isAnyToken(accessOf(definition)) &&
         isAnyToken(lengthOf(definition)) &&
         !isTakenForOid(definition.oidInPlace(), databaseNamesOf(definition));
}

bool allReadBack(const SchemaManager& manager, const std::string& file) {
  const State written = writtenOf(stateOf(manager), file);
  return allIn(written.attrOidTable) && allIn(written.ocOidTable) && allIn(written.orvAttrTable);
}

std::string differenceAfterRoundTrip(SchemaManager* manager, const std::string& file,
                                     ManagerGroup* group) {
  const std::string once = group->folder() + "/once";
  const std::string twice = group->folder() + "/twice";
  ::mkdir(once.c_str(), 0777);
  ::mkdir(twice.c_str(), 0777);
  const State written = writtenOf(stateOf(*manager), file);
  if (manager->writeFile(once, file) != 0) {
    return "cannot be written\n";
  }
  const ReadResult again = group->readIn(once, file);
  if (again.status != 0) {
    return "cannot be read again:\n" + readWhole(once + "/" + file);
  }
  const State state = stateOf(*again.manager);
  std::string text = differenceOf("attrTable", written.attrTable, state.attrTable) +
                     differenceOf("ocTable", written.ocTable, state.ocTable) +
                     differenceOf("orvAttrTable", written.orvAttrTable, state.orvAttrTable) +
                     differenceOf("attrOidTable", written.attrOidTable, state.attrOidTable) +
                     differenceOf("ocOidTable", written.ocOidTable, state.ocOidTable);
  if (setOf(state, file) != oidsOf(written)) {
    text += "the set differs\n";
  }
  const std::string bytes = oidsOf(written).empty() ? "" : readWhole(once + "/" + file);
  if (again.manager->writeFile(twice, file) != 0 || readWhole(twice + "/" + file) != bytes) {
    text += "the second file differs\n";
  }
  return text;
}

}  // namespace properties
