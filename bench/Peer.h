// The peer: libldap's parsers of attribute types and object classes over each definition of a file,
// which it finds line by line, with the results in two maps by first name and by OID. The keys are
// libldap's own texts. Memory is used again from file to file and from peer to peer: that for the
// text of a file, that for the maps, and libldap's, which is given back in reverse.

#ifndef LIBSCHEMA_BENCH_PEER_H
#define LIBSCHEMA_BENCH_PEER_H

#include <ldap.h>
#include <ldap_schema.h>

#include <cstddef>
#include <map>
#include <memory_resource>
#include <string>
#include <string_view>
#include <vector>

namespace bench {

class Peer {
 public:
  Peer();
  ~Peer();
  Peer(const Peer&) = delete;
  Peer& operator=(const Peer&) = delete;

  // Reads one file; false when it could not be read.
  bool readFile(const std::string& path);

  // How many definitions were met, and how many of them libldap refused.
  std::size_t definitions() const {
    return m_types.read.size() + m_classes.read.size() + m_refused;
  }
  std::size_t refused() const { return m_refused; }

 private:
  template <typename Parsed>
  struct Tables {
    explicit Tables(std::pmr::memory_resource* nodes) : byName(nodes), byOid(nodes) {}

    std::pmr::map<std::string_view, Parsed*> byName;
    std::pmr::map<std::string_view, Parsed*> byOid;
    std::vector<Parsed*> read;  // in the order of the files
  };

  bool readType(const char* text);
  bool readClass(const char* text);
  char* readDefinition(char* text, char* lineEnd, char* end, bool isType);
  template <typename Parsed>
  void enter(Parsed* parsed, char** names, const char* oid, Tables<Parsed>* tables);

  std::vector<std::byte> m_memory;
  std::pmr::monotonic_buffer_resource m_nodes;
  Tables<LDAPAttributeType> m_types;
  Tables<LDAPObjectClass> m_classes;
  std::size_t m_refused = 0;
};

}  // namespace bench

#endif  // LIBSCHEMA_BENCH_PEER_H
