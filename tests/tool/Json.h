// JSON documents against their schemas.

#ifndef LIBSCHEMA_TESTS_JSON_H
#define LIBSCHEMA_TESTS_JSON_H

#include <string>

// Whether this machine has the validator (Debian: python3-jsonschema).
bool canValidateJson();

// What is wrong with `document`, a line each; empty when the schema in the file `schema` accepts
// it.
std::string problemsOf(const std::string& document, const std::string& schema);

#endif  // LIBSCHEMA_TESTS_JSON_H
