// The bytes of one file, read once, and the places in them. Everything that is read from it refers
// to its bytes: a source stays in place, unchanged, as long as anything refers to it.

#ifndef LIBSCHEMA_MIGRATION_SOURCE_H
#define LIBSCHEMA_MIGRATION_SOURCE_H

#include <cstddef>
#include <cstdint>
#include <string>
#include <string_view>
#include <vector>

namespace migration {

// A place in a file: line and column count from 1, columns in bytes.
struct Place {
  std::uint64_t line = 1;
  std::uint64_t column = 1;
};

// Whether it is the same line and column.
inline bool operator==(const Place& left, const Place& right) {
  return left.line == right.line && left.column == right.column;
}

class Source {
 public:
  // `path` is the name that messages show, `bytes` the whole content. No file is touched.
  Source(std::string path, std::string bytes);

  // Over bytes that belong to the caller, and stay in place, unchanged, for as long as the source.
  struct Borrowed {
    std::string_view bytes;
  };
  // As the other; the bytes are not copied.
  Source(std::string path, Borrowed borrowed);

  Source(const Source&) = delete;
  Source& operator=(const Source&) = delete;

  // As they were given.
  const std::string& path() const { return m_path; }
  std::string_view bytes() const { return m_bytes; }

  // The place of the byte at `offset`; the place behind the last byte for an offset that is larger.
  Place placeOf(std::size_t offset) const;

  // The line that holds the byte at `offset`, without its line end.
  std::string_view lineAt(std::size_t offset) const;

  // The line of this number, from 1, without its line end; empty when there is none.
  std::string_view line(std::uint64_t number) const;

 private:
  void divide();

  std::string m_path;
  std::string m_owned;
  std::string_view m_bytes;
  // Where each stretch of bytes begins: a file of line ends alone must not take more room than its
  // bytes do.
  struct Stretch {
    std::uint64_t line;     // the number of the line
    std::size_t lineStart;  // where that line begins
  };
  void count(std::size_t from, std::size_t to, Stretch* stretch) const;
  std::vector<Stretch> m_stretches;
};

}  // namespace migration

#endif  // LIBSCHEMA_MIGRATION_SOURCE_H
