// Runs the rules over an installation that lies in memory.

#ifndef LIBSCHEMA_TESTS_CHECK_RUN_H
#define LIBSCHEMA_TESTS_CHECK_RUN_H

#include <string>
#include <string_view>
#include <vector>

#include "Check.h"
#include "Rule.h"

namespace support {

using Files = std::vector<migration::ExampleFile>;

// The files whose names begin with `prefix`, without it, as an installation named `directory`;
// fails the running test when there is a failure.
migration::Installation installationOf(const Files& files, std::string_view prefix,
                                       const std::string& directory);

// All findings over the files as they stand in a rule's example.
migration::Findings findingsOf(const Files& files);

// A line for each finding of the families with these letters: "T301 error V3.user.at:2:1".
std::string linesOf(const migration::Findings& findings, std::string_view families);

}  // namespace support

#endif  // LIBSCHEMA_TESTS_CHECK_RUN_H
