// The page of a rule, and the list of all.

#ifndef SCHEMA_MIGRATE_RULE_PAGE_H
#define SCHEMA_MIGRATE_RULE_PAGE_H

#include <libschema-migration/Rule.h>

#include <string>
#include <vector>

// What it says, an example that has it and one that nearly has it, why it matters, how to mend it.
std::string renderPage(const migration::RuleInfo& rule);

// A line each: identifier, severity, what it says.
std::string renderList(const std::vector<const migration::RuleInfo*>& rules);

#endif  // SCHEMA_MIGRATE_RULE_PAGE_H
