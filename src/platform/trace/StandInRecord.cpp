#include "StandInRecord.h"

#include <unistd.h>

#include <cerrno>
#include <cstdio>

namespace standin {

namespace {

__attribute__((format(printf, 2, 0))) void appendFormatted(std::string* line, const char* format,
                                                           std::va_list arguments) {
  std::va_list again;
  va_copy(again, arguments);
  const int length = std::vsnprintf(nullptr, 0, format, arguments);
  if (length > 0) {
    const std::size_t start = line->size();
    line->resize(start + static_cast<std::size_t>(length) + 1);
    std::vsnprintf(&(*line)[start], static_cast<std::size_t>(length) + 1, format, again);
    line->pop_back();
  }
  va_end(again);
}

}  // namespace

std::string formatted(const char* format, ...) {
  std::string text;
  std::va_list arguments;
  va_start(arguments, format);
  appendFormatted(&text, format, arguments);
  va_end(arguments);
  return text;
}

void writeRecord(const std::string& head, const char* format, std::va_list arguments) {
  std::string record = head;
  appendFormatted(&record, format, arguments);
  writeRecord(record);
}

void writeRecord(const std::string& record) {
  std::string line;
  const std::size_t last = record.find_last_not_of('\n');
  const std::size_t length = last == std::string::npos ? 0 : last + 1;
  line.reserve(length + 1);
  for (std::size_t i = 0; i < length; ++i) {
    if (record[i] == '\n') {
      line += "\\n";
    } else {
      line += record[i];
    }
  }
  line += '\n';
  std::size_t done = 0;
  while (done < line.size()) {
    const ssize_t count = ::write(STDERR_FILENO, line.data() + done, line.size() - done);
    if (count < 0 && errno != EINTR) {
      return;
    }
    done += count > 0 ? static_cast<std::size_t>(count) : 0;
  }
}

}  // namespace standin
