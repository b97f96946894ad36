// Files that list OIDs: words separated by white space, with "#" comments. Internal: included by
// .cpp files only.

#ifndef LIBSCHEMA_OID_WORDS_H
#define LIBSCHEMA_OID_WORDS_H

#include <set>
#include <string>

namespace libschema {

// Adds every word of the file `path` to `oids`. A word with a "#" anywhere is dropped with the
// rest of its line; a last word that the end of the file follows directly is not used. Returns
// false, with `oids` unchanged, when the file cannot be opened or read.
bool readOidWords(const std::string& path, std::set<std::string>* oids);

}  // namespace libschema

#endif  // LIBSCHEMA_OID_WORDS_H
