// A rule about schema texts: an identifier that never changes its meaning, and the page that
// explains it. Every family of rules (L text, D definition, T tables, R references, O lists, V
// vendor extensions, I installation, S settings) has a file of its own.

#ifndef LIBSCHEMA_MIGRATION_RULE_H
#define LIBSCHEMA_MIGRATION_RULE_H

#include <string_view>
#include <vector>

#include "Finding.h"

namespace migration {

// A file of an example: a schema file ("V3.user.at"), one of the other installation
// ("against/V3.user.at"), a list ("exclude.txt", "withdraw.txt") or settings
// (".schema-migrate.toml").
struct ExampleFile {
  const char* name;
  std::string_view bytes;
};

// A rule and its page.
struct RuleInfo {
  const char* id;     // "D208"
  const char* name;   // "single-member-takes-the-end"
  Severity severity;  // the one that it mostly has
  const char* what;   // a sentence each
  const char* why;
  const char* mend;
  std::vector<ExampleFile> example;   // has this finding and no other
  std::vector<ExampleFile> nearMiss;  // nearly has it, and has none of this rule
};

// All rules, by identifier; one of them, null when there is none of this identifier.
const std::vector<const RuleInfo*>& allRules();
const RuleInfo* findRule(std::string_view id);

// The rules of one family, each defined in the family's file.
const std::vector<RuleInfo>& textRules();
const std::vector<RuleInfo>& definitionRules();
const std::vector<RuleInfo>& tableRules();
const std::vector<RuleInfo>& referenceRules();
const std::vector<RuleInfo>& listRules();
const std::vector<RuleInfo>& extensionRules();
const std::vector<RuleInfo>& installationRules();
const std::vector<RuleInfo>& settingsRules();

}  // namespace migration

#endif  // LIBSCHEMA_MIGRATION_RULE_H
