// The pages of the L rules.

#include <utility>

#include "Rule.h"

namespace migration {

namespace {

using namespace std::string_view_literals;

constexpr const char* kFile = "V3.user.at";

std::vector<ExampleFile> in(std::string_view bytes) { return {{kFile, bytes}}; }

std::vector<RuleInfo> firstRules() {
  return {
      {"L100", "read-otherwise", Severity::kError,
       "A definition, a clause or a value reads as one thing and is kept as another.",
       "What is kept is what gets compared, merged and written; what the text says gets lost.",
       "Look at what stands at the place and before it, and write it in another way.",
       in("attributetypes=( 1.2.3 DESC '1.2.3' NAME 'a' SYNTAX 1.2 )\n"),
       in("attributetypes=( 1.2.3 NAME 'a' DESC '1.2.3' SYNTAX 1.2 )\n")},
      {"L101", "last-word-without-line-end", Severity::kError,
       "The file ends directly behind a word or a number.",
       "The reader takes a word when it has seen what stands behind it, so that it does not see "
       "this one.",
       "End the last line with a line end, and see that what it belongs to is whole.",
       in("attributetypes=( 1.2.3 NAME 'a' SYNTAX 1.2 )\nend"),
       in("attributetypes=( 1.2.3 NAME 'a' SYNTAX 1.2 )")},
      {"L102", "byte-ends-quoted-text", Severity::kError,
       "A byte that is no printable ASCII stands in a quoted text.",
       "It ends the text for the reader, and what stands behind it is read as if it stood outside "
       "the quotes: the OID changes, or definitions get lost.",
       "Write the text in ASCII.",
       in("attributetypes=( 1.2.3 NAME 'a' DESC 'caf\xc3\xa9' SYNTAX 1.2 )\n"),
       in("attributetypes=( 1.2.3 NAME 'a' DESC 'cafe~' SYNTAX 1.2 )\n")},
      {"L103", "text-runs-on", Severity::kError,
       "A TAB stands directly behind a word, a line ends inside quotes, or a quote is not closed.",
       "The reader takes the TAB for a part of the word, so that a keyword is none any more; a "
       "line end ends the quoted text, and what stands behind is read as if it stood outside.",
       "Write a blank in place of the TAB; write a quoted text on one line, with both quotes.",
       in("attributetypes=( 1.2.3 NAME 'a' SYNTAX\t1.2 )\n"),
       in("attributetypes=( 1.2.3 NAME 'a'\tSYNTAX \t1.2\t)\n")},
      {"L104", "malformed-length", Severity::kError,
       "A \"{\" stands behind a number or a word, and no length follows.",
       "The number is not taken as a value, and a \"}\" ends the definition.",
       "Write the length as digits in braces behind a number, or take it away.",
       in("attributetypes=( 1.2.3 NAME 'a' SYNTAX 1.2{64x} )\n"),
       in("attributetypes=( 1.2.3 NAME 'a' SYNTAX 1.2 {64} )\n")},
      {"L105", "text-outside-definitions", Severity::kError, "Text stands outside definitions.",
       "The reader passes over it without a word: a definition whose first word is missing or "
       "misspelt gets lost so.",
       "Make a comment of it with \"#\", make a definition of it, or take it out.",
       in("attributetypes=( 1.2.3 NAME 'a' SYNTAX 1.2 )\nend of the ( first ) part\n"),
       in("attributetypes=( 1.2.3 NAME 'a' SYNTAX 1.2 )\n# end of the first part\n")},
      {"L106", "text-equal-to-keyword", Severity::kWarning,
       "A value is equal to a keyword, in quotes or not.",
       "The reader takes it for that keyword: the value gets lost, or, as objectClasses and "
       "attributeTypes, only its letter case.",
       "Write another text where the value gets lost; where only the letter case does, nothing "
       "has to be done.",
       in("attributetypes=( 1.2.3 NAME 'a' DESC 'NAME' SYNTAX 1.2 )\n"),
       in("attributetypes=( 1.2.3 NAME 'a' DESC 'Name' SYNTAX 1.2 )\n")},
  };
}

std::vector<RuleInfo> laterRules() {
  return {
      {"L107", "no-plain-text", Severity::kError,
       "The file is text in UTF-16, begins with a byte-order mark, or has bytes of zero.",
       "The reader knows plain ASCII only: a zero ends a word or a text, and of UTF-16 it takes "
       "nothing.",
       "Save the file as plain text.",
       in("\xff\xfe"
          "a\0t\0t\0r\0"sv),
       in("attributetypes=( 1.2.3 NAME 'a' SYNTAX 1.2 )\n")},
      {"L108", "another-format", Severity::kError,
       "The file is of another format: LDIF, a server's configuration, XML, JSON, compressed.",
       "The reader finds no definition in it, and says nothing.",
       "Convert it to definitions as \"attributetypes=( ... )\".",
       in("dn: cn=schema\nattributeTypes: ( 1.2.3 NAME 'a' SYNTAX 1.2 )\n"),
       in("attributeTypes=( 1.2.3 NAME 'a' SYNTAX 1.2 )\n")},
      {"L109", "no-definition", Severity::kError, "The file has text and no definition.",
       "Nothing of it is read, as if it were empty.",
       "See whether it is the file that is meant; empty it, or comment the text, if nothing is.",
       in("nothing here yet\n"), in("# nothing here yet\n")},
      {"L110", "misspelt-keyword", Severity::kError,
       "A word is a keyword in the wrong letter case, or one letter away from one.",
       "The reader takes it for a plain word, which becomes the OID or a name, or leaves the "
       "definition out.",
       "Write the keyword as it is.",
       in("attributetypes=( 1.2.3 NAME 'a' EQUALTY b SYNTAX 1.2 )\n"),
       in("attributetypes=( 1.2.3 NAME 'a' EQUALITY equality SYNTAX 1.2 )\n")},
      {"L111", "double-quotes", Severity::kError, "Double quotes stand round a text.",
       "The reader takes each for a character by itself, and the words between for others.",
       "Write single quotes.", in("attributetypes=( 1.2.3 NAME 'a' DESC \"b\" SYNTAX 1.2 )\n"),
       in("attributetypes=( 1.2.3 NAME 'a' DESC '\"b\"' SYNTAX 1.2 )\n")},
      {"L112", "comments-get-lost", Severity::kWarning, "The file has comments.",
       "The library writes a line of its own at the head of a file, and no other comment.",
       "Keep elsewhere what matters of them.",
       in("# of the first site\nattributetypes=( 1.2.3 NAME 'a' SYNTAX 1.2 )\n"),
       in("# File generated by 6.1 migration \n"
          "attributetypes=( 1.2.3 NAME 'a' SYNTAX 1.2 )\n")},
      {"L113", "carriage-return", Severity::kError,
       "A carriage return stands between a keyword and its value, inside a list, or behind the "
       "word that begins a definition.",
       "The reader takes it for a token: the value, the rest of the list or the file gets lost.",
       "End lines with a line feed alone.",
       in("attributetypes=( 1.2.3 NAME 'a' SYNTAX\r\n 1.2 )\n"),
       in("attributetypes=( 1.2.3 NAME 'a'\r\n SYNTAX 1.2 )\r\n")},
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

const std::vector<RuleInfo>& textRules() {
  static const std::vector<RuleInfo> rules = allPages();
  return rules;
}

}  // namespace migration
