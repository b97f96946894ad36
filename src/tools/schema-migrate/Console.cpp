#include "Console.h"

#include <libschema-migration/Descriptor.h>
#include <unistd.h>

#include <cstdio>

#include "DisplayText.h"
#include "Messages.h"
#include "Progress.h"
#include "Terminal.h"

std::string asComplaint(const std::string& lines) {
  return ::isatty(STDERR_FILENO) == 1 ? fitted(lines, terminalWidth()) : lines;
}

bool Console::write(const std::string& text) {
  const progress::Silence silence;
  return std::fwrite(text.data(), 1, text.size(), stdout) == text.size() &&
         std::fflush(stdout) == 0;
}

void Console::print(const std::string& text) {
  if (!write(text)) {
    throw Failure(kNotWritten, errorLine("the report cannot be written to standard output"));
  }
}

void Console::printText(const std::string& text) { print(fitted(text, longestLine())); }

void Console::complain(std::string* text) {
  const progress::Silence silence;
  if (!migration::writeAll(STDERR_FILENO, asComplaint(*text))) {
    throw Failure(kNotWritten, errorLine("a warning cannot be written to standard error"));
  }
  text->clear();
}
