#include "LineInput.h"

#include <poll.h>
#include <unistd.h>

#include <array>
#include <cerrno>
#include <csignal>
#include <cstddef>

#include "Messages.h"

namespace {

constexpr std::array<int, 3> kSignals = {SIGINT, SIGTERM, SIGHUP};
constexpr std::size_t kLongestLine = std::size_t{1} << 20;

volatile std::sig_atomic_t endedBy = 0;

extern "C" void noteEnd(int signal) { endedBy = signal; }

sigset_t withoutHeld() {
  sigset_t open;
  ::sigprocmask(SIG_SETMASK, nullptr, &open);
  for (const int number : kSignals) {
    sigdelset(&open, number);
  }
  return open;
}

// Lets a signal in that came meanwhile.
void lookForSignals() {
  const sigset_t open = withoutHeld();
  sigset_t held;
  ::sigprocmask(SIG_SETMASK, &open, &held);
  ::sigprocmask(SIG_SETMASK, &held, nullptr);
}

// Waits until there is something to read, and tells whether the other end is gone. Signals are held
// back everywhere else, so that none is missed between a look at what they noted and the wait.
bool awaitInput() {
  const sigset_t open = withoutHeld();
  pollfd input{STDIN_FILENO, POLLIN, 0};
  return ::ppoll(&input, 1, nullptr, &open) > 0 &&
         (static_cast<unsigned>(input.revents) & static_cast<unsigned>(POLLHUP)) != 0;
}

}  // namespace

LineInput::LineInput() : m_isTerminal(::isatty(STDIN_FILENO) == 1) {
  struct sigaction action {};
  action.sa_handler = noteEnd;
  sigset_t held;
  sigemptyset(&held);
  for (const int number : kSignals) {
    struct sigaction previous {};
    if (::sigaction(number, nullptr, &previous) == 0 && previous.sa_handler != SIG_IGN) {
      sigaddset(&held, number);
      ::sigaction(number, &action, nullptr);
    }
  }
  ::sigprocmask(SIG_BLOCK, &held, nullptr);
}

bool LineInput::fill() {
  std::array<char, 4096> buffer{};
  while (endedBy == 0) {
    if (awaitInput() && m_isTerminal) {
      endedBy = SIGHUP;
    }
    if (endedBy != 0) {
      return false;
    }
    const ssize_t count = ::read(STDIN_FILENO, buffer.data(), buffer.size());
    if (count < 0 && (errno == EINTR || errno == EAGAIN)) {
      continue;
    }
    if (count <= 0) {
      return false;
    }
    m_buffer.append(buffer.data(), static_cast<std::size_t>(count));
    return true;
  }
  return false;
}

std::optional<std::string> LineInput::read() {
  lookForSignals();
  if (endedBy != 0) {
    return std::nullopt;
  }
  std::size_t end = m_buffer.find('\n');
  while (end == std::string::npos && !m_isAtEnd) {
    if (m_buffer.size() > kLongestLine) {
      throw Failure(kBadInput, errorLine("a line of standard input is longer than 1 MiB"));
    }
    const std::size_t looked = m_buffer.size();
    m_isAtEnd = !fill();
    end = m_buffer.find('\n', looked);
  }
  // A file may lack the last line end; on a terminal a line is typed when Enter is.
  if (end == std::string::npos && (m_buffer.empty() || m_isTerminal || endedBy != 0)) {
    return std::nullopt;
  }
  std::string line = m_buffer.substr(0, end);
  m_buffer.erase(0, end == std::string::npos ? end : end + 1);
  if (!line.empty() && line.back() == '\r') {
    line.pop_back();
  }
  return line;
}

bool LineInput::wasInterrupted() { return endedBy != 0; }
bool LineInput::wasHungUp() { return endedBy == SIGHUP; }
