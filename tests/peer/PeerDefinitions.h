// Schema files as an independent parser (libldap) understands them.

#ifndef LIBSCHEMA_TESTS_PEER_DEFINITIONS_H
#define LIBSCHEMA_TESTS_PEER_DEFINITIONS_H

#include <map>
#include <string>
#include <vector>

namespace peer {

// The definitions of one installation that libldap knows (attribute types and object classes), each
// as one text that holds all its fields, by "at OID" or "oc OID". A key has more than one text when
// the installation defines it more than once, differently.
using Definitions = std::map<std::string, std::vector<std::string>>;

// Reads every V3.* file of a directory. A definition that libldap does not accept fails the running
// test, with the definition and libldap's reason.
Definitions readInstallation(const std::string& directory);

}  // namespace peer

#endif  // LIBSCHEMA_TESTS_PEER_DEFINITIONS_H
