// How the pages name, sign and colour what a document says in words. Every sign stands beside its
// word, or in a picture beside the table of both.

#ifndef SCHEMA_MIGRATE_HTML_WORDS_H
#define SCHEMA_MIGRATE_HTML_WORDS_H

#include <string>
#include <string_view>
#include <vector>

namespace html {

struct Word {
  const char* word;   // "changed-by-both-mergeable"
  const char* said;   // "changed by both, mergeable"
  const char* sign;   // "B~"
  const char* style;  // a class of the style sheet
};

// In the order in which they are told; the most urgent first.
const std::vector<Word>& classWords();
const std::vector<Word>& riskWords();
const std::vector<Word>& kindWords();
const std::vector<Word>& severityWords();
const std::vector<Word>& outcomeWords();

// The one of them, or a plain one without a sign for a word that is none of them.
const Word& wordIn(const std::vector<Word>& words, std::string_view word);

}  // namespace html

#endif  // SCHEMA_MIGRATE_HTML_WORDS_H
