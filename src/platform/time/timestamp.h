// The server's time stamp, as far as the library uses it. libschema-platform holds a stand-in; a
// server's own function is found first, by the rules that ldtr.h gives for the trace facility.

#ifndef LIBSCHEMA_TIMESTAMP_H
#define LIBSCHEMA_TIMESTAMP_H

#include <string>

// Visible to libschema also where a server compiles its definition with -fvisibility=hidden.
#pragma GCC visibility push(default)

// Returns the current local date and time as one line of text, without a line end. The library
// calls it with 1. The stand-in's text is "2026-11-21 04:05:06", whatever the argument.
std::string getCurrentTimeStamp(int format);

#pragma GCC visibility pop

#endif  // LIBSCHEMA_TIMESTAMP_H
