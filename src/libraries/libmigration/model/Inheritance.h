// What definitions have through SUP, and the trees that SUP makes of them. A loop of superiors is
// walked once. Everything refers to the installation, and goes with it.

#ifndef LIBSCHEMA_MIGRATION_INHERITANCE_H
#define LIBSCHEMA_MIGRATION_INHERITANCE_H

#include <cstddef>
#include <string>
#include <string_view>
#include <vector>

#include "Installation.h"

namespace migration {

// The definitions that SUP of `entry` names directly, as far as they are there, in its order.
std::vector<const Entry*> superiorsOf(const Installation& installation, const Entry& entry);

// A clause that a definition has from a superior.
struct Inherited {
  Clause clause;
  std::string value;
  const Entry* from;
};

// What `entry` has beside its own clauses, the nearest superior first: of an attribute type
// EQUALITY, ORDERING, SUBSTR and SYNTAX where it has none itself; of an object class the members of
// MUST and MAY that it does not list itself, each once, a MUST before a MAY.
std::vector<Inherited> inheritedBy(const Installation& installation, const Entry& entry);

// Definitions below their superiors, by first name in ascending order. One with several superiors
// is below each of them; what would close a loop is left out, so that every walk ends.
struct SuperiorTree {
  // A definition at one place of the tree.
  struct Node {
    const Entry* entry;
    std::vector<std::size_t> below;  // numbers of nodes
  };
  std::vector<Node> nodes;
  std::vector<std::size_t> roots;
};

// Of the definitions of a kind that count: the first under a first name. Vendor extensions have no
// superiors: their tree is empty.
SuperiorTree superiorTree(const Installation& installation, Kind kind);

// The names and OIDs of the installation that are most like `name`, the most alike first, at most
// `count`; none that has less than two thirds of it.
std::vector<std::string> nearestNames(const Installation& installation, std::string_view name,
                                      std::size_t count = 3);

}  // namespace migration

#endif  // LIBSCHEMA_MIGRATION_INHERITANCE_H
