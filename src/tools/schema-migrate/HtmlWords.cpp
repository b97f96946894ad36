#include "HtmlWords.h"

namespace html {

const std::vector<Word>& classWords() {
  static const std::vector<Word> kWords = {
      {"changed-by-both-in-conflict", "changed by both, in conflict", "B!", "conflict"},
      {"taken", "taken", "T!", "conflict"},
      {"unknown", "unknown", "?", "conflict"},
      {"changed-by-both-mergeable", "changed by both, mergeable", "B~", "both"},
      {"added-by-site", "added by site", "S+", "site"},
      {"removed-by-site", "removed by site", "S\u2212", "site"},
      {"changed-by-site", "changed by site", "S~", "site"},
      {"added-by-release", "added by release", "R+", "release"},
      {"removed-by-release", "removed by release", "R\u2212", "release"},
      {"changed-by-release", "changed by release", "R~", "release"},
      {"same", "same", "=", "plain"}};
  return kWords;
}

const std::vector<Word>& riskWords() {
  static const std::vector<Word> kWords = {{"data", "data", "\u25b2", "conflict"},
                                           {"structure", "structure", "\u25a0", "both"},
                                           {"cosmetic", "cosmetic", "\u25cb", "site"},
                                           {"none", "none", "\u00b7", "plain"}};
  return kWords;
}

const std::vector<Word>& kindWords() {
  static const std::vector<Word> kWords = {{"attribute-type", "attribute type", "", "plain"},
                                           {"object-class", "object class", "", "plain"},
                                           {"vendor-extension", "vendor extension", "", "plain"}};
  return kWords;
}

const std::vector<Word>& severityWords() {
  static const std::vector<Word> kWords = {{"error", "error", "\u2718", "conflict"},
                                           {"warning", "warning", "\u25b3", "both"}};
  return kWords;
}

const std::vector<Word>& outcomeWords() {
  static const std::vector<Word> kWords = {{"undecided", "undecided", "?", "conflict"},
                                           {"merged", "merged", "~", "both"},
                                           {"text", "text", "T", "both"},
                                           {"old", "old", "O", "site"},
                                           {"added", "added", "+", "site"},
                                           {"kept", "kept", "K", "site"},
                                           {"new", "new", "N", "release"},
                                           {"dropped", "dropped", "\u2212", "release"},
                                           {"excluded", "excluded", "\u2717", "plain"},
                                           {"withdrawn", "withdrawn", "W", "plain"},
                                           {"gone", "gone", "\u2205", "plain"},
                                           {"same", "same", "=", "plain"}};
  return kWords;
}

const Word& wordIn(const std::vector<Word>& words, std::string_view word) {
  static const Word kOther = {"", "", "", "plain"};
  for (const Word& each : words) {
    if (word == each.word) {
      return each;
    }
  }
  return kOther;
}

}  // namespace html
