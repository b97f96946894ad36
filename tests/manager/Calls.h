// Trace records as the tree of calls that they tell of.

#ifndef LIBSCHEMA_TESTS_CALLS_H
#define LIBSCHEMA_TESTS_CALLS_H

#include <functional>
#include <string>
#include <vector>

#include "TraceRecorder.h"

namespace support {

// The calls in the records of TraceRecorder with all events on, in one line: the names of the
// functions, blank-separated, what a function called in braces behind it, and "=code" when its exit
// record holds a code other than 0:
//   "modifySchema{getAttr delOidFromModSch=32}"
// The functions of a definition are led by its class ("Attribute.dump"); those of the lexical
// analyser are left out, and so are debug records.
std::string callTree(const std::vector<std::string>& records);

// The tree of what `action` calls.
std::string callsOf(const std::function<void()>& action);

// The debug texts, run together, that the functions of the schema manager write in `action`; those
// of the lexical analyser, which tell of the locale, are left out.
std::string messagesOf(const std::function<void()>& action);

}  // namespace support

#endif  // LIBSCHEMA_TESTS_CALLS_H
