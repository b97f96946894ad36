// Where what only OLD has goes.

#include <string_view>
#include <unordered_map>

#include "RuleSupport.h"
#include "ThreeWay.h"

namespace migration {

namespace {

// The file whose set the merge puts an OID of OLD into: the first of these that has it.
class FilesOfAdditions {
 public:
  explicit FilesOfAdditions(const Installation& old) {
    for (const char* const name :
         {"V3.user.oc", "V3.user.at", "V3.orv.oc", "V3.orv.at", "V3.system.oc", "V3.system.at"}) {
      if (const SchemaFile* const file = old.file(name)) {
        for (const KeptDefinition& definition : file->kept->definitions()) {
          if (definition.isEntered) {
            m_files.emplace(definition.object->oidInPlace(), name);
          }
        }
      }
    }
  }

  const char* of(const Entry& entry) const {
    const auto found = m_files.find(oidOf(entry));
    return found != m_files.end()               ? found->second
           : entry.kind() == Kind::kObjectClass ? "V3.user.oc"
                                                : "V3.user.at";
  }

 private:
  std::unordered_map<std::string_view, const char*> m_files;
};

}  // namespace

void placeAdditions(const Installation& old, std::vector<Verdict>* differences) {
  const FilesOfAdditions files(old);
  for (Verdict& row : *differences) {
    if (row.isCarried() && row.match.latest == nullptr) {
      row.file = files.of(row.entry());
    }
  }
}

}  // namespace migration
