// The server's time stamp, as far as the library uses it.

#ifndef LIBSCHEMA_TIMESTAMP_H
#define LIBSCHEMA_TIMESTAMP_H

#include <string>

// Returns the current local date and time as one line of text, without a line end. The library
// calls it with 1. libschema carries a weak stand-in ("2026-11-21 04:05:06", whatever the
// argument): a program that defines this function itself gets its own called.
std::string getCurrentTimeStamp(int format);

#endif  // LIBSCHEMA_TIMESTAMP_H
