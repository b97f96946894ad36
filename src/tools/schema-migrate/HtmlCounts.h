// Numbers of a page: a bar and a table, and the filters that go with them.

#ifndef SCHEMA_MIGRATE_HTML_COUNTS_H
#define SCHEMA_MIGRATE_HTML_COUNTS_H

#include <string_view>
#include <vector>

#include "HtmlPage.h"
#include "HtmlWords.h"

namespace html {

struct CountTable {
  const char* id;            // "class"
  const char* heading;       // "Who changed how many"
  const char* column;        // "Class"
  std::string_view leftOut;  // the word that the bar leaves out: what would fill it
};

// Adds a section COUNTS with how many there are of each word.
void addCounts(const CountTable& table, const std::vector<Word>& words, const Json& counts,
               Dictionary* page);

// Adds a section FACET: which values of a member of `items` there are, and how many of each.
void addFacet(const char* name, const char* heading, const std::vector<Word>& words,
              const Json& items, Dictionary* page);

}  // namespace html

#endif  // SCHEMA_MIGRATE_HTML_COUNTS_H
