// The shapes of clauses that the three kinds of definition share, read and written. What a kind
// accepts is written at the call. Internal: included by .cpp files only.

#ifndef LIBSCHEMA_CLAUSE_SHAPES_H
#define LIBSCHEMA_CLAUSE_SHAPES_H

#include <cstddef>
#include <cstring>
#include <fstream>
#include <initializer_list>
#include <set>
#include <string>
#include <string_view>
#include <vector>

#include "SchemaLexan.h"

namespace libschema {

using TokenSet = std::initializer_list<int>;

inline bool isOneOf(int token, TokenSet tokens) {
  for (const int candidate : tokens) {
    if (candidate == token) {
      return true;
    }
  }
  return false;
}

// ---- Reading. Each function that reads on returns the token it stopped at. ----

// The text of the token just read; empty when it has none.
std::string textOf(SchemaLexan* lexer);

// Reads the token after a keyword and, when it is of an accepted kind, takes its text as the
// value; a token of another kind is dropped. Returns the token behind it.
int readValue(SchemaLexan* lexer, TokenSet accepted, std::string* value);

// Reads a list whose "(" is behind the lexer, from the current token on: members with or without
// "$" between them, up to and including the ")". The keywords "objectclasses" and
// "attributetypes" are members, since the attribute types objectClasses and attributeTypes lex as
// those.
int readList(SchemaLexan* lexer, std::vector<std::string>* list);

// One turn of a loop that is left only over a PlacedLexan. It reads a volatile object, so that an
// optimizer may not assume that the loop ends.
void spin(const SchemaLexan* lexer);

// Adds names to a list unless an equal one is there. Looks up in order once the list is long, so
// that K names cost no K * K comparisons.
class DistinctNames {
 public:
  explicit DistinctNames(std::vector<std::string>* names);
  void add(std::string name);

 private:
  struct ByName {
    const std::vector<std::string>* names;
    bool operator()(std::size_t left, std::size_t right) const {
      return (*names)[left] < (*names)[right];
    }
  };

  bool isNew(const std::string& name) const;

  std::vector<std::string>* m_names;
  std::set<std::size_t, ByName> m_index;  // positions in *m_names; empty while the list is short
};

// ---- Writing ----

// A line that grows at the end of a text. Its room is made at once, so that the pieces are only
// copied;
// what is left over goes with the object.
class Line {
 public:
  Line(std::string* text, std::size_t room) : m_text(*text) {
    const std::size_t start = text->size();
    text->resize(start + room);
    m_place = text->data() + start;
  }
  Line(const Line&) = delete;
  Line& operator=(const Line&) = delete;
  ~Line() { m_text.resize(static_cast<std::size_t>(m_place - m_text.data())); }

  Line& add(std::string_view piece) {
    std::memcpy(m_place, piece.data(), piece.size());
    m_place += piece.size();
    return *this;
  }
  Line& addIf(bool condition, std::string_view piece) { return condition ? add(piece) : *this; }

  // `keyword`, the value and `behind`, unless the value is empty.
  Line& addValue(std::string_view keyword, const std::string& value,
                 std::string_view behind = " ") {
    return value.empty() ? *this : add(keyword).add(value).add(behind);
  }

  // Each value as 'value' and a blank.
  Line& addQuoted(const std::vector<std::string>& values) {
    for (const std::string& value : values) {
      add("'").add(value).add("' ");
    }
    return *this;
  }

  // The values, joined by `separator`.
  Line& addJoined(const std::vector<std::string>& values, std::string_view separator) {
    bool isFirst = true;
    for (const std::string& value : values) {
      addIf(!isFirst, separator).add(value);
      isFirst = false;
    }
    return *this;
  }

  // The room that a list takes, in whichever of these shapes.
  static std::size_t roomOf(const std::vector<std::string>& values) {
    std::size_t room = 0;
    for (const std::string& value : values) {
      room += value.size() + 3;
    }
    return room;
  }

 private:
  std::string& m_text;
  char* m_place;
};

// Appends each value and a blank; or the values joined by `separator`.
void appendSpaced(const std::vector<std::string>& values, std::string* text);
void appendJoined(const std::vector<std::string>& values, std::string_view separator,
                  std::string* text);

// Writes the line of a definition and flushes the stream.
void writeLine(const std::string& line, std::ofstream& out);

// The entry of a collision report.
std::string reportEntry(const std::string& oid, const std::vector<std::string>& names);

inline const char* yesOrNo(bool flag) { return flag ? "YES" : "NO"; }

}  // namespace libschema

#endif  // LIBSCHEMA_CLAUSE_SHAPES_H
