// The inside of an installation. Internal: not installed.

#ifndef LIBSCHEMA_MIGRATION_INSTALLATION_CONTENT_H
#define LIBSCHEMA_MIGRATION_INSTALLATION_CONTENT_H

#include <cstddef>
#include <cstdint>
#include <mutex>
#include <string>
#include <vector>

#include "Installation.h"
#include "TextIndex.h"

namespace migration {

constexpr std::size_t numberOf(Kind kind) { return static_cast<std::size_t>(kind); }

struct Installation::Content {
  static constexpr std::size_t kKinds = 3;

  // Indexes that few ask for, made at the first question.
  struct Written {
    std::once_flag once;
    std::vector<TextIndex> names{kKinds, TextIndex(TextIndex::Case::kFolded)};
  };
  struct References {
    std::once_flag once;
    std::vector<Reference> all;
    std::vector<TextIndex> byName{kKinds, TextIndex(TextIndex::Case::kFolded)};
  };

  std::string directory;
  std::vector<SchemaFile> files;
  std::vector<std::string> present;
  std::vector<std::string> otherFiles;
  std::vector<Entry> entries;
  std::vector<UnkeptEntry> unkept;
  std::vector<TextIndex> names{kKinds, TextIndex(TextIndex::Case::kFolded)};
  std::vector<std::uint32_t> attributeOf;  // by the number of a vendor extension
  std::vector<TextIndex> oids{kKinds, TextIndex(TextIndex::Case::kExact)};
  Written written;
  References references;

  void addFile(const char* name, std::unique_ptr<Source> source);
  // The texts that schema files have; `sourceOf` makes the source of one, null when it must not be
  // read.
  template <typename Texts, typename SourceOf>
  void addTexts(Texts* texts, const SourceOf& sourceOf);
  void takeDefinitions(const SchemaFile& file);
  void makeIndexes();
  void indexKind(Kind kind);
  void indexAttributes();
  void indexWritten();

  std::vector<const Entry*> entriesAt(const TextIndex& index, std::uint32_t node) const;
};

}  // namespace migration

#endif  // LIBSCHEMA_MIGRATION_INSTALLATION_CONTENT_H
