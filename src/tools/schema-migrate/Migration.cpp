#include "Migration.h"

#include "Messages.h"
#include "SchemaFiles.h"

namespace {

std::unique_ptr<SchemaManager> readAll(const Inventory& inventory) {
  auto manager = std::make_unique<SchemaManager>(inventory.directory());
  for (const std::size_t file : kReadingOrder) {
    if (inventory.hasFile(file) && manager->readFile(kSchemaFiles[file]) != 0) {
      throw Failure(kBadInput,
                    errorLine(inventory.pathOf(file),
                              "cannot be read any more; try again when nothing writes to it"));
    }
  }
  return manager;
}

[[noreturn]] void failList(const std::string& path) {
  throw Failure(kBadInput, errorLine(path, "the list of OIDs cannot be read any more"));
}

// OLD without what the lists name, and without what NEW defines alike.
std::unique_ptr<SchemaManager> readCompared(const Installations& installations,
                                            SchemaManager* newOne) {
  std::unique_ptr<SchemaManager> manager = readAll(installations.oldOne);
  for (const std::string& list : installations.excludeLists) {
    if (manager->readExcludedOids(list) != 0) {
      failList(list);
    }
  }
  if (!installations.withdrawList.empty() &&
      manager->modifySchema(installations.withdrawList) != 0) {
    failList(installations.withdrawList);
  }
  manager->compSchemas(newOne);
  return manager;
}

}  // namespace

std::string reportCollisions(const Installations& installations) {
  const std::unique_ptr<SchemaManager> newOne = readAll(installations.newOne);
  const std::unique_ptr<SchemaManager> oldOne = readCompared(installations, newOne.get());
  oldOne->checkCollisions(newOne.get());
  return oldOne->getOcTable() + oldOne->getAttrTable() + oldOne->getORVAttrTable();
}

Migration::Migration(const Installations& installations) {
  m_merged = readAll(installations.newOne);
  std::unique_ptr<SchemaManager> oldOne = readCompared(installations, m_merged.get());
  if (!m_merged->mergeSchemas(oldOne.get())) {
    // Both hold the definitions of the interrupted pass now: neither may be destroyed.
    static_cast<void>(oldOne.release());
    static_cast<void>(m_merged.release());
    throw Failure(
        kRefused,
        errorLine(
            "the merge was refused; an input changed while it was read, so try again when nothing writes to it"));
  }
}

void Migration::write(const std::string& directory) {
  for (std::size_t file = 0; file < kWrittenFiles; ++file) {
    const std::string name = kSchemaFiles[file];
    if (m_merged->writeFile(directory, name) != 0) {
      throw Failure(
          kNotWritten,
          errorLine(directory + "/" + name,
                    "cannot be created; is there space left, and a right to write there?"));
    }
  }
}
