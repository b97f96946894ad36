// Commands and what they print, as a document shows them: a line "$ COMMAND", and below it the
// output.

#ifndef LIBSCHEMA_TESTS_TRANSCRIPT_H
#define LIBSCHEMA_TESTS_TRANSCRIPT_H

#include <string>
#include <vector>

#include "ToolRun.h"

// Does in `folder` what the lines show, and compares: "cat FILE" writes the file, schema-migrate is
// run, and "echo $?" tells its exit code, which is 0 where it does not stand. Returns how many runs
// there were.
int replay(const ToolFolder& folder, const std::vector<std::string>& lines);

#endif  // LIBSCHEMA_TESTS_TRANSCRIPT_H
