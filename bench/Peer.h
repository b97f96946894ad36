// The peer: libldap's parsers of attribute types and object classes over the parenthesised text of
// each definition of a file, with the results in two maps by first name and by OID.

#ifndef LIBSCHEMA_BENCH_PEER_H
#define LIBSCHEMA_BENCH_PEER_H

#include <ldap.h>
#include <ldap_schema.h>

#include <cstddef>
#include <map>
#include <string>

namespace bench {

class Peer {
 public:
  Peer() = default;
  ~Peer();
  Peer(const Peer&) = delete;
  Peer& operator=(const Peer&) = delete;

  // Reads one file; false when it could not be read.
  bool readFile(const std::string& path);

  // How many definitions were met, and how many of them libldap refused.
  std::size_t definitions() const { return m_definitions; }
  std::size_t refused() const { return m_refused; }

 private:
  template <typename Parsed>
  struct Tables {
    std::map<std::string, Parsed*> byName;
    std::map<std::string, Parsed*> byOid;
  };

  void readType(const char* text);
  void readClass(const char* text);
  template <typename Parsed>
  void enter(Parsed* parsed, char** names, const char* oid, void (*release)(Parsed*),
             Tables<Parsed>* tables);

  Tables<LDAPAttributeType> m_types;
  Tables<LDAPObjectClass> m_classes;
  std::size_t m_definitions = 0;
  std::size_t m_refused = 0;
};

}  // namespace bench

#endif  // LIBSCHEMA_BENCH_PEER_H
