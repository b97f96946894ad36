#include "SchemaFiles.h"

std::size_t schemaFileNumber(const std::string& name) {
  for (std::size_t file = 0; file < kSchemaFiles.size(); ++file) {
    if (name == kSchemaFiles[file]) {
      return file;
    }
  }
  return kNoSchemaFile;
}
