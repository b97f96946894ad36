// Everything that the rules have to say about an installation.

#ifndef LIBSCHEMA_MIGRATION_CHECK_H
#define LIBSCHEMA_MIGRATION_CHECK_H

#include <map>
#include <memory>
#include <string>
#include <vector>

#include "Finding.h"
#include "Installation.h"
#include "Source.h"

namespace migration {

// What is checked, and how. Everything in it must stay in place for the call.
struct CheckRequest {
  const Installation* installation = nullptr;
  const Installation* against = nullptr;  // null without one
  std::vector<const Source*> excludeLists;
  const Source* withdrawList = nullptr;         // null without one
  std::vector<std::string> knownAccessClasses;  // empty: none is asked about
  std::map<std::string, Severity> severities;   // by rule: in place of what the rule says
};

// In the order of files (as read), lines, columns, rules. A severity of kOff is left out.
Findings check(const CheckRequest& request);

// The families. Each adds its findings in any order, with the severities that the rules give.
// Text and definition rules look at one file; a file that they condemn as a whole says so alone.
void checkText(const SchemaFile& file, Findings* findings);  // L and D
void checkTables(const CheckRequest& request, Findings* findings);
void checkReferences(const CheckRequest& request, Findings* findings);
void checkLists(const CheckRequest& request, Findings* findings);
void checkExtensions(const CheckRequest& request, Findings* findings);
void checkInstallation(const CheckRequest& request, Findings* findings);

}  // namespace migration

#endif  // LIBSCHEMA_MIGRATION_CHECK_H
