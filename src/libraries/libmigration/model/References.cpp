// The names in SUP, MUST and MAY.

#include "Installation.h"

namespace migration {

namespace {

constexpr Clause kReferring[] = {Clause::kSup, Clause::kMust, Clause::kMay};

Kind targetOf(Kind kind, Clause clause) {
  return clause == Clause::kSup ? kind : Kind::kAttributeType;
}

bool refers(Kind kind, Clause clause) {
  return clause == Clause::kSup
             ? kind != Kind::kVendorExtension
             : (clause == Clause::kMust || clause == Clause::kMay) && kind == Kind::kObjectClass;
}

using Visit = std::function<void(const Reference&)>;

void visitWritten(const SchemaFile& file, const Entry* from, const WrittenDefinition& written,
                  const Visit& visit) {
  for (const WrittenClause& clause : file.written->clausesOf(written)) {
    if (refers(written.kind, clause.clause)) {
      for (const WrittenValue& value : file.written->valuesOf(clause)) {
        visit({&file, from, &written, clause.clause, targetOf(written.kind, clause.clause),
               value.raw, value.offset});
      }
    }
  }
}

const std::vector<std::string>& valuesOf(const KeptDefinition& kept, Clause clause) {
  switch (clause) {
    case Clause::kMust:
      return kept.objectClass().reqAttrsInPlace();
    case Clause::kMay:
      return kept.objectClass().optAttrsInPlace();
    default:
      return kept.object->superiorsInPlace();
  }
}

void visitKept(const Entry& entry, const Visit& visit) {
  for (const Clause clause : kReferring) {
    if (refers(entry.kind(), clause)) {
      for (const std::string& name : valuesOf(*entry.kept, clause)) {
        visit({entry.file, &entry, nullptr, clause, targetOf(entry.kind(), clause), name,
               entry.kept->offset});
      }
    }
  }
}

}  // namespace

void Installation::forEachReference(const Visit& visit) const {
  auto entry = entries().begin();
  auto unkeptEntry = unkept().begin();
  for (const SchemaFile& file : files()) {
    for (; entry != entries().end() && entry->file == &file; ++entry) {
      if (entry->written != nullptr) {
        visitWritten(file, &*entry, *entry->written, visit);
      } else {
        visitKept(*entry, visit);
      }
    }
    for (; unkeptEntry != unkept().end() && unkeptEntry->file == &file; ++unkeptEntry) {
      visitWritten(file, nullptr, *unkeptEntry->written, visit);
    }
  }
}

std::string describe(const Entry& entry) { return describe(*entry.kept); }

std::string describe(const Reference& reference) {
  return reference.written != nullptr ? reference.file->written->describe(*reference.written)
                                      : describe(*reference.from->kept);
}

}  // namespace migration
