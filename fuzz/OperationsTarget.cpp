// Operations between the managers of three related directories, against the rules step by step. The
// bytes choose the definitions and the operations.

#include "ManagerGroup.h"
#include "Target.h"

extern "C" int LLVMFuzzerTestOneInput(const std::uint8_t* data, std::size_t size) {
  fuzz::traceByLength(size);
  properties::ByteChoices choices(data, size);
  properties::RunCounts counts;
  fuzz::requireEqual("", properties::runOperations(&choices, fuzz::folder(), &counts),
                     "operations");
  return 0;
}
