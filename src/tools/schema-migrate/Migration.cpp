#include "Migration.h"

#include "Messages.h"
#include "SchemaFiles.h"

namespace {

std::unique_ptr<SchemaManager> readAll(const Inventory& inventory) {
  auto manager = std::make_unique<SchemaManager>(inventory.directory());
  for (const std::size_t file : kReadingOrder) {
    if (inventory.hasFile(file) && manager->readFile(kSchemaFiles[file]) != 0) {
      throw Failure(kNotWritten,
                    errorLine(inventory.pathOf(file), "its private copy cannot be read any more"));
    }
  }
  return manager;
}

[[noreturn]] void failList(const ListFile& list) {
  throw Failure(kNotWritten, errorLine(list.path, "its private copy cannot be read any more"));
}

// OLD without what the lists name, and without what NEW defines alike.
std::unique_ptr<SchemaManager> readCompared(const Installations& installations,
                                            SchemaManager* newOne) {
  std::unique_ptr<SchemaManager> manager = readAll(installations.oldOne);
  for (const ListFile* const list : installations.excludeLists) {
    if (manager->readExcludedOids(list->copy) != 0) {
      failList(*list);
    }
  }
  const ListFile* const withdrawn = installations.withdrawList;
  if (withdrawn != nullptr && manager->modifySchema(withdrawn->copy) != 0) {
    failList(*withdrawn);
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
        errorLine("the merge was refused, though it was worked out; nothing was written"));
  }
}

void Migration::write(const std::string& directory) {
  for (std::size_t file = 0; file < kWrittenFiles; ++file) {
    const std::string name = kSchemaFiles[file];
    if (m_merged->writeFile(directory, name) != 0) {
      throw Failure(kNotWritten,
                    errorLine(directory + "/" + name,
                              "cannot be created; is there space left for private copies?"));
    }
  }
}
