// The tree of superiors as pictures in a page.

#ifndef SCHEMA_MIGRATE_HTML_TREE_H
#define SCHEMA_MIGRATE_HTML_TREE_H

#include "HtmlNames.h"

namespace html {

// Adds a section TREE from the superiors of a document; none when it has no superiors at all. The
// picture of a kind is cut into slices, so that a browser draws what is seen, and a printer breaks
// pages between lines.
void addTree(const Json& document, const Names& names, Dictionary* page);

}  // namespace html

#endif  // SCHEMA_MIGRATE_HTML_TREE_H
