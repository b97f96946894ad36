// Both readings of any bytes, and what the rules about texts and definitions say: where nothing is
// told the readings agree, and where an error says that they differ, they do.

#include <libschema-migration/Check.h>
#include <libschema-migration/Installation.h>

#include <memory>
#include <string>

#include "Agreement.h"
#include "Target.h"

extern "C" int LLVMFuzzerTestOneInput(const std::uint8_t* data, std::size_t size) {
  migration::SchemaFile file;
  file.name = "V3.user.at";
  file.source = std::make_unique<migration::Source>(file.name, fuzz::textOf(data, size));
  file.written = std::make_unique<migration::WrittenFile>(*file.source);
  file.kept = std::make_unique<migration::KeptFile>(*file.source);
  migration::Findings findings;
  migration::checkText(file, &findings);
  fuzz::requireEqual("", agreement::brokenRule(file, findings), "both readings");
  return 0;
}
