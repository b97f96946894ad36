// What the rules about texts and definitions say before it is judged: each mistake with what it can
// have changed in the kept reading. Internal.

#ifndef LIBSCHEMA_MIGRATION_MISTAKES_H
#define LIBSCHEMA_MIGRATION_MISTAKES_H

#include <cstddef>
#include <cstdint>
#include <string>
#include <vector>

#include "Differences.h"
#include "Written.h"

namespace migration {

struct Mistake {
  enum Reach : std::uint8_t {
    kFields,  // these fields of its definition
    kOnward   // everything behind it, up to where the reader begins a definition as it is written
  };
  enum Judged : std::uint8_t {
    kByDifference,  // an error where the readings differ, else a warning
    kError,
    kWarning,
    kOnlyWithDifference  // an error where they differ, else nothing
  };

  const char* rule = "";
  std::size_t offset = 0;
  std::size_t from = 0;                          // where its reach begins
  std::size_t resumes = 0;                       // where it begins once more; 0 for nowhere
  std::uint32_t definition = Difference::kNone;  // the one that it stands in
  Reach reach = kOnward;
  std::uint32_t fields = 0;  // bits of the clauses
  Judged judged = kByDifference;
  std::string text;
  bool isUnclosedQuote = false;
  bool differs = false;
};

using Mistakes = std::vector<Mistake>;

constexpr std::uint32_t fieldOf(Clause clause) {
  return std::uint32_t{1} << static_cast<unsigned>(clause);
}

// A file as both readings have it, for the rules.
struct BothReadings {
  const WrittenFile& written;
  const Differences& differences;

  // The definition with the byte at `offset`, the word that begins its section included.
  std::uint32_t definitionAt(std::size_t offset) const;
};

// Each family adds its mistakes, in any order.
void findTextMistakes(const BothReadings& file, Mistakes* mistakes);
void findDefinitionMistakes(const BothReadings& file, Mistakes* mistakes);

}  // namespace migration

#endif  // LIBSCHEMA_MIGRATION_MISTAKES_H
