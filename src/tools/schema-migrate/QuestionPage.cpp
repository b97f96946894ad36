#include "QuestionPage.h"

#include <libschema-migration/ToldClauses.h>

#include "DisplayText.h"
#include "Messages.h"

namespace {

using migration::ClauseChange;
using migration::Entry;
using migration::MigrationPlan;
using migration::Question;
using migration::Take;
using migration::ToldClause;
using migration::Values;
using migration::Verdict;

constexpr char kNothingThere[] = "(none)";

std::string bold(const std::string& text, const PageStyle& style) {
  return style.isColoured ? "\x1b[1m" + text + "\x1b[0m" : text;
}

// "  label     value", broken below the value.
std::string labelled(std::size_t indent, const std::string& label, const std::string& value,
                     const PageStyle& style) {
  constexpr std::size_t kLabel = 8;
  return wrapped(std::string(indent, ' ') + padded(label, kLabel) + " ", value, style.width);
}

std::string paragraph(std::size_t indent, const std::string& text, const PageStyle& style) {
  return wrapped(std::string(indent, ' '), text, style.width);
}

std::string shownClause(const std::string& value) {
  return value.empty() ? kNothingThere : wholePrintable(value);
}

std::string textOf(const Entry& entry) {
  return wholePrintable(migration::textOf(contentOf(*entry.kept)));
}

std::string placesOf(const migration::MatchRow& match) {
  std::string text;
  const auto add = [&](const char* side, const Entry* entry) {
    if (entry != nullptr) {
      text += (text.empty() ? "" : ", ") + std::string(side) + " " +
              placeOf(entry->file->name, entry->place().line);
    }
  };
  add("BASE", match.base);
  add("OLD", match.old);
  add("NEW", match.latest);
  return text;
}

std::string dependents(const char* where, const std::vector<migration::Reference>& references,
                       const PageStyle& style) {
  constexpr std::size_t kMost = 8;
  if (references.empty()) {
    return "";
  }
  std::vector<std::string> who;
  for (const migration::Reference& reference : references) {
    const std::string name = describe(reference);
    if (who.empty() || who.back() != name) {
      who.push_back(name);  // what names it twice does so in one place
    }
  }
  std::string text = std::string("In ") + where + ", " +
                     (who.size() == 1 ? "this refers" : "these refer") + " to it: ";
  for (std::size_t i = 0; i < who.size() && i < kMost; ++i) {
    text += (i == 0 ? "" : ", ") + wholePrintable(who[i]);
  }
  if (who.size() > kMost) {
    text += ", and " + std::to_string(who.size() - kMost) + " more";
  }
  return paragraph(2, text + ".", style);
}

// Where nothing can be compared clause by clause, the whole definitions.
std::string wholeSides(const migration::MatchRow& match, bool hasBase, const PageStyle& style) {
  const auto side = [&](const char* name, const Entry* entry) {
    return labelled(4, name, entry == nullptr ? kNothingThere : textOf(*entry), style);
  };
  return (hasBase ? side("base", match.base) : std::string()) + side("old", match.old) +
         side("new", match.latest);
}

std::string sideLines(const ToldClause& clause, const migration::MatchRow& match, bool hasBase,
                      const PageStyle& style) {
  std::string text;
  const auto side = [&](const char* name, bool isThere, const std::string& value) {
    text += isThere ? labelled(4, name, shownClause(value), style) : "";
  };
  side("base", hasBase && match.base != nullptr, clause.base);
  side("old", match.old != nullptr, clause.old);
  side("new", match.latest != nullptr, clause.latest);
  side("merged", clause.isDecided && match.old != nullptr && match.latest != nullptr,
       clause.result);
  return text;
}

std::string clauseLines(const Verdict& row, bool hasBase, const PageStyle& style) {
  std::string text;
  for (const ClauseChange& change : row.clauses) {
    for (const ToldClause& clause : toldClauses(change)) {
      text += paragraph(2,
                        clause.name + (clause.isDecided ? "" : ", to be decided") +
                            (clause.risk == migration::Risk::kNone
                                 ? ""
                                 : " [" + std::string(wordOf(clause.risk)) + "]"),
                        style) +
              sideLines(clause, row.match, hasBase, style);
    }
  }
  return text;
}

// What the result has of a definition after a choice.
std::string resultOf(const Verdict& after) {
  if (after.isCarried()) {
    return wholePrintable(migration::textOf(*after.result));
  }
  return after.isInResult() ? textOf(*after.match.latest) : "nothing: the definition goes";
}

Answer answerFor(const migration::Choice& choice, const Question& question) {
  const migration::MatchRow& match = question.difference->match;
  switch (choice.take) {
    case Take::kOld:
      return {'o', "old",
              match.latest == nullptr ? "keep OLD's, which NEW does not have"
                                      : "take OLD's, in the place of NEW's",
              choice.take};
    case Take::kNew:
      return {'n', "new",
              match.latest == nullptr ? "do as NEW does: the definition goes"
                                      : "take NEW's; what only OLD has of it is lost",
              choice.take};
    case Take::kBase:
      return {'a', "base", "take BASE's, as the old release shipped it", choice.take};
    case Take::kMerged:
      return {'m', "merged", "take both, merged", choice.take};
    default:
      return {'d', "drop", "drop it: neither OLD's nor NEW's stays", choice.take};
  }
}

}  // namespace

std::vector<Answer> answersTo(const Question& question) {
  std::vector<Answer> answers;
  for (const migration::Choice& choice : question.choices) {
    answers.push_back(answerFor(choice, question));
  }
  if (!question.clauses.empty()) {
    answers.push_back({kByClause, "clauses", "decide clause by clause"});
  }
  if (question.mayMove) {
    answers.push_back({kMove, "rename", "keep OLD's beside NEW's, under another name or OID"});
  }
  if (question.mayBeWritten) {
    answers.push_back({kText, "text", "write the definition yourself"});
  }
  answers.push_back({kExplain, "help", "explain", Take::kNothing, true});
  answers.push_back({kSkip, "skip", "leave it undecided", Take::kNothing, true});
  answers.push_back({kBack, "back", "back", Take::kNothing, true});
  answers.push_back({kQuit, "quit", "quit", Take::kNothing, true});
  return answers;
}

std::vector<Answer> answersAbout(const migration::ClauseChoices& clause) {
  std::vector<Answer> answers;
  for (const Take take : clause.takes) {
    switch (take) {
      case Take::kOld:
        answers.push_back({'o', "old", "OLD's", take});
        break;
      case Take::kNew:
        answers.push_back({'n', "new", "NEW's", take});
        break;
      case Take::kBase:
        answers.push_back({'a', "base", "BASE's", take});
        break;
      default:
        answers.push_back({'u', "union", "both: NEW's and what OLD has beside them", take});
    }
  }
  answers.push_back({kExplain, "help", "explain", Take::kNothing, true});
  answers.push_back({kBack, "back", "back", Take::kNothing, true});
  answers.push_back({kQuit, "quit", "quit", Take::kNothing, true});
  return answers;
}

std::string lettersOf(const std::vector<Answer>& answers) {
  std::string text;
  for (const Answer& answer : answers) {
    text += (text.empty() ? "" : " ") + std::string(1, answer.letter);
  }
  return text;
}

std::string questionPage(const std::string& title, const Question& question,
                         const MigrationPlan& plan, const PageStyle& style) {
  const Verdict& row = *question.difference;
  const bool hasBase = plan.base.has_value();
  std::string text =
      "\n" + fitted(bold(title + wholePrintable(describe(row)), style) + "\n", style.width);
  text += paragraph(
      2,
      nameOf(row.change) + (row.isRenamed ? ", renamed" : "") +
          (row.isRenumbered ? ", renumbered" : "") +
          (row.risk == migration::Risk::kNone ? "" : " [" + std::string(wordOf(row.risk)) + "]") +
          ": " + wholePrintable(row.reason),
      style);
  if (row.kind() == migration::Kind::kVendorExtension && row.match.attribute != migration::kNoRow) {
    const Verdict& type = plan.threeWay.differences[row.match.attribute];
    text += paragraph(2, "It belongs to " + wholePrintable(describe(type)) + ".", style);
  }
  text += paragraph(2, wholePrintable(placesOf(row.match)), style) + "\n";
  text += row.clauses.empty() ? wholeSides(row.match, hasBase, style)
                              : clauseLines(row, hasBase, style);
  for (const std::string& note : row.notes) {
    text += paragraph(2, "Note: " + wholePrintable(note), style);
  }
  const std::string depending = dependents("OLD", referrersInOld(row, plan), style) +
                                dependents("NEW", referrersInNew(row, plan), style);
  return text + "\n" +
         (depending.empty() ? paragraph(2, "Nothing refers to it.", style) : depending) + "\n";
}

std::string clausePage(const migration::ClauseChoices& choices, const migration::MatchRow& match,
                       const PageStyle& style) {
  const std::vector<ToldClause> clauses = toldClauses(*choices.change);
  std::string text = "\n";
  for (const ToldClause& clause : clauses) {
    text +=
        paragraph(2, clause.name, style) + sideLines(clause, match, match.base != nullptr, style);
  }
  if (clauses.size() > 1) {
    text += paragraph(2, "The matching rules and SYNTAX are decided together.", style);
  }
  return text + "\n";
}

std::string answerLines(const std::vector<Answer>& answers, const PageStyle& style) {
  std::string text;
  std::string last;  // what goes for every question stands side by side
  std::size_t column = 0;
  for (const Answer& answer : answers) {
    const std::string letter = "  " + bold(std::string(1, answer.letter), style) + "  ";
    if (!answer.isAlwaysThere) {
      text += wrapped(letter, answer.does, style.width);
      continue;
    }
    const std::size_t wide = displayWidth(letter) + displayWidth(answer.does) + 1;
    const bool isBroken = column != 0 && column + wide > style.width;
    last += (isBroken ? "\n" : column == 0 ? "" : " ") + letter + answer.does;
    column = isBroken ? wide : column + wide;
  }
  return text + last + "\n";
}

std::string explanation(const Question& question, const std::string& file, const PageStyle& style) {
  std::string text = "\n" + paragraph(0, "What each choice leaves in the result:", style);
  for (const migration::Choice& choice : question.choices) {
    const Answer answer = answerFor(choice, question);
    text += wrapped("  " + bold(std::string(1, answer.letter), style) + "  ", answer.does + ":",
                    style.width) +
            paragraph(5, resultOf(choice.after), style);
    for (const std::string& note : choice.after.notes) {
      text += paragraph(5, "Note: " + wholePrintable(note), style);
    }
  }
  const auto add = [&](char letter, const char* does) {
    text += wrapped("  " + bold(std::string(1, letter), style) + "  ", does, style.width);
  };
  if (!question.clauses.empty()) {
    add(kByClause,
        "asks for each clause that OLD and NEW do not have alike; the others are merged");
  }
  if (question.mayMove) {
    add(kMove,
        "asks for a name and an OID for OLD's definition; NEW's stays beside it, and whatever of "
        "OLD's refers to it follows");
  }
  if (question.mayBeWritten) {
    add(kText, "asks for the text of the definition, from \"(\" to \")\"");
  }
  text += paragraph(0,
                    "What is decided about an attribute type covers its vendor extension where "
                    "that goes with it. An answer is added to " +
                        wholePrintable(file) +
                        " at once, with the reason if you give one. s leaves this question open "
                        "and goes on; b goes back to the question before, and takes its answer "
                        "out of the file again; q stops, and what was answered is kept. What is "
                        "left open is asked again when the program is started again.",
                    style);
  return text + "\n";
}

std::string clauseExplanation(const migration::ClauseChoices& clause, const PageStyle& style) {
  const ClauseChange& change = *clause.change;
  std::string text =
      "\n" + paragraph(0, "What each choice makes of " + toldNames(change) + ":", style);
  const auto add = [&](const std::string& letter, const Values& values) {
    const std::string value = shownValue(change.aspect, values);
    text += labelled(2, letter, shownClause(value), style);
  };
  for (const Answer& answer : answersAbout(clause)) {
    switch (answer.take) {
      case Take::kOld:
        add("o", change.old);
        break;
      case Take::kNew:
        add("n", change.latest);
        break;
      case Take::kBase:
        add("a", change.base);
        break;
      case Take::kUnion:
        add("u", migration::unionOf(change.old, change.latest));
        break;
      default:
        break;
    }
  }
  if (change.isDecided) {
    add("Enter", change.result);
  }
  return text + "\n";
}
