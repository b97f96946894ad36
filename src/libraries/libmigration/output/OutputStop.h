// How what makes an output ends early: thrown below the functions that a host calls, and told by
// them as failures.

#ifndef LIBSCHEMA_MIGRATION_OUTPUT_STOP_H
#define LIBSCHEMA_MIGRATION_OUTPUT_STOP_H

#include <cerrno>
#include <string>
#include <system_error>

#include "Finding.h"

namespace migration {

struct OutputStop {
  Failure failure;
  bool isOfRequest = false;  // something else has to be asked for
};

[[noreturn]] inline void stopOutput(const std::string& path, const std::string& text) {
  throw OutputStop{{path, 0, 0, "", text}};
}

inline std::string textOfError(int error) { return std::generic_category().message(error); }

// With the reason in errno.
[[noreturn]] inline void stopOutputOfSystem(const std::string& path, const std::string& text) {
  const int error = errno;
  stopOutput(path, text + ": " + textOfError(error));
}

// Calls it. Returns false, with the failure in *failures, when it has been stopped.
template <typename Work>
bool runToEnd(const Work& work, Failures* failures) {
  try {
    work();
    return true;
  } catch (const OutputStop& stop) {
    failures->push_back(stop.failure);
    return false;
  }
}

}  // namespace migration

#endif  // LIBSCHEMA_MIGRATION_OUTPUT_STOP_H
