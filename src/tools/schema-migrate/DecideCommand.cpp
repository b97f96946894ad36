// decide: asks a person about what a plan leaves undecided.

#include <libschema-migration/Questions.h>
#include <unistd.h>

#include <CLI/CLI.hpp>
#include <algorithm>

#include "AnswerFile.h"
#include "Command.h"
#include "CommandLine.h"
#include "Dialogue.h"
#include "DisplayText.h"
#include "Messages.h"
#include "PlanOptions.h"
#include "PlanReport.h"
#include "Terminal.h"

namespace {

constexpr char kDescription[] = "ask about what is undecided, one after another";

constexpr char kFooter[] =
    R"(Works out what plan works out, and asks about each definition that is undecided:
what differs and who changed it, what depends on it, and what can be chosen. Type
a letter and Enter; ? explains the choices. Each answer is added to the decisions
file at once, as an entry like those of plan --template, with its fingerprint; then
what is left to ask is worked out anew, since an answer can settle other questions,
or open some.

FILE need not exist. With several --decisions, the last one gets the answers.
What stood in it is not changed: an entry that is wrong or stale is told, and is to
be mended with an editor before anything is asked. b takes back what was answered
since the program started, one answer after another.

Letters, of which only those that are possible are shown:
  o  take OLD's             c  decide clause by clause
  n  take NEW's             r  keep OLD's under another name or OID
  a  take BASE's            t  write the definition yourself
  m  take both, merged      d  drop it
  ?  explain   s  leave it undecided   b  back   q  quit

q, the end of the input and an interruption keep what was answered. Where standard
input is no terminal, its lines are taken for what would be typed.

Example:
  schema-migrate decide --base /srv/shipped --from /srv/ldap-old/schema \
      --to /srv/ldap-new/schema --decisions decisions.toml

Exit codes:
  0  everything is decided, and the migration can go ahead
  2  the command line is wrong
  3  an input is missing, unreadable, too large or cannot be parsed
  4  something is left undecided, or refused
  5  FILE, or the terminal, cannot be written)";

// The words of a command line in as few lines as the width allows.
std::string commandText(const std::vector<std::string>& words) {
  const std::size_t width = std::min<std::size_t>(terminalWidth(), 80);
  std::string text;
  std::size_t column = 0;
  for (const std::string& word : words) {
    const std::size_t wide = displayWidth(word);
    if (column != 0 && column + 1 + wide + 2 > width) {
      text += " \\\n";
      column = 0;
    }
    const std::string before = text.empty() ? "  " : column == 0 ? "      " : " ";
    text += before + word;
    column += before.size() + wide;
  }
  return text + "\n";
}

class DecideCommand : public Command {
 public:
  CLI::App* declare(CLI::App* program) override {
    CLI::App* const decide = program->add_subcommand("decide", kDescription);
    decide->footer(kFooter);
    m_options.declareInputs(decide);
    m_options.declareDecisions(decide);
    decide->get_option("--decisions")
        ->required()
        ->description(
            "what was decided about definitions; may be given more than once, and the last FILE, "
            "which need not exist, gets the answers");
    return decide;
  }

  int run(Console* console) override {
    m_path = m_options.request.decisions.back();
    const bool isNew = !AnswerFile::isThere(m_path);
    if (isNew) {
      m_options.request.decisions.pop_back();
    }
    std::unique_ptr<migration::MigrationPlan> plan = m_options.makePlan();
    refuseMistaken(*plan);
    if (migration::Questionnaire(*plan).open().empty()) {
      console->print("Nothing is undecided.\n");
      return conclude(*plan, console);
    }
    AnswerFile file(m_path);
    if (isNew) {
      m_options.request.decisions.push_back(m_path);
    }
    refuseToAppend(file, *plan);
    greet(*plan, m_path, console);
    Dialogue dialogue(
        std::move(plan),
        [&] {
          std::unique_ptr<migration::MigrationPlan> anew = m_options.makePlan();
          refuseMistaken(*anew);
          return anew;
        },
        &file, console);
    dialogue.run();
    const std::size_t answered = dialogue.answered();
    if (isNew && answered == 0) {
      m_options.request.decisions.pop_back();
    }
    if (LineInput::wasHungUp()) {
      return dialogue.plan().isReady() ? kDone : kRefused;
    }
    console->print(
        fitted("\n" + counted(answered, "answer") + " written to " + wholePrintable(m_path) + ".\n",
               terminalWidth()));
    return conclude(dialogue.plan(), console);
  }

 private:
  // An answer beside an entry that is wrong would contradict it, or not be heard.
  static void refuseMistaken(const migration::MigrationPlan& plan) {
    if (plan.threeWay.failures.empty()) {
      return;
    }
    std::string lines;
    for (const migration::Failure& failure : plan.threeWay.failures) {
      lines += errorLine(placeOf(failure.file, {failure.line, failure.column}), failure.text);
    }
    throw Failure(kRefused,
                  lines + errorLine("mend or remove these entries first; what they were about is "
                                    "asked then"));
  }

  // A file that is whole by itself may still end in what nothing can follow.
  static void refuseToAppend(const AnswerFile& file, const migration::MigrationPlan& plan) {
    const migration::Questionnaire questionnaire(plan);
    migration::Decision sample = questionnaire.decisionAbout(*questionnaire.open().front());
    sample.take = migration::Take::kNew;
    migration::Failures failures;
    file.readBack(decisionEntry(sample, ""), &failures);
    if (!failures.empty()) {
      throw Failure(kBadInput,
                    errorLine(file.path(), "no [[definition]] can be added at its end (" +
                                               failures.front().text +
                                               "); write its entries as [[definition]] each, or "
                                               "give another file behind it"));
    }
  }

  static void greet(const migration::MigrationPlan& plan, const std::string& path,
                    Console* console) {
    const std::size_t count = migration::Questionnaire(plan).open().size();
    console->print(wrapped("",
                           counted(count, "definition") + (count == 1 ? " has" : " have") +
                               " to be decided. Type a letter and Enter; ? explains the choices, "
                               "and q quits. Each answer is added to " +
                               wholePrintable(path) + " at once.",
                           terminalWidth()));
  }

  // How it stands, and what to do next.
  int conclude(const migration::MigrationPlan& plan, Console* console) const {
    const std::size_t left = migration::Questionnaire(plan).open().size();
    std::string text;
    const char* next = "migrate";
    if (left != 0) {
      text = counted(left, "definition") + (left == 1 ? " is" : " are") + " left undecided.\n";
      next = "decide";
    } else {
      text = "Everything is decided.\n";
    }
    if (!plan.refusals.empty()) {
      text += counted(plan.refusals.size(), "other reason") +
              (plan.refusals.size() == 1 ? " stands" : " stand") +
              " against the migration; plan tells " + (plan.refusals.size() == 1 ? "it" : "them") +
              ".\n";
      next = left != 0 ? next : "plan";
    }
    console->print(fitted(text + (left != 0 ? "To go on:\n" : "Next:\n"), terminalWidth()));
    std::vector<std::string> words = m_options.words();
    words.insert(words.begin(), {"schema-migrate", next});
    if (next == std::string("migrate")) {
      words.emplace_back("--out DIR");
    } else if (next == std::string("decide") &&
               std::find(m_options.request.decisions.begin(), m_options.request.decisions.end(),
                         m_path) == m_options.request.decisions.end()) {
      words.push_back("--decisions " + shellWord(m_path));
    }
    console->print(commandText(words));
    return plan.isReady() ? kDone : kRefused;
  }

  PlanOptions m_options;
  std::string m_path;
};

}  // namespace

std::unique_ptr<Command> makeDecideCommand() { return std::make_unique<DecideCommand>(); }
