#include "RuleSupport.h"

#include <utility>

#include "TextIndex.h"

namespace migration {

std::string fileAndLine(const Entry& entry) {
  return entry.file->name + ":" + std::to_string(entry.place().line);
}

std::string describeWithPlace(const Entry& entry) {
  return describe(entry) + " of " + fileAndLine(entry);
}

std::size_t placeOfValue(const Entry& entry, Clause clause, std::string_view text) {
  if (entry.written != nullptr) {
    const WrittenFile& written = *entry.file->written;
    for (const WrittenClause& each : written.clausesOf(*entry.written)) {
      if (each.clause == clause) {
        for (const WrittenValue& value : written.valuesOf(each)) {
          if (equalsFolded(value.raw, text)) {
            return value.offset;
          }
        }
      }
    }
  }
  return placeOfClause(entry, clause);
}

std::size_t placeOfClause(const Entry& entry, Clause clause) {
  const WrittenClause* const found =
      entry.written == nullptr ? nullptr : entry.file->written->find(*entry.written, clause);
  return found == nullptr ? entry.kept->offset : found->offset;
}

bool isOidAsWritten(const Entry& entry) {
  return entry.written == nullptr ||
         entry.file->written->textOf(*entry.written, Clause::kOid) == oidOf(entry);
}

bool isFirstNameAsWritten(const Entry& entry) {
  return entry.written == nullptr ||
         equalsFolded(entry.file->written->textOf(*entry.written, Clause::kName),
                      firstNameOf(entry));
}

std::string_view firstNameOf(const Entry& entry) {
  const std::vector<std::string>& names = entry.kept->object->namesInPlace();
  return names.empty() ? std::string_view() : std::string_view(names.front());
}

const std::string& oidOf(const Entry& entry) { return entry.kept->object->oidInPlace(); }

bool isConfigFile(const SchemaFile& file) {
  return file.name == "V3.config.at" || file.name == "V3.config.oc";
}

bool isModifiedSchema(const SchemaFile& file) { return file.name == "V3.modifiedschema"; }

void addFinding(const char* rule, Severity severity, const SchemaFile& file, std::size_t offset,
                std::string text, std::string definition, Findings* findings) {
  const Place place = file.source->placeOf(offset);
  findings->push_back({rule, severity, file.source->path(), place.line, place.column,
                       std::move(text), std::move(definition)});
}

void addFinding(const char* rule, Severity severity, const Entry& entry, std::size_t offset,
                std::string text, Findings* findings) {
  addFinding(rule, severity, *entry.file, offset, std::move(text), describe(entry), findings);
}

}  // namespace migration
