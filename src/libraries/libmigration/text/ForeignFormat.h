// Recognises by its content a file that is no schema file at all.

#ifndef LIBSCHEMA_MIGRATION_FOREIGN_FORMAT_H
#define LIBSCHEMA_MIGRATION_FOREIGN_FORMAT_H

#include <cstdint>
#include <string_view>

namespace migration {

enum class ForeignFormat : std::uint8_t {
  kNone,
  kUtf16,       // in either byte order, with its mark or without
  kCompressed,  // by gzip, bzip2, xz, zstd, compress, or in a zip archive
  kXml,
  kJson,
  kLdif,
  kServerSchema  // a schema in the style of a server's configuration: "attributetype ( … )"
};

// What the bytes are by their beginning, comments and empty lines left out.
ForeignFormat foreignFormatOf(std::string_view bytes);

// "an LDIF file", as messages have it; empty for none.
std::string_view nameOf(ForeignFormat format);

}  // namespace migration

#endif  // LIBSCHEMA_MIGRATION_FOREIGN_FORMAT_H
