#include "Installation.h"

#include <algorithm>
#include <utility>

#include "InputFiles.h"
#include "InstallationContent.h"

namespace migration {

namespace {

bool beginsLikeASchemaFile(std::string_view name) {
  return name.size() > 3 && equalsFolded(name.substr(0, 3), "V3.");
}

std::string_view firstNameOf(const Entry& entry) {
  const std::vector<std::string>& names = entry.kept->object->namesInPlace();
  return names.empty() ? std::string_view() : std::string_view(names.front());
}

}  // namespace

std::size_t schemaFileNumber(std::string_view name) {
  return static_cast<std::size_t>(std::find(kSchemaFiles.begin(), kSchemaFiles.end(), name) -
                                  kSchemaFiles.begin());
}

Installation::Installation(std::unique_ptr<Content> content) : m_content(std::move(content)) {
  m_content->makeIndexes();
}

Installation::Installation(Installation&&) noexcept = default;

Installation& Installation::operator=(Installation&&) noexcept = default;

Installation::~Installation() = default;

template <typename Texts, typename SourceOf>
void Installation::Content::addTexts(Texts* texts, const SourceOf& sourceOf) {
  files.reserve(kSchemaFiles.size());
  for (const NamedText& text : *texts) {
    if (schemaFileNumber(text.name) == kSchemaFiles.size() && beginsLikeASchemaFile(text.name)) {
      otherFiles.push_back(text.name);
    }
  }
  std::sort(otherFiles.begin(), otherFiles.end());
  for (const char* const name : kSchemaFiles) {
    const auto text = std::find_if(texts->begin(), texts->end(),
                                   [name](const NamedText& each) { return each.name == name; });
    if (text == texts->end()) {
      continue;
    }
    present.emplace_back(name);
    std::unique_ptr<Source> source =
        sourceOf(directory.empty() ? name : directory + "/" + name, &*text);
    if (source != nullptr) {
      addFile(name, std::move(source));
      files.back().mode = text->mode;
    }
  }
}

Installation Installation::fromDirectory(const std::string& directory, const ReadLimits& limits,
                                         Failures* failures) {
  auto content = std::make_unique<Content>();
  content->directory = directory;
  std::vector<std::string> names;
  const InputDirectory input(directory);
  const std::string problem = input.list(&names);
  if (!problem.empty()) {
    failures->push_back({directory, 0, 0, "", "the directory cannot be read: " + problem});
  }
  for (const std::string& name : names) {
    if (schemaFileNumber(name) == kSchemaFiles.size() && beginsLikeASchemaFile(name)) {
      content->otherFiles.push_back(name);
    }
  }
  ReadLimits rest = limits;
  bool isAny = false;
  content->files.reserve(kSchemaFiles.size());
  for (const char* const name : kSchemaFiles) {
    if (!std::binary_search(names.begin(), names.end(), name)) {
      continue;
    }
    isAny = true;
    content->present.emplace_back(name);
    std::string path = directory + "/" + name;
    FileText text;
    std::string unread = input.read(name, rest, &text);
    if (unread.empty()) {
      rest.used += text.bytes.size();
      content->addFile(name, std::make_unique<Source>(std::move(path), std::move(text.bytes)));
      content->files.back().mode = text.mode;
    } else {
      failures->push_back({std::move(path), 0, 0, "", std::move(unread)});
    }
  }
  if (problem.empty() && !isAny) {
    failures->push_back({directory, 0, 0, "",
                         "no V3.* schema file in the directory; name the directory that holds "
                         "V3.system.at and its like"});
  }
  return Installation(std::move(content));
}

Installation Installation::fromTexts(const std::string& directory, std::vector<NamedText> texts,
                                     const ReadLimits& limits, Failures* failures) {
  auto content = std::make_unique<Content>();
  content->directory = directory;
  ReadLimits rest = limits;
  content->addTexts(&texts, [&](std::string path, NamedText* text) {
    std::unique_ptr<Source> source;
    if (text->bytes.size() > rest.room()) {
      failures->push_back({std::move(path), 0, 0, "", rest.exceeded()});
    } else {
      rest.used += text->bytes.size();
      source = std::make_unique<Source>(std::move(path), std::move(text->bytes));
    }
    return source;
  });
  return Installation(std::move(content));
}

Installation Installation::overTexts(const std::string& directory,
                                     const std::vector<NamedText>& texts) {
  auto content = std::make_unique<Content>();
  content->directory = directory;
  content->addTexts(&texts, [](std::string path, const NamedText* text) {
    return std::make_unique<Source>(std::move(path), Source::Borrowed{text->bytes});
  });
  return Installation(std::move(content));
}

const std::string& Installation::directory() const { return m_content->directory; }

std::uint64_t Installation::size() const {
  std::uint64_t size = 0;
  for (const SchemaFile& file : m_content->files) {
    size += file.source->bytes().size();
  }
  return size;
}

const std::vector<SchemaFile>& Installation::files() const { return m_content->files; }

const SchemaFile* Installation::file(std::string_view name) const {
  for (const SchemaFile& file : m_content->files) {
    if (file.name == name) {
      return &file;
    }
  }
  return nullptr;
}

const std::vector<std::string>& Installation::otherFiles() const { return m_content->otherFiles; }

const std::vector<Entry>& Installation::entries() const { return m_content->entries; }

const std::vector<UnkeptEntry>& Installation::unkept() const { return m_content->unkept; }

bool Installation::hasFile(std::string_view name) const {
  const std::vector<std::string>& present = m_content->present;
  return std::find(present.begin(), present.end(), name) != present.end();
}

const Entry* Installation::byFirstName(Kind kind, std::string_view lowerName) const {
  if (kind == Kind::kVendorExtension) {
    return nullptr;
  }
  const TextIndex& names = m_content->names[numberOf(kind)];
  for (std::uint32_t node = names.first(lowerName); node != TextIndex::kNone;
       node = names.next(node)) {
    const Entry& entry = m_content->entries[names.value(node)];
    if (equalsFolded(firstNameOf(entry), lowerName)) {
      return &entry;
    }
  }
  return nullptr;
}

const Entry* Installation::byOid(Kind kind, std::string_view oid) const {
  const TextIndex& oids = m_content->oids[numberOf(kind)];
  const std::uint32_t node = oids.first(oid);
  return node == TextIndex::kNone ? nullptr : &m_content->entries[oids.value(node)];
}

const Entry* Installation::attributeOf(const Entry& extension) const {
  const auto number = static_cast<std::size_t>(&extension - m_content->entries.data());
  const std::uint32_t attribute = m_content->attributeOf[number];
  return attribute == TextIndex::kNone ? nullptr : &m_content->entries[attribute];
}

std::vector<const Entry*> Installation::allByOid(Kind kind, std::string_view oid) const {
  const TextIndex& oids = m_content->oids[numberOf(kind)];
  return m_content->entriesAt(oids, oids.first(oid));
}

std::vector<const Entry*> Installation::byAnyName(Kind kind, std::string_view name) const {
  const TextIndex& names = m_content->names[numberOf(kind)];
  return m_content->entriesAt(names, names.first(name));
}

void Installation::forEachSharedOid(Kind kind, const VisitGroup& visit) const {
  const TextIndex& oids = m_content->oids[numberOf(kind)];
  for (const std::uint32_t node : oids.repeated()) {
    visit(m_content->entriesAt(oids, node));
  }
}

void Installation::forEachSharedAlias(Kind kind, const VisitNamed& visit) const {
  const TextIndex& names = m_content->names[numberOf(kind)];
  for (const std::uint32_t node : names.repeated()) {
    const std::vector<const Entry*> group = m_content->entriesAt(names, node);
    if (group.size() > 1) {
      visit(names.text(node), group);
    }
  }
}

void Installation::forEachSharedName(Kind kind, const VisitGroup& visit) const {
  if (kind == Kind::kVendorExtension) {
    return;
  }
  forEachSharedAlias(kind, [&](std::string_view name, const std::vector<const Entry*>& all) {
    std::vector<const Entry*> group;
    for (const Entry* const entry : all) {
      if (equalsFolded(firstNameOf(*entry), name)) {
        group.push_back(entry);
      }
    }
    if (group.size() > 1) {
      visit(group);
    }
  });
}

const Entry* Installation::find(Kind kind, std::string_view nameOrOid) const {
  if (kind != Kind::kVendorExtension && !nameOrOid.empty()) {
    const TextIndex& names = m_content->names[numberOf(kind)];
    const std::uint32_t node = names.first(nameOrOid);
    if (node != TextIndex::kNone) {
      return &m_content->entries[names.value(node)];
    }
  }
  return byOid(kind, nameOrOid);
}

std::vector<const Entry*> Installation::find(const std::vector<Reference>& references) const {
  std::vector<std::uint32_t> hashes;
  hashes.reserve(references.size());
  const auto namesFor = [&](const Reference& reference) -> const TextIndex& {
    return m_content->names[numberOf(reference.target)];
  };
  for (const Reference& reference : references) {
    hashes.push_back(namesFor(reference).hashOf(reference.name));
    namesFor(reference).fetchSlot(hashes.back());
  }
  for (std::size_t i = 0; i < references.size(); ++i) {
    namesFor(references[i]).fetchText(hashes[i]);
  }
  std::vector<const Entry*> found;
  found.reserve(references.size());
  for (std::size_t i = 0; i < references.size(); ++i) {
    const Reference& reference = references[i];
    const TextIndex& names = namesFor(reference);
    const std::uint32_t node =
        reference.name.empty() ? TextIndex::kNone : names.first(reference.name, hashes[i]);
    found.push_back(node == TextIndex::kNone ? byOid(reference.target, reference.name)
                                             : &m_content->entries[names.value(node)]);
  }
  return found;
}

std::vector<const Entry*> Installation::byDbName(std::string_view name) const {
  return byAnyName(Kind::kVendorExtension, name);
}

bool Installation::isDefined(Kind kind, std::string_view nameOrOid) const {
  if (find(kind, nameOrOid) != nullptr) {
    return true;
  }
  std::call_once(m_content->written.once, [this] { m_content->indexWritten(); });
  return m_content->written.names[numberOf(kind)].first(nameOrOid) != TextIndex::kNone;
}

std::vector<Reference> Installation::danglingReferences() const {
  std::vector<Reference> dangling;
  forEachReference([&](const Reference& reference) {
    if (!isDefined(reference.target, reference.name)) {
      dangling.push_back(reference);
    }
  });
  return dangling;
}

std::vector<Reference> Installation::referrersOf(const Entry& entry) const {
  Content::References& references = m_content->references;
  std::call_once(references.once, [&] {
    forEachReference([&](const Reference& reference) { references.all.push_back(reference); });
    for (std::uint32_t i = 0; i < references.all.size(); ++i) {
      references.byName[numberOf(references.all[i].target)].add(references.all[i].name, i);
    }
  });
  std::vector<std::uint32_t> numbers;
  const TextIndex& index = references.byName[numberOf(entry.kind())];
  const auto takeAll = [&](std::string_view name) {
    for (std::uint32_t node = index.first(name); node != TextIndex::kNone;
         node = index.next(node)) {
      numbers.push_back(index.value(node));
    }
  };
  if (entry.kind() != Kind::kVendorExtension) {
    takeAll(entry.kept->object->oidInPlace());
    for (const std::string& name : entry.kept->object->namesInPlace()) {
      takeAll(name);
    }
  }
  std::sort(numbers.begin(), numbers.end());
  numbers.erase(std::unique(numbers.begin(), numbers.end()), numbers.end());
  std::vector<Reference> found;
  found.reserve(numbers.size());
  for (const std::uint32_t number : numbers) {
    found.push_back(references.all[number]);
  }
  return found;
}

}  // namespace migration
