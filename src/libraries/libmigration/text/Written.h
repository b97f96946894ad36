// One schema file as it is written: the definitions of RFC 4512 in the containers of a schema file,
// with every clause and value in its order and at its place. Reading goes on after an error at the
// next definition. Everything refers to the bytes of the source, of which at most 4 GiB are read.

#ifndef LIBSCHEMA_MIGRATION_WRITTEN_H
#define LIBSCHEMA_MIGRATION_WRITTEN_H

#include <cstddef>
#include <cstdint>
#include <string>
#include <string_view>
#include <vector>

#include "Definitions.h"
#include "Source.h"

namespace migration {

// A part of a vector that belongs to something else.
template <typename Element>
class Slice {
 public:
  // Of nothing; of `size` elements from `begin` on.
  Slice() = default;
  Slice(const Element* begin, std::size_t size) : m_begin(begin), m_size(size) {}
  // As a vector has them; the index, and a first or last one, must be there.
  const Element* begin() const { return m_begin; }
  const Element* end() const { return m_begin + m_size; }
  std::size_t size() const { return m_size; }
  bool empty() const { return m_size == 0; }
  const Element& operator[](std::size_t index) const { return m_begin[index]; }
  const Element& front() const { return m_begin[0]; }
  const Element& back() const { return m_begin[m_size - 1]; }

 private:
  const Element* m_begin = nullptr;
  std::size_t m_size = 0;
};

// How a value is written.
enum class Form : std::uint8_t { kWord, kNumber, kQuoted, kDoubleQuoted };

// A value as it is written.
struct WrittenValue {
  std::string_view raw;  // without quotes, escapes as they stand
  std::uint32_t offset;  // of the first byte, the quote included
  std::uint32_t end;     // behind the last one, the quote included
  Form form;

  // The value that is meant: \27 and \5c of a quoted one are resolved, and the blanks before the
  // length of a number are left out.
  std::string text() const;
};

// A clause as it is written; WrittenFile has its values.
struct WrittenClause {
  Clause clause;
  bool isList;               // its values stand in parentheses
  std::string_view keyword;  // as written, as in "x-origin"
  std::uint32_t offset;      // of the keyword
  std::uint32_t end;         // behind the last value, or its ")"
  std::uint32_t firstValue;
  std::uint32_t valueCount;
};

// A definition as it is written; WrittenFile has its clauses.
struct WrittenDefinition {
  Kind kind;
  bool isInBlock;
  bool isClosed;                // its own ")" is there
  std::string_view keyword;     // that begins its section, as written
  std::uint32_t section;        // offset of that keyword
  std::uint32_t offset;         // of its "("
  std::uint32_t end;            // behind its ")", or where reading gave it up
  std::uint32_t commentsBegin;  // the comment lines directly above it; empty when begin == end
  std::uint32_t commentsEnd;
  std::uint32_t firstClause;  // the OID is a clause, kOid, without a keyword
  std::uint32_t clauseCount;
};

// Where the text departs from what a schema file is: what reading met, by the sort of mistake.
enum class Oddity : std::uint8_t {
  kByteOrderMark,
  kNul,           // one or several bytes of zero
  kLastWord,      // the file ends directly behind a word, a number or a quoted text
  kByteInQuotes,  // no printable character of ASCII, nor a TAB or a line end
  kLineEndInQuotes,
  kUnclosedQuote,  // the text is taken to end with its line
  kTabBehindWord,  // directly
  kBadLength,      // "{" behind a number or a word, and no number and "}"
  kDoubleQuote,
  kCarriageReturn,    // the first one within a clause, or behind the word that begins a section
  kSpelling,          // a keyword in the wrong letter case, or one edit away
  kTextOutside,       // a run of text outside definitions
  kLoneParenthesis,   // outside definitions
  kStrayParenthesis,  // inside
  kNotClosed,         // a definition
  kDefinitionInDefinition,  // or the word that begins a section directly inside a block
  kNoOpening,               // neither "=" nor "{" behind the word that begins a section
  kNoValue,                 // of the clause that stands there
  kNoName,                  // a number or another token where a name must stand
  kBlockNotClosed           // ends where its "}" is missing at the latest
};

// One place of such a sort.
struct WrittenOddity {
  Oddity oddity;
  std::size_t offset;
  std::size_t end;
};

// The definitions of one source. It refers to the source, which must stay in place.
class WrittenFile {
 public:
  // Reads it. There is no failure: what is wrong with it are oddities.
  explicit WrittenFile(const Source& source);

  // What was read, and the definitions in the order of their places.
  const Source& source() const { return *m_source; }
  const std::vector<WrittenDefinition>& definitions() const { return m_definitions; }

  // In the order of their places.
  const std::vector<WrittenOddity>& oddities() const { return m_oddities; }
  // Of all comments but the line with which the library begins a file: how many lines, and where
  // the first one begins.
  std::size_t commentLines() const { return m_commentLines; }
  std::size_t firstComment() const { return m_firstComment; }
  // Whether there is anything but blanks and comments, and whether a section is opened
  // anywhere, by "=" or "{".
  bool hasText() const { return m_hasText; }
  bool hasSections() const { return m_hasSections; }

  // The clauses of a definition of this file, and the values of a clause, in their order.
  Slice<WrittenClause> clausesOf(const WrittenDefinition& definition) const {
    return {m_clauses.data() + definition.firstClause, definition.clauseCount};
  }
  Slice<WrittenValue> valuesOf(const WrittenClause& clause) const {
    return {m_values.data() + clause.firstValue, clause.valueCount};
  }

  // The first clause of this sort, or null; the text of its first value, or "".
  const WrittenClause* find(const WrittenDefinition& definition, Clause clause) const;
  std::string textOf(const WrittenDefinition& definition, Clause clause) const;
  // The texts of the values of all clauses of this sort.
  std::vector<std::string> textsOf(const WrittenDefinition& definition, Clause clause) const;

  // "attribute type cn (2.5.4.3)", "object class person", "vendor extension 2.5.4.3".
  std::string describe(const WrittenDefinition& definition) const;

 private:
  friend class WrittenParser;

  const Source* m_source;
  std::vector<WrittenDefinition> m_definitions;
  std::vector<WrittenClause> m_clauses;
  std::vector<WrittenValue> m_values;
  std::vector<WrittenOddity> m_oddities;
  std::size_t m_commentLines = 0;
  std::size_t m_firstComment = 0;
  bool m_hasText = false;
  bool m_hasSections = false;
};

}  // namespace migration

#endif  // LIBSCHEMA_MIGRATION_WRITTEN_H
