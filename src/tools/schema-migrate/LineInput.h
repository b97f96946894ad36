// Lines that a person types on standard input, or that another program writes to it.

#ifndef SCHEMA_MIGRATE_LINE_INPUT_H
#define SCHEMA_MIGRATE_LINE_INPUT_H

#include <optional>
#include <string>

class LineInput {
 public:
  // From now on SIGINT, SIGTERM and SIGHUP end the input, and not the program.
  LineInput();

  // The next line without its end; nothing when there is none any more.
  std::optional<std::string> read();

  // Whether a person types on a terminal.
  bool isTerminal() const { return m_isTerminal; }

  // Why there is none: somebody ended it, or the terminal is gone.
  static bool wasInterrupted();
  static bool wasHungUp();

 private:
  bool fill();

  std::string m_buffer;
  bool m_isTerminal;
  bool m_isAtEnd = false;
};

#endif  // SCHEMA_MIGRATE_LINE_INPUT_H
