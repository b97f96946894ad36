// What a run of `show` found: a value, from which text and graphs are rendered.

#ifndef SCHEMA_MIGRATE_SHOW_REPORT_H
#define SCHEMA_MIGRATE_SHOW_REPORT_H

#include <libschema-migration/Finding.h>

#include <cstddef>
#include <cstdint>
#include <string>
#include <vector>

// Where a definition stands, and what it is: "attribute type cn (2.5.4.3)".
struct ShownPlace {
  std::string file;
  std::uint64_t line = 0;
  std::string title;
};

// A clause of, or from, another definition.
struct ShownClause {
  std::string text;  // "MAY sn"
  ShownPlace from;
};

struct ShownDefinition {
  ShownPlace place;
  std::string oid;
  std::vector<std::string> clauses;  // as they are written in a schema file
  // Of several definitions with one name the one that the server uses, when it is not this one.
  std::vector<ShownPlace> insteadOfIt;
  std::vector<ShownClause> inherited;
  std::vector<ShownClause> referrers;
};

struct ShownTreeLine {
  std::string name;
  std::size_t depth = 0;
  bool isShownAbove = false;            // what is below it stands where it was met first
  std::vector<std::string> superiors;   // as its definition names them
  std::vector<std::string> notDefined;  // those of them that name nothing
  ShownPlace place;
};

struct ShownNothing {
  std::string name;
  std::vector<ShownPlace> written;  // where it is written, and the library does not keep it
  std::vector<std::string> near;    // what may have been meant
};

struct ShowReport {
  bool isWithInherited = false;
  bool isWithReferrers = false;
  std::vector<ShownPlace> list;
  std::vector<ShownDefinition> definitions;
  std::vector<ShownTreeLine> tree;
  std::vector<ShownNothing> unknown;
  migration::Failures failures;
  int exitCode = 0;
};

// The list a line each, the definitions a clause a line, the tree with two blanks for a step down.
std::string renderText(const ShowReport& report);

// The tree as a graph for Graphviz, from each definition to its superiors.
std::string renderDot(const ShowReport& report);

// What could not be read, and which names are unknown; for standard error.
std::string renderComplaints(const ShowReport& report);

#endif  // SCHEMA_MIGRATE_SHOW_REPORT_H
