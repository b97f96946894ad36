// Standard output, for the dumps. Internal: included by .cpp files only.

#ifndef LIBSCHEMA_STANDARD_OUTPUT_H
#define LIBSCHEMA_STANDARD_OUTPUT_H

#include <ostream>

namespace libschema {

// std::cout, ready also in the constructor of a static object.
std::ostream& standardOutput();

}  // namespace libschema

#endif  // LIBSCHEMA_STANDARD_OUTPUT_H
