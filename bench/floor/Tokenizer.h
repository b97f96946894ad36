// The floor program's tokenizer: one walk over the bytes of a file in memory, by a table of what
// each byte may be part of.

#ifndef LIBSCHEMA_BENCH_FLOOR_TOKENIZER_H
#define LIBSCHEMA_BENCH_FLOOR_TOKENIZER_H

#include <cstddef>
#include <cstdint>
#include <memory>
#include <string>
#include <string_view>

namespace minimal {

enum Token : unsigned char {
  kEnd,
  kWord,
  kNumber,
  kNumberLength,
  kNumberBadLength,
  kOpen,
  kClose,
  kOpenBrace,
  kCloseBrace,
  kDollar,
  kEquals,
  kOther,  // any other single character
  kObjectClasses,
  kName,
  kDesc,
  kSup,
  kAuxiliary,
  kMust,
  kMay,
  kStructural,
  kAttributeTypes,
  kEquality,
  kSyntax,
  kSingleValue,
  kUsage,
  kNoUserModification,
  kExtensions,
  kAccessClass,
  kDbName,
  kSubstr,
  kOrdering,
  kCollective,
  kObsolete,
  kAbstract,
  kLength,
  kApprox,
  kReverse,
};

// A set of tokens.
constexpr std::uint64_t bit(Token token) { return std::uint64_t{1} << token; }
template <typename... Tokens>
constexpr std::uint64_t setOf(Tokens... tokens) {
  return (bit(tokens) | ...);
}
constexpr bool isIn(Token token, std::uint64_t set) { return (set >> token & 1) != 0; }

// The bytes of a file, read at once; a zero byte follows them.
struct FileText {
  bool read(const std::string& path);

  std::unique_ptr<char[]> bytes;
  std::size_t size = 0;
};

class Tokenizer {
 public:
  explicit Tokenizer(const FileText& file)
      : m_next(file.bytes.get()), m_end(file.bytes.get() + file.size) {}

  // Reads the next token and returns it.
  Token next();

  Token current() const { return m_token; }
  std::string_view text() const { return m_text; }  // empty for a single character
  int line() const { return m_line; }

 private:
  Token number();
  Token word();

  const char* m_next;
  const char* m_end;
  int m_line = 1;
  Token m_token = kEnd;
  std::string_view m_text;
  std::string m_joined;  // a number whose length stands behind blanks
};

}  // namespace minimal

#endif  // LIBSCHEMA_BENCH_FLOOR_TOKENIZER_H
