// What the families of rules about an installation share. Internal: not installed.

#ifndef LIBSCHEMA_MIGRATION_RULE_SUPPORT_H
#define LIBSCHEMA_MIGRATION_RULE_SUPPORT_H

#include <cstddef>
#include <string>
#include <string_view>

#include "Finding.h"
#include "Installation.h"

namespace migration {

// "V3.user.at:12".
std::string fileAndLine(const Entry& entry);

// "attribute type cn (2.5.4.3) of V3.user.at:12".
std::string describeWithPlace(const Entry& entry);

// Where `text`, in any letter case, stands among the values of a clause; the clause, or else the
// definition, where it does not.
std::size_t placeOfValue(const Entry& entry, Clause clause, std::string_view text);
std::size_t placeOfClause(const Entry& entry, Clause clause);

// Whether the OID, or the first name, is kept as it is written. Where it is not, another rule says
// so, and what follows from that is no mistake of its own.
bool isOidAsWritten(const Entry& entry);
bool isFirstNameAsWritten(const Entry& entry);

// The definition's first name and OID as text; empty without one.
std::string_view firstNameOf(const Entry& entry);
const std::string& oidOf(const Entry& entry);

bool isConfigFile(const SchemaFile& file);
bool isModifiedSchema(const SchemaFile& file);

void addFinding(const char* rule, Severity severity, const SchemaFile& file, std::size_t offset,
                std::string text, std::string definition, Findings* findings);
// At a place of the entry's file, about it.
void addFinding(const char* rule, Severity severity, const Entry& entry, std::size_t offset,
                std::string text, Findings* findings);

}  // namespace migration

#endif  // LIBSCHEMA_MIGRATION_RULE_SUPPORT_H
