// Decides, call by call, what becomes of some system calls of a program that is run.

#ifndef LIBSCHEMA_TESTS_CALL_WATCH_H
#define LIBSCHEMA_TESTS_CALL_WATCH_H

#include <sys/types.h>

#include <functional>
#include <vector>

class CallWatch {
 public:
  // The calls that are watched, such as SYS_openat.
  explicit CallWatch(std::vector<int> calls);
  ~CallWatch();
  CallWatch(const CallWatch&) = delete;
  CallWatch& operator=(const CallWatch&) = delete;

  // To be called in `prepare`: from now on the calls wait for serve().
  void begin();

  // Serves the program, and the processes that it starts, until it ends. `decide` is given the
  // number of the call, counted from 1 over all that are watched, and which it is; the call does
  // not go on before it returns, and fails with the error that it returns unless that is 0. Returns
  // the number of calls.
  int serve(pid_t process, const std::function<int(int number, int call)>& decide);

 private:
  int takeListener();

  std::vector<int> m_calls;
  int m_ends[2] = {-1, -1};
};

#endif  // LIBSCHEMA_TESTS_CALL_WATCH_H
