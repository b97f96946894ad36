// The pages of the D rules.

#include <utility>

#include "Rule.h"

namespace migration {

namespace {

constexpr const char* kFile = "V3.user.at";

std::vector<ExampleFile> in(std::string_view bytes) { return {{kFile, bytes}}; }

std::vector<RuleInfo> firstRules() {
  return {
      {"D201", "word-becomes-oid", Severity::kError,
       "A word that the reader does not know stands where a clause begins: an X- clause, APPROX, a "
       "second word.",
       "It, or its value, takes the place of the OID, and the definition is entered under it.",
       "Take it away, or make a comment of it.",
       in("attributetypes=( 1.2.3 NAME 'a' SYNTAX 1.2 X-ORIGIN 'RFC 4519' )\n"),
       in("attributetypes=( 1.2.3 NAME 'a' SYNTAX 1.2 ) # X-ORIGIN 'RFC 4519'\n")},
      {"D202", "collective", Severity::kError, "An attribute type is COLLECTIVE.",
       "The reader does not get past the word: reading the file never ends.", "Take the word away.",
       in("attributetypes=( 1.2.3 NAME 'a' SYNTAX 1.2 COLLECTIVE )\n"),
       in("attributetypes=( 1.2.3 NAME 'a' DESC 'COLLECTIVE types' SYNTAX 1.2 )\n")},
      {"D203", "names-run-on", Severity::kError,
       "No clause that ends NAME stands behind it; the definition's \")\" does not end it.",
       "The reader takes what follows, the next definitions too, for names, up to such a clause; "
       "where the file has none, reading never ends.",
       "Put a clause behind the names: USAGE userApplications, or the kind of a class.",
       in("attributetypes=( 1.2.3 SYNTAX 1.2 NAME 'a' )\n"),
       in("attributetypes=( 1.2.3 NAME 'a' SYNTAX 1.2 )\n")},
      {"D204", "not-closed", Severity::kError, "A definition has no \")\" at its end.",
       "It gets lost, or swallows the next one; where the reader fails, the rest of the file is "
       "not read.",
       "Write the \")\".",
       in("attributetypes=( 1.2.3 NAME 'a' SYNTAX 1.2\n"
          "attributetypes=( 1.2.4 NAME 'b' SYNTAX 1.2 )\n"),
       in("attributetypes=( 1.2.3 NAME 'a' SYNTAX 1.2\n)\n")},
      {"D205", "no-numeric-oid", Severity::kWarning,
       "A definition has no OID, or one that is no numeric OID.",
       "Definitions are found, compared and written by their OIDs; one without is lost in a block. "
       "A word as OID is kept, and other servers and tools do not take it.",
       "Write the numeric OID directly behind the \"(\".",
       in("attributetypes=( siteBadge-oid NAME 'a' SYNTAX 1.2 )\n"),
       in("attributetypes=( 1.2.3 NAME 'siteBadge-oid' SYNTAX 1.2 )\n")},
      {"D206", "twice", Severity::kWarning, "A clause or a name stands twice in one definition.",
       "Of most clauses the last one counts and the other gets lost; of lists both count.",
       "Write it once.", in("attributetypes=( 1.2.3 NAME 'a' DESC 'b' DESC 'c' SYNTAX 1.2 )\n"),
       in("attributetypes=( 1.2.3 NAME ( 'a' 'b' ) DESC 'b' SYNTAX 1.2 )\n")},
  };
}

std::vector<RuleInfo> laterRules() {
  return {
      {"D207", "unquoted-word-among-names", Severity::kWarning,
       "A word without quotes stands in a NAME clause.",
       "The reader takes any word there for a name: an X- clause and its values become names.",
       "Write a name in single quotes; take anything else away.",
       in("attributetypes=( 1.2.3 NAME siteA SYNTAX 1.2 )\n"),
       in("attributetypes=( 1.2.3 NAME 'siteA' SYNTAX 1.2 )\n")},
      {"D208", "single-member-takes-the-end", Severity::kError,
       "MUST, MAY or DBNAME without parentheses round its value is the last clause.",
       "The reader takes the definition's \")\" for the end of the list, and reads on.",
       "Write parentheses round the value.",
       in("attributetypes=( 1.2.3 NAME 'a' SYNTAX 1.2 )\n"
          "objectclasses=( 1.2.4 NAME 'b' ABSTRACT MAY a )\n"),
       in("attributetypes=( 1.2.3 NAME 'a' SYNTAX 1.2 )\n"
          "objectclasses=( 1.2.4 NAME 'b' ABSTRACT MAY ( a ) )\n")},
      {"D209", "stray-parenthesis", Severity::kError,
       "A parenthesis has no partner, or stands round what takes none.",
       "The reader takes the next \")\" for the end of the definition, and the rest gets lost.",
       "Write as many \")\" as \"(\", and none round what takes one value.",
       in("attributetypes=( 1.2.3 NAME 'a' SYNTAX ( 1.2 ) USAGE userApplications )\n"),
       in("attributetypes=( 1.2.3 NAME ( 'a' ) SYNTAX 1.2 USAGE userApplications )\n")},
      {"D210", "definition-inside-another", Severity::kError,
       "A definition begins inside another one, or a section directly inside a block.",
       "The reader takes both for one, or reads the inner one as one of the outer kind.",
       "Write one behind the other.",
       in("attributetypes=( 1.2.3 NAME 'a' SYNTAX 1.2\n"
          "attributetypes=( 1.2.4 NAME 'b' SYNTAX 1.2 )\n)\n"),
       in("attributetypes { ( 1.2.3 NAME 'a' SYNTAX 1.2 )\n( 1.2.4 NAME 'b' SYNTAX 1.2 ) }\n")},
      {"D211", "nothing-opens-the-definition", Severity::kError,
       "Neither \"=\" nor \"{\" stands behind the word that begins a definition.",
       "The reader fails there, and the rest of the file is not read.",
       "Write \"=\" before one definition and \"{\" before several, or take the word away.",
       in("attributetypes ( 1.2.3 NAME 'a' SYNTAX 1.2 )\n"),
       in("attributetypes\n=\n( 1.2.3 NAME 'a' SYNTAX 1.2 )\n")},
      {"D212", "clause-without-value", Severity::kError,
       "A keyword or \")\" stands where the value of a clause must.",
       "The reader takes it in place of the value: a clause gets lost, or the definition goes on.",
       "Write the value, or take the keyword away.",
       in("attributetypes=( 1.2.3 NAME 'a' DESC SYNTAX 1.2 )\n"),
       in("attributetypes=( 1.2.3 NAME 'a' DESC '' SYNTAX 1.2 )\n")},
      {"D213", "block-not-closed", Severity::kError, "A block has no \"}\".",
       "What stands behind it is read as a part of it, or the reader fails at the end.",
       "Write \"}\" behind the last definition of the block.",
       in("attributetypes {\n( 1.2.3 NAME 'a' SYNTAX 1.2 )\n"),
       in("attributetypes {\n( 1.2.3 NAME 'a' SYNTAX 1.2 ) }\n")},
      {"D214", "no-name-where-one-must-stand", Severity::kError,
       "A number, or another token, stands where a name must.",
       "The reader passes over it or ends the list there, and a number becomes the OID.",
       "Write the name.", in("attributetypes=( 1.2.3 NAME 'a' DESC 5 SYNTAX 1.2 )\n"),
       in("attributetypes=( 1.2.3 NAME 'a' DESC '5' SYNTAX 1.2 )\n")},
  };
}

std::vector<RuleInfo> allPages() {
  std::vector<RuleInfo> rules = firstRules();
  for (RuleInfo& rule : laterRules()) {
    rules.push_back(std::move(rule));
  }
  return rules;
}

}  // namespace

const std::vector<RuleInfo>& definitionRules() {
  static const std::vector<RuleInfo> rules = allPages();
  return rules;
}

}  // namespace migration
