// Runs of the built schema-migrate on a pseudo-terminal, as a person has them.

#ifndef LIBSCHEMA_TESTS_TERMINAL_RUN_H
#define LIBSCHEMA_TESTS_TERMINAL_RUN_H

#include <sys/types.h>

#include <functional>
#include <map>
#include <string>
#include <vector>

#include "ToolRun.h"

struct TerminalSettings {
  unsigned short columns = 80;
  // What is set beside TERM=xterm; COLUMNS, NO_COLOR and the locale are unset otherwise.
  std::map<std::string, std::string> environment;
};

class TerminalRun {
 public:
  using Arguments = std::vector<std::string>;

  // Starts the program in the folder with these arguments, "@" standing for it.
  TerminalRun(const ToolFolder& folder, const Arguments& arguments,
              const TerminalSettings& settings = {});
  // Runs `action` in the place of the program; what it returns is the exit code.
  TerminalRun(const ToolFolder& folder, const std::function<int()>& action,
              const TerminalSettings& settings = {});
  TerminalRun(const TerminalRun&) = delete;
  TerminalRun& operator=(const TerminalRun&) = delete;
  ~TerminalRun();

  // Waits until `text` is there, and returns what came since the last call up to its end. Fails the
  // test, and returns what there is, when it does not come.
  std::string until(const std::string& text);

  // What comes until the program ends, and its exit code then.
  std::string rest();
  int exitCode();

  void send(const std::string& bytes) const;
  void type(const std::string& line) const { send(line + "\n"); }
  void resize(unsigned short columns) const;
  void signal(int number) const;
  void hangUp();

 private:
  pid_t start(const TerminalSettings& settings);
  bool read();

  const ToolFolder& m_folder;
  int m_terminal = -1;
  pid_t m_process = -1;
  std::string m_waiting;  // came, and was not returned yet
};

// Text as it stands on the screen in the end: carriage returns carried out, colours and blanks at
// the ends of lines left out.
std::string onScreen(const std::string& bytes);

// The same with every stretch of white space as one blank.
std::string wordsOnScreen(const std::string& bytes);

// The longest line in columns, of ASCII.
std::size_t widestLine(const std::string& screen);

#endif  // LIBSCHEMA_TESTS_TERMINAL_RUN_H
