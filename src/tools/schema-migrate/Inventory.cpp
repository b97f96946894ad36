#include "Inventory.h"

#include <dirent.h>

#include <algorithm>
#include <cerrno>
#include <memory>

#include "DefinitionReader.h"
#include "InputFile.h"
#include "Messages.h"

namespace {

// Keeps where definitions begin, and reports oddities in the file `path`.
class Listener : public ForecastObserver {
 public:
  Listener(std::string path, std::string* warnings)
      : m_path(std::move(path)), m_warnings(warnings) {}

  void definition(DefinitionKind /*kind*/, const Position& begin) override {
    lines.push_back(begin.line);
  }

  void oddity(const Position& position, const std::string& problem) override {
    *m_warnings += warningLine(placeOf(m_path, position), problem);
  }

  std::vector<std::uint64_t> lines;

 private:
  std::string m_path;
  std::string* m_warnings;
};

struct CloseDirectory {
  void operator()(DIR* directory) const { ::closedir(directory); }
};

std::vector<std::string> namesIn(const std::string& role, const std::string& directory) {
  const std::unique_ptr<DIR, CloseDirectory> open(::opendir(directory.c_str()));
  if (open == nullptr) {
    throw Failure(kBadInput, errorLine(directory, "the directory of " + role +
                                                      " cannot be read: " + systemError(errno)));
  }
  std::vector<std::string> names;
  while (const dirent* entry = ::readdir(open.get())) {
    names.emplace_back(entry->d_name);
  }
  std::sort(names.begin(), names.end());
  return names;
}

}  // namespace

Inventory::Inventory(std::string role, std::string directory, std::string* warnings)
    : m_role(std::move(role)), m_directory(std::move(directory)) {
  findFiles(warnings);
  std::string problems;
  for (const std::size_t file : kReadingOrder) {
    if (m_hasFile[file]) {
      problems += readFile(file, warnings);
    }
  }
  if (!problems.empty()) {
    // What was odd may well be the cause of what is wrong.
    throw Failure(kBadInput, *warnings + problems);
  }
  makeDigests();
}

std::string Inventory::pathOf(std::size_t file) const {
  return m_directory + "/" + kSchemaFiles[file];
}

void Inventory::findFiles(std::string* warnings) {
  bool isAny = false;
  for (const std::string& name : namesIn(m_role, m_directory)) {
    const std::size_t file = schemaFileNumber(name);
    if (file != kNoSchemaFile) {
      m_hasFile[file] = true;
      isAny = true;
    } else if (name.compare(0, 3, "V3.") == 0) {
      *warnings += warningLine(
          m_directory + "/" + printable(name),
          "not read, since no schema file has this name; rename it if it belongs to the schema");
    }
  }
  if (!isAny) {
    throw Failure(
        kBadInput,
        errorLine(m_directory, "no V3.* schema file in the directory of " + m_role +
                                   "; name the directory that holds V3.system.at and its like"));
  }
}

// Returns the error line, or nothing.
std::string Inventory::readFile(std::size_t file, std::string* warnings) {
  const std::string path = pathOf(file);
  Listener listener(path, warnings);
  {
    InputFile input(path);
    Forecast forecast;
    if (input.problem().empty()) {
      forecast = foreseeReading(&input, &listener);
    }
    if (!input.problem().empty()) {
      return errorLine(path, "cannot be read: " + input.problem());
    }
    if (forecast.reading != Reading::kSucceeds) {
      return errorLine(placeOf(path, forecast.position), forecast.problem);
    }
    m_longestText = std::max(m_longestText, forecast.longestText);
  }
  return takeDefinitions(file, listener.lines);
}

std::string Inventory::takeDefinitions(std::size_t file, const std::vector<std::uint64_t>& lines) {
  m_definitions.reserve(m_definitions.size() + lines.size());
  const auto take = [&](DefinitionKind kind, bool isInBlock, std::unique_ptr<ORVSchema> object) {
    Definition& definition = m_definitions.emplace_back();
    definition.kind = kind;
    definition.file = file;
    definition.index = m_definitions.size() - 1;
    definition.line = m_counts[file] < lines.size() ? lines[m_counts[file]] : 0;
    definition.isInBlock = isInBlock;
    definition.inventory = this;
    definition.oid = object->getOid();
    definition.firstName = object->getFirstName();
    definition.key = object->getFirstNameLower();
    definition.object = std::move(object);
    ++m_counts[file];
  };
  const bool isRead = readDefinitions(m_directory, kSchemaFiles[file], take);
  if (!isRead || m_counts[file] != lines.size()) {
    return errorLine(pathOf(file),
                     "changed while it was read; try again when nothing writes to it");
  }
  return "";
}

void Inventory::makeDigests() {
  std::string line;
  line.reserve(m_longestText + kRestOfLine);
  for (Definition& definition : m_definitions) {
    definition.lineDigest = digestOfLine(definition.kind, definition.object.get(), &line);
  }
}

void Inventory::releaseObjects() {
  for (Definition& definition : m_definitions) {
    definition.object.reset();
  }
}
