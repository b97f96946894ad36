// generate-schema COUNT OLD NEW [SEED]: writes a pair of installations for the benchmark into the
// folders OLD and NEW, which it makes.

#include <cstdlib>
#include <filesystem>
#include <iostream>
#include <string>

#include "Generator.h"

int main(int argc, char** argv) {
  if (argc < 4 || argc > 5) {
    std::cerr << "usage: generate-schema COUNT OLD NEW [SEED]\n";
    return 2;
  }
  const std::size_t count = std::strtoull(argv[1], nullptr, 10);
  const std::uint64_t seed = argc == 5 ? std::strtoull(argv[4], nullptr, 10) : bench::kSeed;
  std::error_code error;
  std::filesystem::create_directories(argv[2], error);
  std::filesystem::create_directories(argv[3], error);
  if (!bench::generateSchemas(count, seed, argv[2], argv[3])) {
    std::cerr << "generate-schema: cannot write the files\n";
    return 1;
  }
  return 0;
}
