// Random triples of BASE, OLD and NEW: definitions that are changed, renamed, renumbered, removed
// and added by each side, in every file and form.

#ifndef LIBSCHEMA_TESTS_MIGRATION_TRIPLES_H
#define LIBSCHEMA_TESTS_MIGRATION_TRIPLES_H

#include <libschema-migration/Installation.h>

#include <random>
#include <string>
#include <vector>

namespace triples {

using Texts = std::vector<migration::NamedText>;

struct Triple {
  Texts base;
  Texts old;
  Texts latest;
};

struct Definition {
  migration::Kind kind = migration::Kind::kAttributeType;
  std::string oid;
  std::vector<std::string> names;
  std::string desc;
  std::vector<std::string> sup;
  std::string flags;  // "SINGLE-VALUE "
  std::string usage;
  std::string equality;
  std::vector<std::string> must;
  std::vector<std::string> may;
  std::vector<std::string> dbNames;
  std::string accessClass;
  int length = 0;
  std::string file;
};

class Generator {
 public:
  explicit Generator(unsigned seed) : m_random(seed) {}

  // With `isHard`, names and OIDs come from a pool that is small enough for clashes, and
  // definitions are repeated.
  Triple triple(bool isHard);

  int pick(int count) { return static_cast<int>(m_random() % static_cast<unsigned>(count)); }

 private:
  using Definitions = std::vector<Definition>;

  bool isOneOf(int count) { return pick(count) == 0; }
  Definitions base();
  Definitions variant(const Definitions& from, const std::string& who);
  void change(const std::string& who, Definition* definition);
  void rename(const std::string& who, Definitions* all, std::size_t which);
  void renumber(Definitions* all, std::size_t which);
  void addOwn(const std::string& who, Definitions* all);
  std::string nameOfSome(const Definitions& all, migration::Kind kind);
  std::string someFile(migration::Kind kind);
  std::string freshOid(const std::string& who);
  Texts written(const Definitions& all);
  std::string textOf(const Definition& definition);

  std::mt19937 m_random;
  bool m_isHard = false;
  int m_fresh = 0;
};

}  // namespace triples

#endif  // LIBSCHEMA_TESTS_MIGRATION_TRIPLES_H
