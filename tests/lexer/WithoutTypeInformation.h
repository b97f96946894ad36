// An analyser of a class that is compiled without type information.

#ifndef LIBSCHEMA_TESTS_WITHOUT_TYPE_INFORMATION_H
#define LIBSCHEMA_TESTS_WITHOUT_TYPE_INFORMATION_H

#include <memory>
#include <string>

#include "SchemaLexan.h"

// Adds the word "extra" to its table, as a keyword with the code 777.
std::unique_ptr<SchemaLexan> analyserWithoutTypeInformation(const std::string& directory,
                                                            const std::string& fileName);

#endif  // LIBSCHEMA_TESTS_WITHOUT_TYPE_INFORMATION_H
