// Records of a run as an indented text, by the names of the functions.

#ifndef LIBSCHEMA_TESTS_TRACE_TREE_H
#define LIBSCHEMA_TESTS_TRACE_TREE_H

#include <string>
#include <vector>

namespace tracetree {

struct TracedFunction {
  const char* name;
  unsigned long identifier;
  bool isFrequent;
};

// Every traced function, by identifier.
const std::vector<TracedFunction>& tracedFunctions();

// One line for each function that calls no other, "name -> code"; for any other its name, what it
// calls, indented by two blanks, and "name -> code". Debug records as "debug: text" without the
// line end, or "debug outside: text" when they belong to no function.
std::string treeOf(const std::vector<std::string>& records);

}  // namespace tracetree

#endif  // LIBSCHEMA_TESTS_TRACE_TREE_H
