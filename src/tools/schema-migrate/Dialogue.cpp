#include "Dialogue.h"

#include <libschema-migration/ToldClauses.h>
#include <libschema-migration/Utf8.h>

#include <algorithm>
#include <utility>

#include "DisplayText.h"
#include "Messages.h"
#include "Progress.h"
#include "Terminal.h"

namespace {

using migration::Decision;
using migration::MigrationPlan;
using migration::Question;
using migration::Questionnaire;
using migration::Verdict;

std::string outcomeOf(const MigrationPlan& plan, const std::string& place) {
  for (const Verdict& row : plan.threeWay.differences) {
    if (row.decision == place) {
      return " -> " + std::string(wordOf(row.outcome));
    }
  }
  return "";
}

std::string withoutBlanks(const std::string& line) {
  const std::size_t begin = line.find_first_not_of(" \t");
  return begin == std::string::npos ? ""
                                    : line.substr(begin, line.find_last_not_of(" \t") - begin + 1);
}

}  // namespace

Dialogue::Dialogue(std::unique_ptr<MigrationPlan> plan, MakePlan makePlan, AnswerFile* file,
                   Console* console)
    : m_plan(std::move(plan)),
      m_makePlan(std::move(makePlan)),
      m_file(*file),
      m_console(*console) {}

void Dialogue::run() {
  while (true) {
    const Questionnaire questionnaire(*m_plan);
    const Verdict* const open = nextOf(questionnaire);
    if (open == nullptr) {
      return;
    }
    m_last = keyOf(*open);
    switch (ask(questionnaire, *open)) {
      case Next::kEnd:
        return;
      case Next::kGoBack:
        goBack();
        break;
      case Next::kAskAgain:
        m_again = m_last;
        break;
      case Next::kGoOn:
        break;
    }
  }
}

// ---- Which question ----

Dialogue::Key Dialogue::keyOf(const Verdict& open) {
  return std::string(wordOf(open.kind())) + " " + describe(open);
}

// In the plan's order from the one behind the last, and then from the first.
const Verdict* Dialogue::nextOf(const Questionnaire& questionnaire) {
  const std::vector<const Verdict*>& open = questionnaire.open();
  const auto isKey = [](const Key& key) {
    return [&key](const Verdict* row) { return keyOf(*row) == key; };
  };
  if (const std::optional<Key> again = std::exchange(m_again, std::nullopt)) {
    const auto found = std::find_if(open.begin(), open.end(), isKey(*again));
    if (found != open.end()) {
      return *found;
    }
  }
  const auto& all = m_plan->threeWay.differences;
  const auto last = std::find_if(all.begin(), all.end(),
                                 [&](const Verdict& row) { return keyOf(row) == m_last; });
  const Verdict* const behind = last == all.end() ? nullptr : &*last;
  const Verdict* first = nullptr;
  for (const Verdict* const row : open) {
    if (m_left.count(keyOf(*row)) != 0) {
      continue;
    }
    if (behind == nullptr || row > behind) {
      return row;
    }
    first = first == nullptr ? row : first;
  }
  return first;
}

std::map<Dialogue::Key, std::string> Dialogue::openOnes() const {
  std::map<Key, std::string> open;
  const Questionnaire questionnaire(*m_plan);
  for (const Verdict* const row : questionnaire.open()) {
    open.emplace(keyOf(*row), describe(*row));
  }
  return open;
}

std::set<std::string> Dialogue::doubts() const {
  std::set<std::string> texts;
  for (std::size_t i = m_plan->inputRefusalCount; i < m_plan->refusals.size(); ++i) {
    texts.insert(m_plan->refusals[i].text);
  }
  return texts;
}

// ---- Asking ----

PageStyle Dialogue::style() { return {isColourWanted(), terminalWidth()}; }

void Dialogue::tell(const std::string& text) { m_console.print(fitted(text, style().width)); }

std::optional<std::string> Dialogue::lineAfter(const std::string& prompt) {
  m_console.print(prompt);
  std::optional<std::string> line = m_input.read();
  if (!line && !LineInput::wasHungUp()) {
    m_console.print("\n");
  } else if (line && !m_input.isTerminal()) {
    m_console.print(wholePrintable(*line) + "\n");  // nothing else shows what was typed
  }
  return line;
}

const Answer* Dialogue::chosen(const std::vector<Answer>& answers, const std::string& line) {
  const std::string word = migration::folded(withoutBlanks(line));
  for (const Answer& answer : answers) {
    if (word == std::string(1, answer.letter) || word == answer.word) {
      return &answer;
    }
  }
  tell((word.empty() ? "Type" : "\"" + printable(line) + "\" is none of the choices; type") +
       " one of these letters: " + lettersOf(answers) + "\n");
  return nullptr;
}

Dialogue::Next Dialogue::ask(const Questionnaire& questionnaire, const Verdict& open) {
  const Question question = questionnaire.about(open);
  const std::vector<Answer> answers = answersTo(question);
  const std::size_t number = m_asked.size() + 1;
  std::size_t total = m_asked.size();
  for (const Verdict* const row : questionnaire.open()) {
    total += m_left.count(keyOf(*row)) == 0 ? 1 : 0;
  }
  const std::string title =
      "Question " + std::to_string(number) + " of " + std::to_string(total) + ": ";
  m_console.print(questionPage(title, question, *m_plan, style()) + answerLines(answers, style()));
  while (true) {
    const std::optional<std::string> line = lineAfter("Your choice: ");
    if (!line) {
      return Next::kEnd;
    }
    const Answer* const answered = chosen(answers, *line);
    if (answered == nullptr) {
      continue;
    }
    if (answered->letter == kExplain) {
      m_console.print(explanation(question, m_file.path(), style()) +
                      answerLines(answers, style()));
      continue;
    }
    if (answered->letter == kBack && m_asked.empty()) {
      tell("This is the first question; what the file held before is for an editor.\n");
      continue;
    }
    const Next next = answer(question, *answered, questionnaire.decisionAbout(open));
    if (next != Next::kAskAgain) {
      return next;
    }
    if (!m_again.has_value()) {
      m_console.print("\n" + answerLines(answers, style()));
      continue;
    }
    return next;
  }
}

Dialogue::Next Dialogue::answer(const Question& question, const Answer& chosen, Decision decision) {
  const Verdict& open = *question.difference;
  Next next = Next::kGoOn;
  switch (chosen.letter) {
    case kQuit:
      return Next::kEnd;
    case kBack:
      return Next::kGoBack;
    case kSkip:
      m_left.insert(keyOf(open));
      m_asked.push_back({keyOf(open), false});
      return Next::kGoOn;
    case kByClause:
      next = askClauses(question, &decision);
      break;
    case kMove:
      next = askMove(question, &decision);
      break;
    case kText:
      next = askText(&decision);
      break;
    default:
      decision.take = chosen.take;
  }
  if (next == Next::kGoOn) {
    next = askReason(&decision);
  }
  return next == Next::kGoOn ? settle(open, decision) : next;
}

Dialogue::Next Dialogue::askClauses(const Question& question, Decision* decision) {
  for (std::size_t at = 0; at < question.clauses.size();) {
    const migration::ClauseChoices& clause = question.clauses[at];
    const std::vector<migration::ToldClause> told = toldClauses(*clause.change);
    const std::vector<Answer> answers = answersAbout(clause);
    const bool mayStay = clause.change->isDecided;
    m_console.print(clausePage(clause, question.difference->match, style()) +
                    answerLines(answers, style()));
    const Answer* answered = nullptr;
    while (answered == nullptr) {
      const std::optional<std::string> line =
          lineAfter(toldNames(*clause.change) + (mayStay ? " (Enter for merged): " : ": "));
      if (!line) {
        return Next::kEnd;
      }
      if (mayStay && withoutBlanks(*line).empty()) {
        break;
      }
      answered = chosen(answers, *line);
      if (answered != nullptr && answered->letter == kExplain) {
        m_console.print(clauseExplanation(clause, style()) + answerLines(answers, style()));
        answered = nullptr;
      }
    }
    if (answered != nullptr && answered->letter == kQuit) {
      return Next::kEnd;
    }
    for (const migration::ToldClause& each : told) {
      decision->clauses.erase(each.name);
    }
    if (answered != nullptr && answered->letter == kBack) {
      if (at == 0) {
        return Next::kAskAgain;
      }
      --at;
      continue;
    }
    if (answered != nullptr) {
      for (const migration::ToldClause& each : told) {
        decision->clauses[each.name] = answered->take;
      }
    }
    ++at;
  }
  if (decision->clauses.empty()) {
    tell("Nothing was chosen.\n");
    return Next::kAskAgain;
  }
  return Next::kGoOn;
}

Dialogue::Next Dialogue::askMove(const Question& question, Decision* decision) {
  const migration::Content old = contentOf(*question.difference->match.old->kept);
  const migration::Values names = old.names();
  const std::string name = names.empty() ? "" : names.front();
  const std::optional<std::string> newName =
      lineAfter("Its name beside NEW's (Enter to keep \"" + wholePrintable(name) + "\"): ");
  const std::optional<std::string> newOid =
      newName
          ? lineAfter("Its OID beside NEW's (Enter to keep " + wholePrintable(old.oid()) + "): ")
          : std::nullopt;
  if (!newOid) {
    return Next::kEnd;
  }
  decision->rename = withoutBlanks(*newName);
  decision->renumber = withoutBlanks(*newOid);
  if (decision->rename.empty() && decision->renumber.empty()) {
    tell("Nothing was chosen.\n");
    return Next::kAskAgain;
  }
  return Next::kGoOn;
}

Dialogue::Next Dialogue::askText(Decision* decision) {
  tell("Its text from \"(\" to \")\", in as many lines as you like; an empty line ends it.\n");
  while (const std::optional<std::string> line = lineAfter("> ")) {
    const std::string part = withoutBlanks(*line);
    if (!part.empty()) {
      decision->text += (decision->text.empty() ? "" : " ") + part;
      continue;
    }
    if (decision->text.empty()) {
      tell("Nothing was written.\n");
      return Next::kAskAgain;
    }
    if (!migration::isUtf8(decision->text)) {
      tell("That is not UTF-8, and no decisions file can hold it.\n");
      return Next::kAskAgain;
    }
    return Next::kGoOn;
  }
  return Next::kEnd;
}

Dialogue::Next Dialogue::askReason(Decision* decision) {
  while (true) {
    const std::optional<std::string> line = lineAfter("Reason (Enter for none): ");
    if (!line) {
      // Who ends the input here has chosen already; who interrupts the program has not.
      return LineInput::wasInterrupted() ? Next::kEnd : Next::kGoOn;
    }
    if (migration::isUtf8(*line)) {
      decision->reason = withoutBlanks(*line);
      return Next::kGoOn;
    }
    tell("That is not UTF-8, and no decisions file can hold it.\n");
  }
}

// ---- Answers ----

void Dialogue::decideAnew(std::vector<Decision> decisions) {
  progress::step("working out what follows");
  migration::decideAnew(std::move(decisions), m_plan.get());
  progress::end();
}

void Dialogue::readAnew() {
  tell("\n");
  m_console.print(wrapped(
      "",
      wholePrintable(m_file.path()) +
          " was changed by somebody else meanwhile. It is read again; nothing was added to it, and "
          "what was answered before cannot be taken back here any more.",
      style().width));
  m_file.reopen();
  m_plan = m_makePlan();
  m_asked.clear();
}

Dialogue::Next Dialogue::settle(const Verdict& open, const Decision& decision) {
  const Key key = keyOf(open);
  const std::string about = describe(open);
  const std::string entry = decisionEntry(decision, about);
  m_again = key;
  if (!m_file.isUnchanged()) {
    readAnew();
    return Next::kAskAgain;
  }
  migration::Failures failures;
  Decision read = m_file.readBack(entry, &failures);
  const std::string place = read.file + ":" + std::to_string(read.line);
  const std::map<Key, std::string> before = openOnes();
  const std::set<std::string> doubted = doubts();
  const std::vector<Decision> decisions = m_plan->request.decisions;
  if (failures.empty()) {
    std::vector<Decision> more = decisions;
    more.push_back(std::move(read));
    decideAnew(std::move(more));
    failures = m_plan->threeWay.failures;
    if (failures.empty() && openOnes().count(key) != 0) {
      failures.push_back({"", 0, 0, "", "it would still be undecided"});
    }
    if (!failures.empty()) {
      decideAnew(decisions);
    }
  }
  if (!failures.empty()) {
    std::string text = "\nThat cannot be done, and nothing was written:\n";
    for (const migration::Failure& failure : failures) {
      text += "  " + wholePrintable(failure.text) + "\n";
    }
    tell(text);
    return Next::kAskAgain;
  }
  m_file.append(entry);
  ++m_answered;
  m_again.reset();
  m_asked.push_back({key, true});
  m_left.erase(key);
  tell("\nWritten to " + wholePrintable(m_file.path()) + ": " + wholePrintable(about) +
       outcomeOf(*m_plan, place) + "\n");
  tellEffect(before, doubted, key);
  return Next::kGoOn;
}

void Dialogue::tellEffect(const std::map<Key, std::string>& before,
                          const std::set<std::string>& doubted, const Key& key) {
  const std::map<Key, std::string> after = openOnes();
  std::string text;
  for (const auto& [other, name] : before) {
    if (other != key && after.count(other) == 0) {
      text += "This also settles " + wholePrintable(name) + ".\n";
    }
  }
  for (const auto& [other, name] : after) {
    if (before.count(other) == 0) {
      text += "This opens a question about " + wholePrintable(name) + ".\n";
    }
  }
  for (const std::string& doubt : doubts()) {
    if (doubted.count(doubt) == 0) {
      text += "As it stands, the result would be refused: " + wholePrintable(doubt) + "\n";
    }
  }
  tell(text);
}

void Dialogue::goBack() {
  if (!m_file.isUnchanged()) {
    readAnew();
    return;
  }
  const Asked last = m_asked.back();
  m_asked.pop_back();
  m_again = last.key;
  m_left.erase(last.key);
  if (last.isAnswered) {
    m_file.takeBack();
    --m_answered;
    std::vector<Decision> decisions = m_plan->request.decisions;
    decisions.pop_back();
    decideAnew(std::move(decisions));
    tell("\nTaken out of " + wholePrintable(m_file.path()) + " again.\n");
  }
}
