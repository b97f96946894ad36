// SHA-256 of bytes, as documents show it.

#ifndef LIBSCHEMA_MIGRATION_DIGEST_H
#define LIBSCHEMA_MIGRATION_DIGEST_H

#include <string>
#include <string_view>

namespace migration {

// 64 hexadecimal digits in lower case.
std::string sha256Of(std::string_view bytes);

}  // namespace migration

#endif  // LIBSCHEMA_MIGRATION_DIGEST_H
