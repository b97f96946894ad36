#include "WithoutTypeInformation.h"

namespace {

class Plain : public SchemaLexan {
 public:
  Plain(const std::string& directory, const std::string& fileName)
      : SchemaLexan(directory, fileName) {
    m_scratch_index = m_symtable->insertValue(std::string("extra"), 777, true) + 1;
  }
};

}  // namespace

std::unique_ptr<SchemaLexan> analyserWithoutTypeInformation(const std::string& directory,
                                                            const std::string& fileName) {
  return std::make_unique<Plain>(directory, fileName);
}
