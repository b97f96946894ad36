// The floor: the least that a program with the library's data model does to read, compare, merge,
// check and write schemas. It has the library's tables, OID sets and results, by the same names,
// and nothing around them: no trace points, no stream, no diagnostic files, no locale, no call for
// a single definition. It wants the well-formed inputs of the benchmark.

#ifndef LIBSCHEMA_BENCH_FLOOR_SCHEMA_H
#define LIBSCHEMA_BENCH_FLOOR_SCHEMA_H

#include <array>
#include <cstddef>
#include <map>
#include <memory>
#include <set>
#include <string>

#include "Definitions.h"

namespace minimal {

class Schema {
 public:
  explicit Schema(std::string directory);
  ~Schema();
  Schema(const Schema&) = delete;
  Schema& operator=(const Schema&) = delete;

  int readFile(const std::string& fileName);
  int readExcludedOids(const std::string& path);
  int modifySchema(const std::string& path);
  bool compSchemas(Schema* reference);
  bool mergeSchemas(Schema* source);
  bool checkCollisions(Schema* reference);
  std::string getOcTable() const;
  std::string getAttrTable() const;
  std::string getORVAttrTable() const;
  int writeFile(const std::string& directory, const std::string& fileName) const;

  // The number of tokens in a file, for the comparison of the two tokenizers.
  static std::size_t countTokens(const std::string& directory, const std::string& fileName);

 private:
  using Oids = std::set<std::string>;
  template <typename D>
  using Table = std::map<std::string, D*>;

  // The files in the order in which their sets are searched; that of V3.modifiedschema, last, takes
  // no part in the searches.
  static constexpr std::size_t kSearchedSets = 6;
  static constexpr std::size_t kSets = 7;
  static int fileNumber(const std::string& fileName);

  struct Operations;

  Table<AttributeType> m_types;
  Table<ObjectClass> m_classes;
  Table<Extension> m_extensions;
  Table<AttributeType> m_typesByOid;
  Table<ObjectClass> m_classesByOid;
  std::string m_directory;
  std::array<Oids, kSets> m_sets;
  Oids m_excluded;
};

}  // namespace minimal

#endif  // LIBSCHEMA_BENCH_FLOOR_SCHEMA_H
