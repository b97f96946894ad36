#include "TerminalRun.h"

#include <gtest/gtest.h>
#include <poll.h>
#include <pty.h>
#include <sys/ioctl.h>
#include <unistd.h>

#include <algorithm>
#include <array>
#include <cerrno>
#include <chrono>
#include <csignal>
#include <cstdlib>
#include <sstream>
#include <utility>

#include "Files.h"

namespace {

constexpr int kPatience = 60000;  // milliseconds

}  // namespace

TerminalRun::TerminalRun(const ToolFolder& folder, const Arguments& arguments,
                         const TerminalSettings& settings)
    : m_folder(folder) {
  std::vector<std::string> words = {SCHEMA_MIGRATE};
  for (const std::string& argument : arguments) {
    words.push_back(folder.withPath(argument));
  }
  std::vector<char*> pointers;
  for (std::string& word : words) {
    pointers.push_back(word.data());
  }
  pointers.push_back(nullptr);
  if (start(settings) == 0) {
    ::execv(SCHEMA_MIGRATE, pointers.data());
    ::_exit(127);
  }
}

TerminalRun::TerminalRun(const ToolFolder& folder, const std::function<int()>& action,
                         const TerminalSettings& settings)
    : m_folder(folder) {
  if (start(settings) == 0) {
    ::_exit(action());
  }
}

TerminalRun::~TerminalRun() {
  if (m_terminal >= 0) {
    ::close(m_terminal);
  }
  if (m_process > 0) {
    ::kill(m_process, SIGKILL);
    exitCodeOf(m_process);
  }
}

pid_t TerminalRun::start(const TerminalSettings& settings) {
  winsize size{};
  size.ws_row = 24;
  size.ws_col = settings.columns;
  m_process = ::forkpty(&m_terminal, nullptr, nullptr, &size);
  if (m_process == 0) {
    if (::chdir(m_folder.path().c_str()) != 0) {
      ::_exit(126);
    }
    for (const char* const name : {"COLUMNS", "NO_COLOR", "LC_ALL", "LC_CTYPE", "LANG"}) {
      ::unsetenv(name);
    }
    ::setenv("TERM", "xterm", 1);
    ::setenv("LSAN_OPTIONS", "suppressions=" LEAK_SUPPRESSIONS ":print_suppressions=0", 1);
    ::setenv("TMPDIR", m_folder.file(".std-private").c_str(), 1);
    for (const auto& [name, value] : settings.environment) {
      ::setenv(name.c_str(), value.c_str(), 1);
    }
  }
  return m_process;
}

bool TerminalRun::read() {
  pollfd waiting{m_terminal, POLLIN, 0};
  if (m_terminal < 0 || ::poll(&waiting, 1, kPatience) <= 0) {
    return false;
  }
  std::array<char, 4096> buffer{};
  const ssize_t count = ::read(m_terminal, buffer.data(), buffer.size());
  if (count <= 0) {
    return false;  // a terminal whose last user is gone has an error of its own
  }
  m_waiting.append(buffer.data(), static_cast<std::size_t>(count));
  return true;
}

std::string TerminalRun::until(const std::string& text) {
  std::size_t at = 0;
  while ((at = m_waiting.find(text)) == std::string::npos) {
    if (!read()) {
      ADD_FAILURE() << "\"" << text << "\" did not come, but:\n" << onScreen(m_waiting);
      at = m_waiting.size();
      break;
    }
  }
  const std::string result = m_waiting.substr(0, at + text.size());
  m_waiting.erase(0, at + text.size());
  return m_folder.withoutPath(result);
}

std::string TerminalRun::rest() {
  while (read()) {
  }
  return m_folder.withoutPath(std::exchange(m_waiting, ""));
}

int TerminalRun::exitCode() { return exitCodeOf(std::exchange(m_process, -1)); }

void TerminalRun::send(const std::string& bytes) const {
  EXPECT_EQ(static_cast<ssize_t>(bytes.size()), ::write(m_terminal, bytes.data(), bytes.size()));
}

void TerminalRun::resize(unsigned short columns) const {
  winsize size{};
  size.ws_row = 24;
  size.ws_col = columns;
  EXPECT_EQ(0, ::ioctl(m_terminal, TIOCSWINSZ, &size));
}

void TerminalRun::signal(int number) const { EXPECT_EQ(0, ::kill(m_process, number)); }

void TerminalRun::hangUp() {
  ::close(m_terminal);
  m_terminal = -1;
}

std::string onScreen(const std::string& bytes) {
  std::string screen;
  std::string line;
  std::size_t column = 0;
  const auto end = [&] {
    line.erase(line.find_last_not_of(' ') + 1);
    screen += line;
    line.clear();
    column = 0;
  };
  for (std::size_t at = 0; at < bytes.size(); ++at) {
    if (bytes[at] == '\n') {
      end();
      screen += '\n';
    } else if (bytes[at] == '\r') {
      column = 0;
    } else if (bytes[at] == '\x1b') {
      at = std::min(bytes.find('m', at), bytes.size());
    } else {
      line.resize(std::max(line.size(), column + 1), ' ');
      line[column] = bytes[at];
      ++column;
    }
  }
  end();
  return screen;
}

std::string wordsOnScreen(const std::string& bytes) {
  std::istringstream words(onScreen(bytes));
  std::string text;
  for (std::string word; words >> word;) {
    text += (text.empty() ? "" : " ") + word;
  }
  return text;
}

std::size_t widestLine(const std::string& screen) {
  std::size_t widest = 0;
  for (const std::string& line : support::splitLines(screen)) {
    widest = std::max(widest, line.size());
  }
  return widest;
}
