#include "ParserTarget.h"

extern "C" int LLVMFuzzerTestOneInput(const std::uint8_t* data, std::size_t size) {
  fuzz::parseBlock<Attribute, definitions::ReferenceAttribute>("attributetypes",
                                                               fuzz::textOf(data, size));
  return 0;
}
