#include "Console.h"

#include <unistd.h>

#include <cstdio>

#include "Descriptor.h"
#include "Messages.h"

bool Console::write(const std::string& text) {
  return std::fwrite(text.data(), 1, text.size(), stdout) == text.size() &&
         std::fflush(stdout) == 0;
}

void Console::print(const std::string& text) {
  if (!write(text)) {
    throw Failure(kNotWritten, errorLine("the report cannot be written to standard output"));
  }
}

void Console::complain(std::string* text) {
  if (!writeAll(STDERR_FILENO, *text)) {
    throw Failure(kNotWritten, errorLine("a warning cannot be written to standard error"));
  }
  text->clear();
}
