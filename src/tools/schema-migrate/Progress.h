// A line on standard error that tells what a run is doing and for how long, once it takes longer
// than a second. It is drawn only on a terminal, in a process that is in its foreground, and erased
// before anything else is written and at the end.

#ifndef SCHEMA_MIGRATE_PROGRESS_H
#define SCHEMA_MIGRATE_PROGRESS_H

namespace progress {

// From now on this is what is being done, as in "reading OLD". The text must stay.
void step(const char* what);

// Nothing more is drawn, and what is drawn goes.
void end();

// What is drawn goes. To be called from handlers of signals, too.
void erase();

// Nothing is drawn as long as it exists.
class Silence {
 public:
  Silence();
  ~Silence();
  Silence(const Silence&) = delete;
  Silence& operator=(const Silence&) = delete;
};

}  // namespace progress

#endif  // SCHEMA_MIGRATE_PROGRESS_H
