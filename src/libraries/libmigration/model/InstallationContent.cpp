#include "InstallationContent.h"

#include <array>
#include <utility>

namespace migration {

namespace {

// The names of a definition; of an extension, its database names.
const std::vector<std::string>& namesOf(const KeptDefinition& definition) {
  return definition.kind == Kind::kVendorExtension ? definition.extension().getDbNames()
                                                   : definition.object->namesInPlace();
}

// Whether OID and names are.
bool isKeptAsWritten(const Entry& entry) {
  const WrittenFile& file = *entry.file->written;
  const std::vector<std::string>& names = entry.kept->object->namesInPlace();
  std::size_t met = 0;
  for (const WrittenClause& clause : file.clausesOf(*entry.written)) {
    if (clause.clause == Clause::kOid) {
      const Slice<WrittenValue> values = file.valuesOf(clause);
      if (values.size() != 1 || values.front().raw != entry.kept->object->oidInPlace()) {
        return false;
      }
    } else if (clause.clause == Clause::kName) {
      for (const WrittenValue& value : file.valuesOf(clause)) {
        if (met == names.size() || names[met] != value.raw) {
          return false;
        }
        ++met;
      }
    }
  }
  return met == names.size();
}

}  // namespace

void Installation::Content::addFile(const char* name, std::unique_ptr<Source> source) {
  SchemaFile& file = files.emplace_back();
  file.name = name;
  file.source = std::move(source);
  file.written = std::make_unique<WrittenFile>(*file.source);
  file.kept = std::make_unique<KeptFile>(*file.source);
}

// A kept definition is the reading of the first written one of its kind that begins within its
// text.
void Installation::Content::takeDefinitions(const SchemaFile& file) {
  const std::vector<WrittenDefinition>& all = file.written->definitions();
  auto next = all.begin();
  for (const KeptDefinition& kept : file.kept->definitions()) {
    for (; next != all.end() && next->offset < kept.offset; ++next) {
      unkept.push_back({&file, &*next});
    }
    const WrittenDefinition* partner = nullptr;
    for (; next != all.end() && next->offset < kept.end; ++next) {
      if (kept.isEntered && partner == nullptr && next->kind == kept.kind) {
        partner = &*next;
      } else {
        unkept.push_back({&file, &*next});
      }
    }
    if (kept.isEntered) {
      entries.push_back({&file, &kept, partner});
    }
  }
  for (; next != all.end(); ++next) {
    unkept.push_back({&file, &*next});
  }
}

void Installation::Content::makeIndexes() {
  std::size_t count = 0;
  for (const SchemaFile& file : files) {
    count += file.kept->definitions().size();
  }
  entries.reserve(count);
  for (const SchemaFile& file : files) {
    takeDefinitions(file);
  }
  for (const Kind kind : {Kind::kAttributeType, Kind::kObjectClass, Kind::kVendorExtension}) {
    indexKind(kind);
  }
  indexAttributes();
}

void Installation::Content::indexAttributes() {
  constexpr std::size_t kAtATime = 16;
  const TextIndex& attributes = oids[numberOf(Kind::kAttributeType)];
  std::array<std::uint32_t, kAtATime> hashes{};
  std::vector<std::uint32_t> waiting;
  attributeOf.assign(entries.size(), TextIndex::kNone);
  const auto oidAt = [this](std::uint32_t entry) -> const std::string& {
    return entries[entry].kept->object->oidInPlace();
  };
  const auto lookUp = [&] {
    for (std::size_t i = 0; i < waiting.size(); ++i) {
      attributes.fetchText(hashes[i]);
    }
    for (std::size_t i = 0; i < waiting.size(); ++i) {
      const std::uint32_t node = attributes.first(oidAt(waiting[i]), hashes[i]);
      if (node != TextIndex::kNone) {
        attributeOf[waiting[i]] = attributes.value(node);
      }
    }
    waiting.clear();
  };
  for (std::uint32_t i = 0; i < entries.size(); ++i) {
    if (entries[i].kind() == Kind::kVendorExtension) {
      hashes[waiting.size()] = attributes.hashOf(oidAt(i));
      attributes.fetchSlot(hashes[waiting.size()]);
      waiting.push_back(i);
      if (waiting.size() == kAtATime) {
        lookUp();
      }
    }
  }
  lookUp();
}

void Installation::Content::indexKind(Kind kind) {
  std::vector<TextIndex::Item> ofNames;
  std::vector<TextIndex::Item> ofOids;
  for (std::uint32_t i = 0; i < entries.size(); ++i) {
    const KeptDefinition& kept = *entries[i].kept;
    if (kept.kind != kind) {
      continue;
    }
    ofOids.push_back({kept.object->oidInPlace(), i});
    const std::vector<std::string>& all = namesOf(kept);
    for (const std::string& name : all) {
      ofNames.push_back({name, i});
    }
    if (all.empty() && kind != Kind::kVendorExtension) {
      ofNames.push_back({"", i});
    }
  }
  oids[numberOf(kind)].addAll(ofOids);
  names[numberOf(kind)].addAll(ofNames);
}

// Only what is not kept as it is written: the rest is found by what is kept.
void Installation::Content::indexWritten() {
  const auto add = [&](const WrittenFile& file, const WrittenDefinition& definition) {
    for (const WrittenClause& clause : file.clausesOf(definition)) {
      if (clause.clause == Clause::kName || clause.clause == Clause::kOid) {
        for (const WrittenValue& value : file.valuesOf(clause)) {
          written.names[numberOf(definition.kind)].add(value.raw, 0);
        }
      }
    }
  };
  for (const UnkeptEntry& entry : unkept) {
    add(*entry.file->written, *entry.written);
  }
  for (const Entry& entry : entries) {
    if (entry.written != nullptr && !isKeptAsWritten(entry)) {
      add(*entry.file->written, *entry.written);
    }
  }
}

// Each entry once, though a text may be among its names twice.
std::vector<const Entry*> Installation::Content::entriesAt(const TextIndex& index,
                                                           std::uint32_t node) const {
  std::vector<const Entry*> found;
  for (; node != TextIndex::kNone; node = index.next(node)) {
    const Entry* const entry = &entries[index.value(node)];
    if (found.empty() || found.back() != entry) {
      found.push_back(entry);
    }
  }
  return found;
}

}  // namespace migration
