// How the stand-in for the trace facility writes its records. Internal: not installed.

#ifndef LIBSCHEMA_STAND_IN_RECORD_H
#define LIBSCHEMA_STAND_IN_RECORD_H

#include <cstdarg>
#include <string>

namespace standin {

// The text that printf would write.
std::string formatted(const char* format, ...) __attribute__((format(printf, 1, 2)));

// Writes `record` to standard error as one line: the line ends that close it go, those inside show
// as \n. What cannot be written is dropped.
void writeRecord(const std::string& record);

// The same for `head` with the text behind it that vprintf would write.
void writeRecord(const std::string& head, const char* format, std::va_list arguments)
    __attribute__((format(printf, 2, 0)));

}  // namespace standin

#endif  // LIBSCHEMA_STAND_IN_RECORD_H
