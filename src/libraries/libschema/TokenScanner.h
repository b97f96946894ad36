// The shapes of tokens, character by character, over the buffer of the input stream. Internal:
// included by .cpp files only.

#ifndef LIBSCHEMA_TOKEN_SCANNER_H
#define LIBSCHEMA_TOKEN_SCANNER_H

#include <array>
#include <fstream>
#include <streambuf>
#include <string>
#include <string_view>

#include "CSymbolTable.h"
#include "SchemaTokens.h"

namespace libschema {

// What a byte may be part of, in the "C" locale. Bytes of 128 and more are of no class but the
// last.
enum ByteClass : unsigned char {
  kDigit = 1,        // 0 to 9
  kNumberPart = 2,   // a digit or "."
  kWordStart = 4,    // a letter, "'" or "-"
  kWordPart = 8,     // a letter, a digit, "_", "-" or a TAB
  kQuotedPart = 16,  // what a word takes, a blank, and any punctuation but "'"
  kBlank = 32,       // a blank or a TAB
  kCommentPart = 64  // anything but a newline
};

constexpr std::array<unsigned char, 256> classifyBytes() {
  std::array<unsigned char, 256> classes{};
  for (int c = 0; c < 256; ++c) {
    const bool digit = c >= '0' && c <= '9';
    const bool letter = (c >= 'A' && c <= 'Z') || (c >= 'a' && c <= 'z');
    const bool punctuation = c > ' ' && c < 127 && !digit && !letter;
    const bool word = letter || digit || c == '_' || c == '-' || c == '\t';
    classes[static_cast<std::size_t>(c)] = static_cast<unsigned char>(
        (digit ? kDigit : 0) | (digit || c == '.' ? kNumberPart : 0) |
        (letter || c == '\'' || c == '-' ? kWordStart : 0) | (word ? kWordPart : 0) |
        (word || c == ' ' || (punctuation && c != '\'') ? kQuotedPart : 0) |
        (c == ' ' || c == '\t' ? kBlank : 0) | (c != '\n' ? kCommentPart : 0));
  }
  return classes;
}

constexpr std::array<unsigned char, 256> kByteClasses = classifyBytes();

inline bool isOf(char c, ByteClass byteClass) {
  return (kByteClasses[static_cast<unsigned char>(c)] & byteClass) != 0;
}

// The protected members of a stream buffer, by name.
struct BufferAccess : std::streambuf {
  static const char* next(const std::streambuf& buffer) { return (buffer.*&BufferAccess::gptr)(); }
  static const char* end(const std::streambuf& buffer) { return (buffer.*&BufferAccess::egptr)(); }
  static void advance(std::streambuf* buffer, int count) { (buffer->*&BufferAccess::gbump)(count); }
};

// The first place from `place` on, or `end`, that is not of the class.
inline const char* endOfRun(const char* place, const char* end, ByteClass byteClass) {
  // Four at a time: most of the time of a long file is spent here.
  for (; end - place >= 4; place += 4) {
    if (!isOf(place[0], byteClass)) {
      return place;
    }
    if (!isOf(place[1], byteClass)) {
      return place + 1;
    }
    if (!isOf(place[2], byteClass)) {
      return place + 2;
    }
    if (!isOf(place[3], byteClass)) {
      return place + 3;
    }
  }
  while (place != end && isOf(*place, byteClass)) {
    ++place;
  }
  return place;
}

// ---- Two kinds of input, for scanToken ----
//
//   read()        makes the next character current; false when there is none, and the character
//   stays current()     the character read last atEnd()       whether a read met the end
//   putBack()     gives the current character back, unless the last read failed
//   passRun(k)    passes over the characters of class k that lie ahead in the buffer
//   skipRun(k)    passes over characters of class k, the current one included, to the first other
//   one;
//                 false when the input ends there
//   takeRun(k)    the same, appending them to the text
//   take()        appends the current character to the text and reads on
//   text()        the text gathered so far

// What lies in the stream's buffer already. A token that needs more, or whose text is not in one
// piece, makes it short: then nothing is to be used, and the stream is still where it was.
class BufferedInput {
 public:
  explicit BufferedInput(const std::streambuf& buffer)
      : m_start(BufferAccess::next(buffer)), m_next(m_start), m_end(BufferAccess::end(buffer)) {}

  bool isShort() const { return m_isShort; }
  void advance(std::streambuf* buffer) const {
    BufferAccess::advance(buffer, static_cast<int>(m_next - m_start));
  }

  char current() const { return m_current; }
  bool atEnd() const { return m_isShort; }
  bool read() {
    if (m_next == m_end) {
      m_isShort = true;
      return false;
    }
    m_current = *m_next++;
    return true;
  }
  void putBack() { --m_next; }
  void passRun(ByteClass byteClass) { m_next = endOfRun(m_next, m_end, byteClass); }
  bool skipRun(ByteClass byteClass) {
    if (isOf(m_current, byteClass)) {
      passRun(byteClass);
      return read();
    }
    return true;
  }
  bool takeRun(ByteClass byteClass) {
    if (!isOf(m_current, byteClass)) {
      return true;
    }
    const char* const from = m_next - 1;
    passRun(byteClass);
    return append(from) && read();
  }
  bool take() { return append(m_next - 1) && read(); }
  std::string_view text() const { return m_text; }

 private:
  bool append(const char* from) {
    const auto count = static_cast<std::size_t>(m_next - from);
    if (m_text.empty()) {
      m_text = std::string_view(from, count);
    } else if (m_text.data() + m_text.size() == from) {
      m_text = std::string_view(m_text.data(), m_text.size() + count);
    } else {
      m_isShort = true;
    }
    return !m_isShort;
  }

  const char* m_start;
  const char* m_next;
  const char* m_end;
  std::string_view m_text;
  char m_current = '\0';
  bool m_isShort = false;
};

// The stream itself. A read that fails leaves the stream at end of file (or, after an input
// error, bad); every later read fails too. The stream stands behind what was read once the object
// is gone.
class StreamInput {
 public:
  // Before the buffer is filled anew, `table` is told to keep what it borrows from it.
  StreamInput(std::ifstream* input, CSymbolTable* table)
      : m_input(input), m_buffer(input->rdbuf()), m_table(table) {
    if (m_input->good()) {
      takeWindow();
    }
  }
  StreamInput(const StreamInput&) = delete;
  StreamInput& operator=(const StreamInput&) = delete;
  ~StreamInput() { giveBack(); }

  char current() const { return m_current; }
  bool atEnd() const { return m_input->eof(); }
  bool read() {
    if (m_next == m_end && !refill()) {
      return false;
    }
    m_current = *m_next++;
    return true;
  }
  void putBack() {
    if (m_input->good()) {
      --m_next;
    }
  }
  void passRun(ByteClass byteClass) { m_next = endOfRun(m_next, m_end, byteClass); }
  bool skipRun(ByteClass byteClass) {
    while (isOf(m_current, byteClass)) {
      passRun(byteClass);
      if (!read()) {
        return false;
      }
    }
    return true;
  }
  bool takeRun(ByteClass byteClass) {
    while (isOf(m_current, byteClass)) {
      const char* const from = m_next - 1;
      passRun(byteClass);
      append(from);
      if (!read()) {
        return false;
      }
    }
    return true;
  }
  bool take() {
    append(m_next - 1);
    return read();
  }
  std::string_view text() const { return m_isKept ? std::string_view(m_kept) : m_text; }
  bool isTextInBuffer() const { return !m_isKept; }

 private:
  void takeWindow() {
    m_start = m_next = BufferAccess::next(*m_buffer);
    m_end = BufferAccess::end(*m_buffer);
  }

  void giveBack() {
    BufferAccess::advance(m_buffer, static_cast<int>(m_next - m_start));
    m_start = m_next = m_end = nullptr;
  }

  bool refill() {
    if (!m_input->good()) {
      return false;
    }
    m_table->keepBorrowed();
    keepText();
    giveBack();
    try {
      if (m_buffer->sgetc() == std::char_traits<char>::eof()) {
        m_input->setstate(std::ios_base::eofbit | std::ios_base::failbit);
        return false;
      }
    } catch (...) {
      m_input->setstate(std::ios_base::badbit);
      return false;
    }
    takeWindow();
    return true;
  }

  // The text is a piece of the buffer as long as it is in one piece there, and a copy from then
  // on.
  void append(const char* from) {
    const auto count = static_cast<std::size_t>(m_next - from);
    if (!m_isKept && m_text.empty()) {
      m_text = std::string_view(from, count);
    } else if (!m_isKept && m_text.data() + m_text.size() == from) {
      m_text = std::string_view(m_text.data(), m_text.size() + count);
    } else {
      keepText();
      m_kept.append(from, count);
    }
  }

  void keepText() {
    if (!m_isKept) {
      m_kept.assign(m_text);
      m_isKept = true;
    }
  }

  std::ifstream* m_input;
  std::streambuf* m_buffer;
  CSymbolTable* m_table;
  const char* m_start = nullptr;
  const char* m_next = nullptr;
  const char* m_end = nullptr;
  char m_current = '\0';
  bool m_isKept = false;
  std::string_view m_text;
  std::string m_kept;
};

// ---- Tokens ----

enum class Scanned {
  kText,       // a word, a quoted string or a number; the code is TOKEN_NAME or TOKEN_NUMBER…
  kCharacter,  // any other character; the code is its (signed) value
  kEndBetweenTokens,  // the input ended where a token could begin
  kEndWithinToken     // the input ended right behind a word or number, which is lost
};

// Reads a number from its first digit on; leaves the character after it current. Returns the
// code.
template <typename Input>
int scanNumber(Input* input) {
  input->takeRun(kNumberPart);
  while (input->current() == ' ' && input->read()) {
  }
  if (input->atEnd() || input->current() != '{') {
    return TOKEN_NUMBER;
  }
  input->take();
  if (!isOf(input->current(), kDigit)) {
    return TOKEN_NUMBER_BAD_LENGTH;
  }
  input->takeRun(kDigit);
  if (input->current() != '}') {
    return TOKEN_NUMBER_BAD_LENGTH;
  }
  input->take();
  return TOKEN_NUMBER_LENGTH;
}

// Reads a word or a quoted string; leaves the character after it current. Whatever ends a quoted
// string, its closing quote or not, is dropped, and a newline dropped so is not counted.
template <typename Input>
int scanWord(Input* input) {
  if (input->current() == '\'') {
    input->read();
    input->takeRun(kQuotedPart);
    input->read();
  } else {
    input->takeRun(kWordPart);
  }
  return TOKEN_NAME;
}

// Reads one token, counts the lines before it, and puts back the character that ends it.
template <typename Input>
Scanned scanToken(Input* input, int* lineNumber, int* code) {
  for (;;) {
    if (!input->read()) {
      return Scanned::kEndBetweenTokens;
    }
    const char c = input->current();
    if (isOf(c, kBlank)) {
      input->passRun(kBlank);
    } else if (c == '\n') {
      ++*lineNumber;
    } else if (c == '#') {
      // The end of the file ends the last comment and counts as its line end.
      input->skipRun(kCommentPart);
      ++*lineNumber;
    } else if (isOf(c, kDigit) || isOf(c, kWordStart)) {
      *code = isOf(c, kDigit) ? scanNumber(input) : scanWord(input);
      if (input->atEnd()) {
        return Scanned::kEndWithinToken;
      }
      input->putBack();
      return Scanned::kText;
    } else {
      *code = c;
      return Scanned::kCharacter;
    }
  }
}

}  // namespace libschema

#endif  // LIBSCHEMA_TOKEN_SCANNER_H
