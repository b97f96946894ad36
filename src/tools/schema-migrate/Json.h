// JSON documents as the program prints them.

#ifndef SCHEMA_MIGRATE_JSON_H
#define SCHEMA_MIGRATE_JSON_H

#include <libschema-migration/Finding.h>
#include <libschema-migration/Settings.h>

#include <nlohmann/json.hpp>
#include <string>

// Members keep the order in which they are given.
using Json = nlohmann::ordered_json;

// The document and a line end, in printable ASCII: whatever a file holds reaches no terminal as a
// command. A byte that is not UTF-8 reads U+FFFD.
inline std::string textOf(const Json& document) {
  return document.dump(2, ' ', true, Json::error_handler_t::replace) + "\n";
}

// A finding as every document has it.
inline Json jsonOf(const migration::Finding& finding) {
  return {{"rule", finding.rule},
          {"severity", migration::wordOf(finding.severity)},
          {"file", finding.file},
          {"line", finding.line},
          {"column", finding.column},
          {"text", finding.text},
          {"definition", finding.definition}};
}

#endif  // SCHEMA_MIGRATE_JSON_H
