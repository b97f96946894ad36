// Reading a decisions file.

#include <algorithm>
#include <cctype>
#include <optional>
#include <string_view>
#include <utility>

#include "Decisions.h"
#include "OidList.h"

#define TOML_EXCEPTIONS 0
#define TOML_ENABLE_FORMATTERS 0
#include <toml++/toml.h>

namespace migration {

namespace {

constexpr std::pair<std::string_view, Take> kWords[] = {
    {"old", Take::kOld},       {"new", Take::kNew},   {"base", Take::kBase},
    {"merged", Take::kMerged}, {"drop", Take::kDrop}, {"union", Take::kUnion}};

std::optional<Take> takeOf(std::string_view word) {
  for (const auto& [text, take] : kWords) {
    if (text == word) {
      return take;
    }
  }
  return std::nullopt;
}

std::optional<Kind> kindOf(std::string_view word) {
  for (const Kind kind : {Kind::kAttributeType, Kind::kObjectClass, Kind::kVendorExtension}) {
    if (wordOf(kind) == word) {
      return kind;
    }
  }
  return std::nullopt;
}

bool isName(std::string_view text) {
  const auto isLetter = [](char c) { return (c >= 'a' && c <= 'z') || (c >= 'A' && c <= 'Z'); };
  return !text.empty() && isLetter(text.front()) &&
         std::all_of(text.begin(), text.end(),
                     [&](char c) { return isLetter(c) || (c >= '0' && c <= '9') || c == '-'; });
}

// One entry while it is read.
class EntryReader {
 public:
  EntryReader(const Source& source, const toml::table& table, Failures* failures)
      : m_source(source), m_table(table), m_failures(*failures) {
    m_decision.file = source.path();
    m_decision.line = table.source().begin.line;
  }

  // Nothing when something was wrong; it is among the failures then.
  std::optional<Decision> read() {
    const std::size_t before = m_failures.size();
    for (const auto& [key, node] : m_table) {
      readKey(key.str(), node);
    }
    if (m_failures.size() == before) {
      checkWhole();
    }
    if (m_failures.size() != before) {
      return std::nullopt;
    }
    return std::move(m_decision);
  }

 private:
  void fail(const toml::node& node, std::string text) {
    m_failures.push_back({m_source.path(), node.source().begin.line, node.source().begin.column, "",
                          std::move(text)});
  }

  void readKey(std::string_view key, const toml::node& node) {
    if (key == "clauses") {
      readClauses(node);
      return;
    }
    const std::optional<std::string> value = node.value<std::string>();
    if (!value || !node.is_string()) {
      fail(node, "\"" + std::string(key) + "\" must be a text in quotes");
      return;
    }
    readText(key, *value, node);
  }

  void readText(std::string_view key, const std::string& value, const toml::node& node) {
    constexpr std::pair<std::string_view, std::string Decision::*> kTexts[] = {
        {"oid", &Decision::oid},
        {"name", &Decision::name},
        {"text", &Decision::text},
        {"rename", &Decision::rename},
        {"renumber", &Decision::renumber},
        {"reason", &Decision::reason},
        {"fingerprint", &Decision::fingerprint}};
    const auto* const known = std::find_if(std::begin(kTexts), std::end(kTexts),
                                           [&](const auto& text) { return text.first == key; });
    if (known != std::end(kTexts)) {
      m_decision.*known->second = value;
      if (key == "rename" && !isName(value)) {
        fail(node, "\"" + value +
                       "\" is no name; a name begins with a letter, and letters, digits and "
                       "\"-\" follow");
      } else if (key == "renumber" && !isNumericOid(value)) {
        fail(node, "\"" + value + "\" is no OID; write numbers with dots in between");
      } else if (value.empty() && key != "reason") {
        fail(node, "\"" + std::string(key) + "\" is empty; give it a value or leave it out");
      }
    } else if (key == "kind") {
      readKind(value, node);
    } else if (key == "take") {
      readTake(value, node);
    } else {
      fail(node, "\"" + std::string(key) +
                     "\" is no key of a decision; the keys are kind, oid, name, fingerprint, take, "
                     "text, clauses, rename, renumber and reason");
    }
  }

  void readKind(const std::string& value, const toml::node& node) {
    const std::optional<Kind> kind = kindOf(value);
    m_hasKind = true;
    if (!kind) {
      fail(node,
           "\"" + value + "\" is no kind; write attribute-type, object-class or vendor-extension");
    } else {
      m_decision.kind = *kind;
    }
  }

  void readTake(const std::string& value, const toml::node& node) {
    const std::optional<Take> take = takeOf(value);
    if (!take || *take == Take::kUnion) {
      fail(node, "\"" + value + "\" cannot be taken; write old, new, base, merged or drop");
    } else {
      m_decision.take = *take;
    }
  }

  void readClauses(const toml::node& node) {
    const toml::table* const clauses = node.as_table();
    if (clauses == nullptr) {
      fail(node, "\"clauses\" must be a table, as in { SYNTAX = \"new\", MAY = \"union\" }");
      return;
    }
    for (const auto& [key, choice] : *clauses) {
      std::string clause(key.str());
      std::transform(clause.begin(), clause.end(), clause.begin(),
                     [](unsigned char c) { return static_cast<char>(std::toupper(c)); });
      const std::optional<Take> take = takeOf(choice.value_or(std::string()));
      if (!take || *take == Take::kDrop || *take == Take::kMerged) {
        fail(choice, "a clause is taken from \"old\", \"new\", \"base\" or \"union\"");
      } else {
        m_decision.clauses[clause] = *take;
      }
    }
  }

  void checkWhole() {
    if (!m_hasKind || m_decision.oid.empty() == m_decision.name.empty()) {
      fail(m_table,
           "a decision names its definition by \"kind\" and by either \"oid\" or \"name\"");
    }
    const int ways = static_cast<int>(m_decision.take != Take::kNothing) +
                     static_cast<int>(!m_decision.text.empty()) +
                     static_cast<int>(!m_decision.clauses.empty());
    const bool changesIdentity = !m_decision.rename.empty() || !m_decision.renumber.empty();
    if (ways > 1) {
      fail(m_table, "\"take\", \"text\" and \"clauses\" exclude each other; keep one of them");
    } else if (ways == 0 && !changesIdentity) {
      fail(m_table,
           "nothing is decided; give \"take\", \"text\", \"clauses\", \"rename\" or "
           "\"renumber\"");
    }
  }

  const Source& m_source;
  const toml::table& m_table;
  Failures& m_failures;
  Decision m_decision;
  bool m_hasKind = false;
};

}  // namespace

std::string_view wordOf(Take take) {
  for (const auto& [text, word] : kWords) {
    if (word == take) {
      return text;
    }
  }
  return "";
}

void readDecisions(const Source& source, std::vector<Decision>* decisions, Failures* failures) {
  const toml::parse_result parsed = toml::parse(source.bytes(), source.path());
  if (!parsed) {
    const toml::source_position& place = parsed.error().source().begin;
    failures->push_back({source.path(), place.line, place.column, "",
                         "is not TOML: " + std::string(parsed.error().description())});
    return;
  }
  for (const auto& [key, node] : parsed.table()) {
    const toml::array* const entries = key == "definition" ? node.as_array() : nullptr;
    if (entries == nullptr) {
      failures->push_back({source.path(), node.source().begin.line, node.source().begin.column, "",
                           "\"" + std::string(key.str()) +
                               "\" does not belong here; a decisions file has a [[definition]] for "
                               "each decision"});
      continue;
    }
    for (const toml::node& entry : *entries) {
      const toml::table* const table = entry.as_table();
      if (table == nullptr) {
        failures->push_back({source.path(), entry.source().begin.line, entry.source().begin.column,
                             "", "a decision is a table, [[definition]]"});
        continue;
      }
      if (std::optional<Decision> decision = EntryReader(source, *table, failures).read()) {
        decisions->push_back(std::move(*decision));
      }
    }
  }
}

}  // namespace migration
