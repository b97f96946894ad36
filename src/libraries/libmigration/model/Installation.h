// The schema of one installation: the nine V3.* files of a directory in both readings, and indexes
// over what they define. Nothing is changed by it; two threads may use different installations, and
// read the same one.

#ifndef LIBSCHEMA_MIGRATION_INSTALLATION_H
#define LIBSCHEMA_MIGRATION_INSTALLATION_H

#include <array>
#include <cstddef>
#include <cstdint>
#include <functional>
#include <memory>
#include <string>
#include <string_view>
#include <vector>

#include "Finding.h"
#include "InputFiles.h"
#include "Kept.h"
#include "Written.h"

namespace migration {

// In the order in which an installation is read: the first definition under a key counts.
constexpr std::array<const char*, 9> kSchemaFiles = {
    "V3.modifiedschema", "V3.system.at", "V3.system.oc", "V3.orv.at",   "V3.orv.oc",
    "V3.user.at",        "V3.user.oc",   "V3.config.at", "V3.config.oc"};

// The place of a file in kSchemaFiles; their number for a name that is none of them.
std::size_t schemaFileNumber(std::string_view name);

// A file in both readings.
struct SchemaFile {
  std::string name;   // "V3.user.at"
  unsigned mode = 0;  // its permissions; 0 in memory
  std::unique_ptr<Source> source;
  std::unique_ptr<WrittenFile> written;
  std::unique_ptr<KeptFile> kept;
};

// A definition as an installation has it. It lies in its file, and goes with the installation.
struct Entry {
  const SchemaFile* file = nullptr;
  const KeptDefinition* kept = nullptr;
  const WrittenDefinition* written = nullptr;  // of the same text; null when there is none

  // Its kind, and the place of its "(".
  Kind kind() const { return kept->kind; }
  Place place() const { return file->source->placeOf(kept->offset); }
};

// A definition that is written and that the library's reading does not have.
struct UnkeptEntry {
  const SchemaFile* file;
  const WrittenDefinition* written;
};

// A name in SUP, MUST or MAY. It refers to the installation, and goes with it.
struct Reference {
  const SchemaFile* file = nullptr;
  const Entry* from = nullptr;                 // the definition with the clause; null when the
  const WrittenDefinition* written = nullptr;  // library does not keep it; one of the two is there
  Clause clause = Clause::kSup;
  Kind target = Kind::kAttributeType;  // what is named: an attribute type or an object class
  std::string_view name;               // as written
  std::size_t offset = 0;              // of the name

  // The place of the name.
  Place place() const { return file->source->placeOf(offset); }
};

// The content of a file by its name, for an installation that lies in memory.
struct NamedText {
  std::string name;
  std::string bytes;
  unsigned mode = 0;  // of the file, where it has one
};

class Installation {
 public:
  // Reads the files of `directory`. What cannot be read is a failure, and the rest is read all the
  // same. No file is opened but the nine; each is opened once and read once.
  static Installation fromDirectory(const std::string& directory, const ReadLimits& limits,
                                    Failures* failures);
  // The same from texts; `directory` only names it.
  static Installation fromTexts(const std::string& directory, std::vector<NamedText> texts,
                                const ReadLimits& limits, Failures* failures);
  // The same over texts that stay in place, unchanged, for as long as the installation: they are
  // not copied.
  static Installation overTexts(const std::string& directory, const std::vector<NamedText>& texts);
  Installation(Installation&&) noexcept;
  Installation& operator=(Installation&&) noexcept;
  ~Installation();

  // As it was given.
  const std::string& directory() const;
  // Of all files together.
  std::uint64_t size() const;
  // Those that are there, in the order of kSchemaFiles; null for one that is not.
  const std::vector<SchemaFile>& files() const;
  const SchemaFile* file(std::string_view name) const;
  // Whether the file is there, though it may be that it could not be read.
  bool hasFile(std::string_view name) const;
  // Names in the directory that begin with "V3." in any letter case and are none of the nine.
  const std::vector<std::string>& otherFiles() const;

  // Every definition that is kept and entered, in the order of reading; those that are written and
  // not among them, in the same order.
  const std::vector<Entry>& entries() const;
  const std::vector<UnkeptEntry>& unkept() const;

  // The definition that counts in the library's tables: by lower-cased first name (vendor
  // extensions have none), by OID letter for letter. Null when there is none.
  const Entry* byFirstName(Kind kind, std::string_view lowerName) const;
  const Entry* byOid(Kind kind, std::string_view oid) const;

  // The attribute type that counts under the OID of a vendor extension; null without one.
  const Entry* attributeOf(const Entry& extension) const;

  // All with this OID; the first one counts.
  std::vector<const Entry*> allByOid(Kind kind, std::string_view oid) const;

  // Calls `visit` with all that share a key, where several do, in the order of reading: the first
  // name in any letter case (vendor extensions have none), no name being a key as well; the OID.
  using VisitGroup = std::function<void(const std::vector<const Entry*>&)>;
  void forEachSharedName(Kind kind, const VisitGroup& visit) const;
  void forEachSharedOid(Kind kind, const VisitGroup& visit) const;
  // The same for any of their names, or database names.
  using VisitNamed = std::function<void(std::string_view, const std::vector<const Entry*>&)>;
  void forEachSharedAlias(Kind kind, const VisitNamed& visit) const;

  // All that have this name among theirs, in any letter case, of the kind, in the order of reading.
  std::vector<const Entry*> byAnyName(Kind kind, std::string_view name) const;
  // By any name in any letter case or, failing that, by OID: the first one; null when there is
  // none.
  const Entry* find(Kind kind, std::string_view nameOrOid) const;
  // The same for what each of these names; in less time than one after the other.
  std::vector<const Entry*> find(const std::vector<Reference>& references) const;
  // The vendor extensions with this name among their DBNAMEs, in any letter case.
  std::vector<const Entry*> byDbName(std::string_view name) const;

  // Whether a definition of the kind, kept or only written, has this name or OID.
  bool isDefined(Kind kind, std::string_view nameOrOid) const;

  // Calls `visit` with every name in SUP, MUST and MAY, as written, in the order of the files.
  void forEachReference(const std::function<void(const Reference&)>& visit) const;
  // Those of them that name nothing of the kind.
  std::vector<Reference> danglingReferences() const;
  // Who names `entry`, by any of its names or its OID.
  std::vector<Reference> referrersOf(const Entry& entry) const;

 private:
  struct Content;
  explicit Installation(std::unique_ptr<Content> content);
  std::unique_ptr<Content> m_content;
};

// "attribute type cn (2.5.4.3)": a definition; the one that a reference stands in.
std::string describe(const Entry& entry);
std::string describe(const Reference& reference);

}  // namespace migration

#endif  // LIBSCHEMA_MIGRATION_INSTALLATION_H
