// O: lists of OIDs to exclude or to withdraw.

#include <algorithm>
#include <string>
#include <unordered_map>
#include <unordered_set>
#include <utility>
#include <vector>

#include "Check.h"
#include "OidList.h"
#include "Rule.h"
#include "RuleSupport.h"

namespace migration {

namespace {

constexpr Kind kKinds[] = {Kind::kObjectClass, Kind::kAttributeType, Kind::kVendorExtension};

class ListCheck {
 public:
  ListCheck(const Installation& installation, const Source& list, Findings* findings)
      : m_installation(installation), m_list(list), m_findings(*findings) {}

  void run() {
    const std::vector<OidWord> words = readOidList(m_list);
    for (const OidWord& word : words) {
      if (word.use == WordUse::kTaken) {
        m_taken.emplace(word.text, word.offset);
      }
    }
    for (const OidWord& word : words) {
      if (word.use == WordUse::kTaken) {
        lookAtTaken(word);
      } else {
        lookAtLost(word);
      }
    }
  }

 private:
  void lookAtTaken(const OidWord& word) {
    const std::size_t first = m_taken.at(word.text);
    if (first != word.offset) {
      add("O504", Severity::kWarning, word,
          std::string(word.text) + " stands in the list already, in line " +
              std::to_string(m_list.placeOf(first).line) + "; delete one of the two");
      return;
    }
    if (isAnOidOfADefinition(word.text)) {
      return;
    }
    if (!isNumericOid(word.text)) {
      add("O502", Severity::kError, word,
          printed(word.text) + " is no OID, and therefore names nothing; " + adviceFor(word.text));
    } else {
      add("O503", Severity::kError, word,
          std::string(word.text) +
              " is the OID of no definition, so that it has no effect; correct it or delete it");
    }
  }

  // Nothing is lost with a word that the list holds elsewhere.
  void lookAtLost(const OidWord& word) {
    const std::string_view before = word.text.substr(0, word.text.find('#'));
    const Severity severity = m_taken.count(before) != 0 ? Severity::kWarning : Severity::kError;
    if (word.use == WordUse::kCutByComment) {
      add("O501", severity, word,
          printed(word.text) +
              " has \"#\" in it, so that the whole word is read as a comment; write a blank before "
              "\"#\"");
    } else if (word.text.find('#') == std::string_view::npos) {
      add("O501", severity, word,
          printed(word.text) +
              " is the last word, and without a line end behind it it is lost; end the line");
    }
  }

  bool isAnOidOfADefinition(std::string_view word) const {
    return std::any_of(std::begin(kKinds), std::end(kKinds), [&](Kind kind) {
      return m_installation.byOid(kind, word) != nullptr ||
             (isNumericOid(word) && m_installation.isDefined(kind, word));
    });
  }

  // Names what must stand in the list where that is known, without a blank in it.
  std::string adviceFor(std::string_view word) const {
    for (const Kind kind : kKinds) {
      const Entry* const entry = m_installation.find(kind, word);
      if (entry != nullptr) {
        return "write " + oidOf(*entry) + ", the OID of the " + std::string(nameOf(kind)) +
               " of this name";
      }
    }
    return word.find(',') != std::string_view::npos || word.find(';') != std::string_view::npos
               ? "put white space between OIDs, and no other character"
               : "write the OID as digits with dots, without quotes and without zeros in front";
  }

  // Words can hold any byte.
  static std::string printed(std::string_view word) {
    constexpr std::size_t kLongest = 80;
    std::string text;
    for (const char c : word.substr(0, kLongest)) {
      text += c > ' ' && c < 127 ? c : '?';
    }
    return word.size() > kLongest ? text + "..." : text;
  }

  void add(const char* rule, Severity severity, const OidWord& word, std::string text) {
    const Place place = m_list.placeOf(word.offset);
    m_findings.push_back(
        {rule, severity, m_list.path(), place.line, place.column, std::move(text), ""});
  }

  const Installation& m_installation;
  const Source& m_list;
  Findings& m_findings;
  std::unordered_map<std::string_view, std::size_t> m_taken;  // where each stands first
};

}  // namespace

void checkLists(const CheckRequest& request, Findings* findings) {
  for (const Source* const list : request.excludeLists) {
    ListCheck(*request.installation, *list, findings).run();
  }
  if (request.withdrawList != nullptr) {
    ListCheck(*request.installation, *request.withdrawList, findings).run();
  }
}

const std::vector<RuleInfo>& listRules() {
  static const std::vector<RuleInfo> kRules = {
      {"O501",
       "listed-word-is-lost",
       Severity::kError,
       "The last word of a list of OIDs has no line end behind it, or a word has \"#\" in it.",
       "The library does not use the word that the end of the file follows directly, and takes a "
       "word with \"#\" anywhere for a comment: the definition is not excluded, or not withdrawn, "
       "and nothing says so.",
       "End the last line; write a blank before \"#\".",
       {{"V3.user.at", "attributetypes=( 1.3.6.1.4.1.99999.1 NAME 'badge' DESC 'badge' )\n"},
        {"exclude.txt", "1.3.6.1.4.1.99999.1"}},
       {{"V3.user.at", "attributetypes=( 1.3.6.1.4.1.99999.1 NAME 'badge' DESC 'badge' )\n"},
        {"exclude.txt", "1.3.6.1.4.1.99999.1 # badge\n# the end"}}},
      {"O502",
       "listed-word-is-no-oid",
       Severity::kError,
       "A word of a list is no OID: a name, OIDs joined by commas, a text in quotes, a number with "
       "a zero in front.",
       "Words are compared with OIDs letter for letter, so that this one names nothing.",
       "Write the OID as digits with dots, and white space between OIDs.",
       {{"V3.user.at", "attributetypes=( 1.3.6.1.4.1.99999.1 NAME 'badge' DESC 'badge' )\n"},
        {"exclude.txt", "badge\n"}},
       {{"V3.user.at", "attributetypes=( badge-oid NAME 'badge' DESC 'badge' )\n"},
        {"exclude.txt", "badge-oid\n"}}},
      {"O503",
       "listed-oid-matches-nothing",
       Severity::kError,
       "No definition of the installation has the OID.",
       "The line has no effect; often a digit is wrong, and the definition that is meant is neither "
       "excluded nor withdrawn.",
       "Correct the OID, or delete it.",
       {{"V3.user.at", "attributetypes=( 1.3.6.1.4.1.99999.1 NAME 'badge' DESC 'badge' )\n"},
        {"exclude.txt", "1.3.6.1.4.1.99999.11\n"}},
       {{"V3.user.at", "attributetypes=( 1.3.6.1.4.1.99999.1 NAME 'badge' DESC 'badge' )\n"},
        {"exclude.txt", "1.3.6.1.4.1.99999.1\n"}}},
      {"O504",
       "listed-twice",
       Severity::kWarning,
       "An OID stands in one list twice.",
       "It counts once; one of the two may be meant to be another OID.",
       "Delete one of the two.",
       {{"V3.user.at", "attributetypes=( 1.3.6.1.4.1.99999.1 NAME 'badge' DESC 'badge' )\n"},
        {"exclude.txt", "1.3.6.1.4.1.99999.1\n1.3.6.1.4.1.99999.1\n"}},
       {{"V3.user.at",
         "attributetypes=( 1.3.6.1.4.1.99999.1 NAME 'badge' DESC 'badge' )\n"
         "attributetypes=( 1.3.6.1.4.1.99999.10 NAME 'door' DESC 'door' )\n"},
        {"exclude.txt", "1.3.6.1.4.1.99999.1\n1.3.6.1.4.1.99999.10\n"}}},
  };
  return kRules;
}

}  // namespace migration
