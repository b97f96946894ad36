#include "Inventory.h"

#include <algorithm>
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

}  // namespace

Inventory::Inventory(const Installation& installation, std::string* warnings)
    : m_installation(installation) {
  std::string problems;
  for (const std::size_t file : kReadingOrder) {
    if (hasFile(file)) {
      problems += readFile(file, warnings);
    }
  }
  if (!problems.empty()) {
    // What was odd may well be the cause of what is wrong.
    throw Failure(kBadInput, *warnings + problems);
  }
  makeDigests();
}

// Returns the error line, or nothing.
std::string Inventory::readFile(std::size_t file, std::string* warnings) {
  const std::string path = pathOf(file);
  if (!m_installation.files[file].problem.empty()) {
    return errorLine(path, "cannot be read: " + m_installation.files[file].problem);
  }
  Listener listener(path, warnings);
  {
    InputFile input(directory() + "/" + kSchemaFiles[file]);
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
  const bool isRead = readDefinitions(directory(), kSchemaFiles[file], take);
  if (!isRead || m_counts[file] != lines.size()) {
    return errorLine(pathOf(file), "its private copy cannot be read any more");
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
