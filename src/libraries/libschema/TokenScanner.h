// The shapes of tokens: as they stand in the input stream, character by character, and, for nearly
// every token, as they stand in its buffer. Internal: included by .cpp files only.

#ifndef LIBSCHEMA_TOKEN_SCANNER_H
#define LIBSCHEMA_TOKEN_SCANNER_H

#include <cstring>

#include "ByteClasses.h"
#include "SchemaTokens.h"
#include "StreamInput.h"

namespace libschema {

// ---- Tokens of the stream ----

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

// Reads a number in the buffer, with the blanks after it. One whose length is not complete, or
// stands behind blanks, is left to the stream.
inline BufferedToken numberInBuffer(const char* text, const char* end, int lines) {
  const char* next = endOfRun(text, end, kNumberPart);
  auto size = static_cast<std::size_t>(next - text);
  int code = TOKEN_NUMBER;
  if (next != end && *next == '{') {
    const char* const brace = endOfRun(next + 1, end, kDigit);
    if (brace == end || *brace != '}' || brace == next + 1) {
      return {};
    }
    next = brace + 1;
    size = static_cast<std::size_t>(next - text);
    code = TOKEN_NUMBER_LENGTH;
  } else {
    while (next != end && *next == ' ') {
      ++next;
    }
    if (next != end && *next == '{') {
      return {};
    }
  }
  return {next == end ? nullptr : next, text, size, code, lines};
}

// Reads the token that begins at `next`, as scanToken would. `end` is the end of the buffer.
inline BufferedToken tokenInBuffer(const char* next, const char* end) {
  int lines = 0;
  for (; next != end; ++next) {
    // One blank stands before most tokens.
    if (*next == ' ' && ++next == end) {
      break;
    }
    switch (kStarts[static_cast<unsigned char>(*next)]) {
      case Start::kBlank:
        continue;
      case Start::kNewline:
        ++lines;
        continue;
      case Start::kComment:
        next =
            static_cast<const char*>(std::memchr(next, '\n', static_cast<std::size_t>(end - next)));
        if (next == nullptr) {
          return {};
        }
        ++lines;
        continue;
      case Start::kNumber:
        return numberInBuffer(next, end, lines);
      case Start::kWord: {
        const char* const behind = endOfRun(next + 1, end, kWordPart);
        return {behind == end ? nullptr : behind, next, static_cast<std::size_t>(behind - next),
                TOKEN_NAME, lines};
      }
      case Start::kQuote: {
        const char* const text = next + 1;
        const char* const quote = endOfRun(text, end, kQuotedPart);
        const bool isWhole = quote != end && quote + 1 != end;
        return {isWhole ? quote + 1 : nullptr, text, static_cast<std::size_t>(quote - text),
                TOKEN_NAME, lines};
      }
      case Start::kCharacter:
        return {next + 1, nullptr, 0, *next, lines};
    }
  }
  return {};
}

}  // namespace libschema

#endif  // LIBSCHEMA_TOKEN_SCANNER_H
