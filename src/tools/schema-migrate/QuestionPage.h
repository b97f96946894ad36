// How a question about a definition is put to a person: what differs, what depends on it, the
// choices, and what each of them does. Lines fit the width.

#ifndef SCHEMA_MIGRATE_QUESTION_PAGE_H
#define SCHEMA_MIGRATE_QUESTION_PAGE_H

#include <libschema-migration/Questions.h>

#include <cstddef>
#include <string>
#include <string_view>
#include <vector>

struct PageStyle {
  bool isColoured = false;
  std::size_t width = 80;
};

// What may be typed: a letter or a word, and what it does. A choice that is about a clause, or a
// whole definition, takes something; the others do what their letter says.
struct Answer {
  char letter = 0;
  const char* word = "";
  std::string does;
  migration::Take take = migration::Take::kNothing;
  bool isAlwaysThere = false;  // whatever the question is
};
constexpr char kByClause = 'c';
constexpr char kMove = 'r';
constexpr char kText = 't';
constexpr char kExplain = '?';
constexpr char kSkip = 's';
constexpr char kBack = 'b';
constexpr char kQuit = 'q';

// What may be answered to a question, or about one of its clauses.
std::vector<Answer> answersTo(const migration::Question& question);
std::vector<Answer> answersAbout(const migration::ClauseChoices& clause);

// "o n a c t s b q ?".
std::string lettersOf(const std::vector<Answer>& answers);

// The difference and what depends on it, below a title; a clause by itself.
std::string questionPage(const std::string& title, const migration::Question& question,
                         const migration::MigrationPlan& plan, const PageStyle& style);
std::string clausePage(const migration::ClauseChoices& choices, const migration::MatchRow& match,
                       const PageStyle& style);

// The answers, a line each.
std::string answerLines(const std::vector<Answer>& answers, const PageStyle& style);

// What each choice would leave in the result, and how the dialogue goes.
std::string explanation(const migration::Question& question, const std::string& file,
                        const PageStyle& style);
std::string clauseExplanation(const migration::ClauseChoices& clause, const PageStyle& style);

#endif  // SCHEMA_MIGRATE_QUESTION_PAGE_H
