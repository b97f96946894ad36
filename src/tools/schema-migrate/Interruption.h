// What happens when the program is told to stop (SIGINT, SIGTERM, SIGHUP): what it has written so
// far is removed, and it ends with the code for a run that wrote nothing.

#ifndef SCHEMA_MIGRATE_INTERRUPTION_H
#define SCHEMA_MIGRATE_INTERRUPTION_H

#include <csignal>
#include <string>

namespace interruption {

// From now on an interruption ends the program so.
void install();

// Schema files in `directory`, and the directory itself, are removed at an interruption; "" for
// none.
void setUnfinished(const std::string& directory);

// From now on an interruption just ends the program, as it does to every other.
void uninstall();

// Holds interruptions back for as long as it lives.
class Hold {
 public:
  Hold();
  ~Hold();
  Hold(const Hold&) = delete;
  Hold& operator=(const Hold&) = delete;

 private:
  sigset_t m_previous;
};

}  // namespace interruption

#endif  // SCHEMA_MIGRATE_INTERRUPTION_H
