// The L and D rules over a text.

#ifndef LIBSCHEMA_TESTS_RULES_TESTING_H
#define LIBSCHEMA_TESTS_RULES_TESTING_H

#include <libschema-migration/Check.h>
#include <libschema-migration/Installation.h>

#include <memory>
#include <string>
#include <utility>

#include "Printed.h"

namespace rules_testing {

inline migration::SchemaFile fileOf(const std::string& name, std::string text) {
  migration::SchemaFile file;
  file.name = name;
  file.source = std::make_unique<migration::Source>(name, std::move(text));
  file.written = std::make_unique<migration::WrittenFile>(*file.source);
  file.kept = std::make_unique<migration::KeptFile>(*file.source);
  return file;
}

inline migration::Findings findingsOf(std::string text) {
  const migration::SchemaFile file = fileOf("V3.user.at", std::move(text));
  migration::Findings findings;
  migration::checkText(file, &findings);
  return findings;
}

}  // namespace rules_testing

#endif  // LIBSCHEMA_TESTS_RULES_TESTING_H
