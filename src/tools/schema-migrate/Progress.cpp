#include "Progress.h"

#include <libschema-migration/Descriptor.h>
#include <sys/ioctl.h>
#include <sys/time.h>
#include <unistd.h>

#include <array>
#include <atomic>
#include <cerrno>
#include <csignal>
#include <cstddef>
#include <cstdlib>
#include <string_view>

namespace {

std::atomic<const char*> currentStep{nullptr};
std::atomic<bool> isSilent{false};
std::atomic<unsigned> seconds{0};
std::atomic<std::size_t> drawn{0};  // columns of what is there
bool isRunning = false;

// A line as long as the terminal is wide at most; nothing in it needs memory or a lock.
class Line {
 public:
  void add(std::string_view text) {
    for (const char c : text) {
      if (m_length < m_text.size()) {
        m_text[m_length] = c;
        ++m_length;
      }
    }
  }

  void addNumber(unsigned number) {
    if (number >= 10) {
      addNumber(number / 10);
    }
    const char digit = static_cast<char>('0' + number % 10);
    add({&digit, 1});
  }

  void pad(std::size_t length) {
    while (m_length < length && m_length < m_text.size()) {
      add(" ");
    }
  }

  void cut(std::size_t length) { m_length = m_length < length ? m_length : length; }
  std::size_t length() const { return m_length; }
  std::string_view text() const { return {m_text.data(), m_length}; }

 private:
  std::array<char, 120> m_text{};
  std::size_t m_length = 0;
};

std::size_t widthOfTerminal() {
  winsize size{};
  return ::ioctl(STDERR_FILENO, TIOCGWINSZ, &size) == 0 && size.ws_col > 1 ? size.ws_col : 80U;
}

void draw() {
  Line line;
  line.add("schema-migrate: ");
  line.add(currentStep.load());
  line.add(", ");
  line.addNumber(seconds.load());
  line.add(" s");
  line.cut(widthOfTerminal() - 1);
  const std::size_t length = line.length();
  line.pad(drawn.load());
  migration::writeAll(STDERR_FILENO, "\r");
  migration::writeAll(STDERR_FILENO, line.text());
  drawn.store(length);
}

extern "C" void tick(int /*signal*/) {
  const int error = errno;
  ++seconds;
  if (!isSilent.load() && ::tcgetpgrp(STDERR_FILENO) == ::getpgrp()) {
    draw();
  }
  errno = error;
}

bool isWatched() {
  const char* const terminal = std::getenv("TERM");
  return ::isatty(STDERR_FILENO) == 1 && terminal != nullptr &&
         std::string_view(terminal) != "dumb";
}

void setTimer(time_t interval) {
  itimerval timer{};
  timer.it_value.tv_sec = interval;
  timer.it_interval.tv_sec = interval;
  ::setitimer(ITIMER_REAL, &timer, nullptr);
}

}  // namespace

namespace progress {

void step(const char* what) {
  currentStep.store(what);
  if (isRunning || !isWatched()) {
    return;
  }
  isRunning = true;
  seconds.store(0);
  struct sigaction action {};
  action.sa_handler = tick;
  action.sa_flags = SA_RESTART;
  ::sigaction(SIGALRM, &action, nullptr);
  setTimer(1);
}

void end() {
  if (isRunning) {
    setTimer(0);
    isRunning = false;
  }
  erase();
}

void erase() {
  if (const std::size_t length = drawn.exchange(0)) {
    Line blanks;
    blanks.pad(length);
    migration::writeAll(STDERR_FILENO, "\r");
    migration::writeAll(STDERR_FILENO, blanks.text());
    migration::writeAll(STDERR_FILENO, "\r");
  }
}

Silence::Silence() {
  isSilent.store(true);
  erase();
}

Silence::~Silence() { isSilent.store(false); }

}  // namespace progress
