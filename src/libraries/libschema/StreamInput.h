// The input of an analyser: a standard stream over any stream buffer, a file's or another, that
// somebody else may read from between two tokens. Nothing about it is remembered from one token to
// the next. Internal: included by .cpp files only.

#ifndef LIBSCHEMA_STREAM_INPUT_H
#define LIBSCHEMA_STREAM_INPUT_H

#include <fstream>
#include <streambuf>
#include <string>
#include <string_view>
#include <utility>

#include "ByteClasses.h"

namespace libschema {

// The characters of a stream buffer that can be read without asking it for more, through its
// protected members.
struct Window : std::streambuf {
  static const char* begin(const std::streambuf& buffer) { return (buffer.*&Window::gptr)(); }
  static const char* end(const std::streambuf& buffer) { return (buffer.*&Window::egptr)(); }

  // Reading goes on at `place`, which lies between the two.
  static void moveTo(const char* place, std::streambuf* buffer) {
    (buffer->*&Window::setg)((buffer->*&Window::eback)(), const_cast<char*>(place),
                             (buffer->*&Window::egptr)());
  }

  // These bytes are all that there is. They are not written to.
  static void set(const char* bytes, std::size_t size, std::streambuf* buffer) {
    char* const start = const_cast<char*>(bytes);
    (buffer->*&Window::setg)(start, start, start + size);
  }
};

// The buffer that a stream reads from, which need not be the one that a file stream is made with.
inline std::streambuf* bufferOf(const std::ios& stream) { return stream.rdbuf(); }

// The characters of a good stream, one after the other. A read that fails leaves the stream at end
// of file (or, after an input error, bad); every later read fails too. The stream stands behind
// what was read, less what was put back, once the object is gone.
class StreamInput {
 public:
  explicit StreamInput(std::ifstream* input) : m_input(*input), m_buffer(*bufferOf(*input)) {}
  StreamInput(const StreamInput&) = delete;
  StreamInput& operator=(const StreamInput&) = delete;
  ~StreamInput() { giveBack(); }

  // The character read last, and whether a read met the end.
  char current() const { return m_current; }
  bool atEnd() const { return m_input.eof(); }

  // Makes the next character current; false when there is none, and the character stays.
  bool read() {
    if (m_next == m_end && !refill()) {
      return false;
    }
    m_current = *m_next++;
    return true;
  }
  // Gives the current character back, unless the last read failed.
  void putBack() {
    if (m_input.good()) {
      --m_next;
    }
  }
  // Passes over the characters of the class that lie ahead in the window.
  void passRun(ByteClass byteClass) { m_next = endOfRun(m_next, m_end, byteClass); }

  // Passes over characters of the class, the current one included, to the first other one; false
  // when the input ends there.
  bool skipRun(ByteClass byteClass) {
    while (isOf(m_current, byteClass)) {
      passRun(byteClass);
      if (!read()) {
        return false;
      }
    }
    return true;
  }
  // The same, appending them to the text.
  bool takeRun(ByteClass byteClass) {
    while (isOf(m_current, byteClass)) {
      const char* const from = m_next - 1;
      passRun(byteClass);
      m_text.append(from, m_next);
      if (!read()) {
        return false;
      }
    }
    return true;
  }
  // Appends the current character to the text and reads on.
  bool take() {
    m_text += m_current;
    return read();
  }
  // The text gathered so far, which the caller gets.
  std::string takeText() { return std::move(m_text); }

 private:
  void giveBack() {
    if (m_next != m_start) {
      if (m_start == &m_single) {
        m_buffer.sbumpc();
      } else {
        Window::moveTo(m_next, &m_buffer);
      }
    }
    m_start = m_next = m_end = nullptr;
  }

  bool refill() {
    if (!m_input.good()) {
      return false;
    }
    giveBack();
    std::ios_base::iostate failure = std::ios_base::goodbit;
    try {
      const auto character = m_buffer.sgetc();
      if (character == std::char_traits<char>::eof()) {
        failure = std::ios_base::eofbit | std::ios_base::failbit;
      } else {
        takeWindow(std::char_traits<char>::to_char_type(character));
      }
    } catch (...) {
      failure = std::ios_base::badbit;
    }
    if (failure != std::ios_base::goodbit) {
      m_input.setstate(failure);
      return false;
    }
    return true;
  }

  void takeWindow(char next) {
    m_start = m_next = Window::begin(m_buffer);
    m_end = Window::end(m_buffer);
    if (m_next == m_end) {
      // A stream buffer that shows its characters one by one.
      m_single = next;
      m_start = m_next = &m_single;
      m_end = m_start + 1;
    }
  }

  std::ifstream& m_input;
  std::streambuf& m_buffer;
  const char* m_start = nullptr;  // of the window, or of m_single; null at first
  const char* m_next = nullptr;
  const char* m_end = nullptr;
  char m_single = '\0';
  char m_current = '\0';
  std::string m_text;
};

}  // namespace libschema

#endif  // LIBSCHEMA_STREAM_INPUT_H
