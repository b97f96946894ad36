// What differs between a file as it is written and the same file as libschema's reader keeps it:
// definition by definition, matched by their places, field by field, letter for letter.

#ifndef LIBSCHEMA_MIGRATION_DIFFERENCES_H
#define LIBSCHEMA_MIGRATION_DIFFERENCES_H

#include <cstddef>
#include <cstdint>
#include <string>
#include <vector>

#include "Definitions.h"
#include "Kept.h"
#include "Written.h"

namespace migration {

// A place where the two readings differ.
struct Difference {
  // What differs.
  enum Sort : std::uint8_t {
    kField,  // a clause, or a value of it, is kept as another one or not at all
    kLost,   // a definition is not kept
    kMade,   // a definition is kept that is not written
    kEnds    // the reader fails, or does not come back
  };
  static constexpr std::uint32_t kNone = ~std::uint32_t{0};

  Sort sort;
  Clause clause;             // of a field
  std::uint32_t definition;  // the one that is written; kNone when there is none
  std::size_t offset;        // where it shows
  std::size_t begin;         // what is written of it; empty where nothing is
  std::size_t end;
  std::string reads;  // both as messages have them
  std::string kept;
};

class Differences {
 public:
  // Both readings must be of the same source, and stay in place.
  Differences(const WrittenFile& written, const KeptFile& kept);

  // In the order of their places.
  const std::vector<Difference>& all() const { return m_differences; }

  // The definition that is kept of the one that is written; null when there is none.
  const KeptDefinition* keptOf(std::size_t definition) const;

  // Whether the reader begins the definition where it is written to begin, whatever was before.
  bool beginsAlike(std::size_t definition) const { return m_beginsAlike[definition]; }

  // Whether the reader failed, or did not come back, before it saw the byte at `offset`.
  bool isUnread(std::size_t offset) const;

 private:
  void match();
  void compare(std::size_t definition);
  void add(Difference difference) { m_differences.push_back(std::move(difference)); }

  const WrittenFile& m_written;
  const KeptFile& m_kept;
  std::vector<std::uint32_t> m_keptOf;
  std::vector<bool> m_beginsAlike;
  std::vector<Difference> m_differences;
};

// Whether the value is kept as this text: letter for letter, but for the blanks before a length and
// the spellings of the three words that the reader folds, which are no difference here.
bool isKeptAs(const WrittenValue& value, const std::string& kept);

// A text as messages show it: on one line, other bytes as `\xNN`, long ones cut short, in quotes.
std::string quotedForMessage(std::string_view text);

}  // namespace migration

#endif  // LIBSCHEMA_MIGRATION_DIFFERENCES_H
