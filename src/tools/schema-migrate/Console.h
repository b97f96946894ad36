// The standard streams, as a command writes to them.

#ifndef SCHEMA_MIGRATE_CONSOLE_H
#define SCHEMA_MIGRATE_CONSOLE_H

#include <string>

// Lines as they go to standard error: on a terminal, none is wider than it.
std::string asComplaint(const std::string& lines);

class Console {
 public:
  // To standard output. False when it cannot be written.
  bool write(const std::string& text);
  // The same; ends the run when it cannot be written.
  void print(const std::string& text);
  // The same of a text for people: on a terminal, no line is wider than it.
  void printText(const std::string& text);

  // To standard error, and *text is empty then. What nobody gets to read must not be passed over:
  // ends the run when it cannot be written.
  void complain(std::string* text);
};

#endif  // SCHEMA_MIGRATE_CONSOLE_H
