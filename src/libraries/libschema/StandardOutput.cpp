#include "StandardOutput.h"

#include <iostream>

namespace libschema {

std::ostream& standardOutput() {
  static const std::ios_base::Init ready;
  return std::cout;
}

}  // namespace libschema
