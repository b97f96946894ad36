// Schemas of any size for the benchmark, the same for the same seed: an older, customised
// installation and a newer release, with names, OIDs, descriptions and lists as long as people
// write them. Of the definitions of the older one three quarters stand in the newer one alike, and
// a tenth changed; the rest is its own, and the newer one has some of its own as well. Names are
// not in the order of the OIDs. The user's files of the older installation are written in blocks.

#ifndef LIBSCHEMA_BENCH_GENERATOR_H
#define LIBSCHEMA_BENCH_GENERATOR_H

#include <cstddef>
#include <cstdint>
#include <string>

namespace bench {

constexpr std::uint64_t kSeed = 20011103;

// Writes the five files V3.system.at, V3.system.oc, V3.orv.at, V3.user.at and V3.user.oc into each
// of the two folders, which must exist. `count` definitions in all stand in the older one:
// attribute types and their vendor extensions in equal numbers, and eight object classes to the
// hundred. A third folder gets a base of the two, from which each of them differs. Returns false
// when a file could not be written.
bool generateSchemas(std::size_t count, std::uint64_t seed, const std::string& oldDirectory,
                     const std::string& newDirectory, const std::string& baseDirectory = "");

}  // namespace bench

#endif  // LIBSCHEMA_BENCH_GENERATOR_H
