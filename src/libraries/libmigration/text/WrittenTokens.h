// The tokens of a schema's text as a person writes them: words, numbers, texts in quotes, and the
// characters that hold a definition together. What is odd about one is noted where it stands.

#ifndef LIBSCHEMA_MIGRATION_WRITTEN_TOKENS_H
#define LIBSCHEMA_MIGRATION_WRITTEN_TOKENS_H

#include <cstddef>
#include <string_view>
#include <vector>

#include "Written.h"

namespace migration {

struct WrittenToken {
  enum Sort : unsigned char {
    kEnd,
    kWord,
    kNumber,  // with its length, if it has one
    kQuoted,
    kDoubleQuoted,
    kCharacter  // one of ( ) $ = { } , ;
  };
  Sort sort = kEnd;
  bool hasLength = false;    // of a number
  std::string_view raw;      // without quotes
  std::size_t offset = 0;    // of the first byte, the quote included
  std::size_t end = 0;       // behind the last one, the quote included
  std::size_t carriage = 0;  // of the first carriage return before it, or kNone
  static constexpr std::size_t kNone = ~std::size_t{0};

  bool is(char c) const { return sort == kCharacter && raw[0] == c; }
  bool isValue() const { return sort != kEnd && sort != kCharacter; }
};

class WrittenScanner {
 public:
  // Notes oddities in *oddities, unless it is null.
  WrittenScanner(std::string_view bytes, std::vector<WrittenOddity>* oddities);

  WrittenToken next();

  // The token behind the one that next() returned last. Nothing is noted.
  WrittenToken peek() const;

  // For a copy that looks ahead.
  void beSilent() { m_oddities = nullptr; }

  // The comment lines directly above a token; an empty range when there are none.
  void commentsAbove(std::size_t offset, std::size_t* begin, std::size_t* end) const;
  std::size_t commentLines() const { return m_commentLines; }
  std::size_t firstComment() const { return m_firstComment; }

 private:
  std::size_t passBlanks();
  void passComment();
  WrittenToken readNumber();
  WrittenToken readWord(std::size_t begin);
  WrittenToken readQuoted();
  WrittenToken readDoubleQuoted();
  void readLength(WrittenToken* token, bool mayBeGood);
  std::size_t endOfQuoted(std::size_t begin, bool* isClosed) const;
  bool holdsSection(std::string_view text) const;
  void noteInQuotes(std::string_view text, std::size_t offset);
  void note(Oddity oddity, std::size_t offset, std::size_t end);
  void noteTabBehind(std::size_t begin, std::size_t end);
  WrittenToken token(WrittenToken::Sort sort, std::size_t begin, std::size_t end) const;

  std::string_view m_bytes;
  std::vector<WrittenOddity>* m_oddities;
  std::size_t m_next = 0;
  std::size_t m_gluedEnd = WrittenToken::kNone;  // behind the TABs of the last glued word
  std::size_t m_commentsBegin = 0;               // of the last comment lines in a row
  std::size_t m_commentsEnd = 0;
  std::size_t m_commentLines = 0;
  std::size_t m_firstComment = 0;
};

}  // namespace migration

#endif  // LIBSCHEMA_MIGRATION_WRITTEN_TOKENS_H
