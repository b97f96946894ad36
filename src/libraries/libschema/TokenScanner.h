// The shapes of tokens: as they stand in the input stream, character by character, and, for nearly
// every token, as they stand in its buffer. Internal: included by .cpp files only.

#ifndef LIBSCHEMA_TOKEN_SCANNER_H
#define LIBSCHEMA_TOKEN_SCANNER_H

#include <array>
#include <cstring>
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

// What a token that begins with a byte is, where the byte is not passed over.
enum class Start : unsigned char { kCharacter, kBlank, kNewline, kComment, kNumber, kWord, kQuote };

constexpr std::array<Start, 256> classifyStarts() {
  std::array<Start, 256> starts{};
  for (std::size_t c = 0; c < 256; ++c) {
    const unsigned char classes = kByteClasses[c];
    starts[c] = c == '\''                     ? Start::kQuote
                : c == '\n'                   ? Start::kNewline
                : c == '#'                    ? Start::kComment
                : (classes & kBlank) != 0     ? Start::kBlank
                : (classes & kDigit) != 0     ? Start::kNumber
                : (classes & kWordStart) != 0 ? Start::kWord
                                              : Start::kCharacter;
  }
  return starts;
}

constexpr std::array<Start, 256> kStarts = classifyStarts();

// The protected members of a stream buffer, by name.
struct BufferAccess : std::streambuf {
  static const char* next(const std::streambuf& buffer) { return (buffer.*&BufferAccess::gptr)(); }
  static char* end(const std::streambuf& buffer) { return (buffer.*&BufferAccess::egptr)(); }
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

// ---- The stream ----

// The stream, character by character. A read that fails leaves the stream at end of file (or,
// after an input error, bad); every later read fails too. The stream stands behind what was read
// once the object is gone.
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

  // The character read last, and whether a read met the end.
  char current() const { return m_current; }
  bool atEnd() const { return m_input->eof(); }

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
    if (m_input->good()) {
      --m_next;
    }
  }
  // Passes over the characters of the class that lie ahead in the buffer.
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
      append(from);
      if (!read()) {
        return false;
      }
    }
    return true;
  }
  // Appends the current character to the text and reads on.
  bool take() {
    append(m_next - 1);
    return read();
  }
  // The text gathered so far; whether it is a piece of the stream's buffer.
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
inline int scanNumber(StreamInput* input) {
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
inline int scanWord(StreamInput* input) {
  if (input->current() == '\'') {
    input->read();
    input->takeRun(kQuotedPart);
    input->read();
  } else {
    input->takeRun(kWordPart);
  }
  return TOKEN_NAME;
}

// Reads one token of the stream, counts the lines before it, and puts back the character that ends
// it.
inline Scanned scanToken(StreamInput* input, int* lineNumber, int* code) {
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

// ---- Tokens in the buffer ----

// A token that lies in the buffer as a whole; a text with the character after it, too.
struct BufferedToken {
  const char* next;  // behind the token; null when it is not such a one, and no other member holds
  const char* text;  // where its text begins; null when it is a character
  std::size_t size;
  int code;
  int lines;  // how many end before it
};

// The first place from `place` on that is not of the class. A zero byte, which is of none but
// kCommentPart, stands behind the buffer.
inline const char* endOfRunAtZero(const char* place, ByteClass byteClass) {
  while (isOf(*place, byteClass)) {
    ++place;
  }
  return place;
}

// Reads a number in the buffer, with the blanks after it. One whose length is not complete, or
// stands behind blanks, is left to the stream.
inline BufferedToken numberInBuffer(const char* text, const char* end, int lines) {
  const char* next = endOfRunAtZero(text, kNumberPart);
  auto size = static_cast<std::size_t>(next - text);
  int code = TOKEN_NUMBER;
  if (*next == '{') {
    const char* const brace = endOfRunAtZero(next + 1, kDigit);
    if (*brace != '}' || brace == next + 1) {
      return {};
    }
    next = brace + 1;
    size = static_cast<std::size_t>(next - text);
    code = TOKEN_NUMBER_LENGTH;
  } else {
    while (*next == ' ') {
      ++next;
    }
    if (*next == '{') {
      return {};
    }
  }
  return {next == end ? nullptr : next, text, size, code, lines};
}

// Reads the token that begins at `next`, as scanToken would. `end` is the end of the buffer, behind
// which a zero byte stands.
inline BufferedToken tokenInBuffer(const char* next, const char* end) {
  for (int lines = 0;; ++next) {
    // One blank stands before most tokens.
    next += *next == ' ' ? 1 : 0;
    switch (kStarts[static_cast<unsigned char>(*next)]) {
      case Start::kBlank:
        continue;
      case Start::kNewline:
        ++lines;
        continue;
      case Start::kComment: {
        next =
            static_cast<const char*>(std::memchr(next, '\n', static_cast<std::size_t>(end - next)));
        if (next == nullptr) {
          return {};
        }
        ++lines;
        continue;
      }
      case Start::kNumber:
        return numberInBuffer(next, end, lines);
      case Start::kWord: {
        const char* const behind = endOfRunAtZero(next, kWordPart);
        return {behind == end ? nullptr : behind, next, static_cast<std::size_t>(behind - next),
                TOKEN_NAME, lines};
      }
      case Start::kQuote: {
        const char* const text = next + 1;
        const char* const quote = endOfRunAtZero(text, kQuotedPart);
        const bool isWhole = quote != end && quote + 1 != end;
        return {isWhole ? quote + 1 : nullptr, text, static_cast<std::size_t>(quote - text),
                TOKEN_NAME, lines};
      }
      case Start::kCharacter:
        return {next == end ? nullptr : next + 1, nullptr, 0, *next, lines};
    }
  }
}

}  // namespace libschema

#endif  // LIBSCHEMA_TOKEN_SCANNER_H
