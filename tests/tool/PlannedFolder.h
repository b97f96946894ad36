// A small upgrade: BASE, the site's OLD and the release's NEW, with something of every kind in it.

#ifndef LIBSCHEMA_TESTS_PLANNED_FOLDER_H
#define LIBSCHEMA_TESTS_PLANNED_FOLDER_H

#include <string>
#include <vector>

#include "ToolRun.h"

// "attributetypes=( … )" and so on, with a line end.
std::string at(const std::string& rest);
std::string oc(const std::string& rest);
std::string orv(const std::string& rest);

// The site made `a` single-valued and added the type `s`, the class `guard` and a member of c's
// list; the release described `b` better and gave `c` another member, and has a config file. So
// that everything can be decided by itself with @/base.
class PlannedFolder : public ToolFolder {
 public:
  PlannedFolder();

  // `command` from @/old to @/new with @/base, and more.
  ToolResult runPlanned(const std::string& command, const std::vector<std::string>& more = {},
                        const std::function<void()>& prepare = nullptr) const;
};

// The text with the first `from` replaced; fails the test when there is none.
std::string replaced(std::string text, const std::string& from, const std::string& to);

#endif  // LIBSCHEMA_TESTS_PLANNED_FOLDER_H
