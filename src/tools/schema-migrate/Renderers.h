// A report of `check` in each of its formats. A format is a function of the report alone.

#ifndef SCHEMA_MIGRATE_RENDERERS_H
#define SCHEMA_MIGRATE_RENDERERS_H

#include <cstddef>
#include <string>

#include "CheckReport.h"

struct TextStyle {
  bool isWithExcerpts = false;  // the source line with a caret below it
  bool isColoured = false;
  std::size_t width = std::string::npos;  // of the excerpts at most
};

// "FILE:LINE:COLUMN: error: TEXT [RULE]" a line each, then a count.
std::string renderText(const CheckReport& report, const TextStyle& style);

// What could not be checked, a line each: it goes to standard error, whatever the format.
std::string renderFailures(const CheckReport& report);

// One document, as docs/json/check.schema.json says.
std::string renderJson(const CheckReport& report);

// SARIF 2.1.0, with the pages of the rules that occur.
std::string renderSarif(const CheckReport& report, const Rules& rules);

// Annotations of a GitHub workflow.
std::string renderGithub(const CheckReport& report);

#endif  // SCHEMA_MIGRATE_RENDERERS_H
