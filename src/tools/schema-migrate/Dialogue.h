// The questions that a plan leaves open, put to a person one after another, and the answers in a
// decisions file.

#ifndef SCHEMA_MIGRATE_DIALOGUE_H
#define SCHEMA_MIGRATE_DIALOGUE_H

#include <libschema-migration/MigrationPlan.h>
#include <libschema-migration/Questions.h>

#include <cstddef>
#include <functional>
#include <map>
#include <memory>
#include <optional>
#include <set>
#include <string>
#include <vector>

#include "AnswerFile.h"
#include "Console.h"
#include "LineInput.h"
#include "QuestionPage.h"

class Dialogue {
 public:
  // `makePlan` reads the inputs, the decisions among them, and throws a Failure when that cannot be
  // done; it is called again when somebody else has changed the file.
  using MakePlan = std::function<std::unique_ptr<migration::MigrationPlan>()>;
  Dialogue(std::unique_ptr<migration::MigrationPlan> plan, MakePlan makePlan, AnswerFile* file,
           Console* console);

  // Asks until everything is answered, or the person or the input ends it.
  void run();

  // As it stands with what was answered.
  const migration::MigrationPlan& plan() const { return *m_plan; }
  std::size_t answered() const { return m_answered; }

 private:
  enum class Next { kGoOn, kAskAgain, kGoBack, kEnd };

  // By kind and by what it is called.
  using Key = std::string;
  struct Asked {
    Key key;
    bool isAnswered;  // or left open
  };

  Next ask(const migration::Questionnaire& questionnaire, const migration::Verdict& open);
  Next answer(const migration::Question& question, const Answer& chosen,
              migration::Decision decision);
  Next askClauses(const migration::Question& question, migration::Decision* decision);
  Next askMove(const migration::Question& question, migration::Decision* decision);
  Next askText(migration::Decision* decision);
  Next askReason(migration::Decision* decision);

  // Tries the decision, and adds it to the file when the plan carries it out.
  Next settle(const migration::Verdict& open, const migration::Decision& decision);
  void tellEffect(const std::map<Key, std::string>& before, const std::set<std::string>& doubts,
                  const Key& key);
  void goBack();
  void readAnew();
  void decideAnew(std::vector<migration::Decision> decisions);

  const migration::Verdict* nextOf(const migration::Questionnaire& questionnaire);
  static Key keyOf(const migration::Verdict& open);
  std::map<Key, std::string> openOnes() const;
  std::set<std::string> doubts() const;

  // The next line behind a prompt; nothing at the end of the input.
  std::optional<std::string> lineAfter(const std::string& prompt);
  const Answer* chosen(const std::vector<Answer>& answers, const std::string& line);
  void tell(const std::string& text);
  static PageStyle style();

  std::unique_ptr<migration::MigrationPlan> m_plan;
  MakePlan m_makePlan;
  AnswerFile& m_file;
  Console& m_console;
  LineInput m_input;
  std::vector<Asked> m_asked;
  std::size_t m_answered = 0;
  std::set<Key> m_left;        // open, and not to be asked again
  Key m_last;                  // asked last; the next one comes behind it
  std::optional<Key> m_again;  // to be asked next, whatever the order
};

#endif  // SCHEMA_MIGRATE_DIALOGUE_H
