// Runs a target over files instead of made-up inputs: those named on the command line, and all
// files in the folders named there. Fails when there is none.

#include <algorithm>
#include <cstdio>
#include <filesystem>
#include <string>
#include <vector>

#include "Target.h"

namespace {

std::vector<std::filesystem::path> filesIn(const std::filesystem::path& place) {
  if (!std::filesystem::is_directory(place)) {
    return {place};
  }
  std::vector<std::filesystem::path> files;
  for (const auto& entry : std::filesystem::recursive_directory_iterator(place)) {
    if (entry.is_regular_file()) {
      files.push_back(entry.path());
    }
  }
  std::sort(files.begin(), files.end());
  return files;
}

}  // namespace

int main(int count, char** arguments) {
  int inputs = 0;
  for (int i = 1; i < count; ++i) {
    for (const std::filesystem::path& file : filesIn(arguments[i])) {
      const std::string text = fuzz::read(file);
      std::fprintf(stderr, "%s, %zu bytes\n", file.c_str(), text.size());
      const std::vector<std::uint8_t> bytes(text.begin(), text.end());
      LLVMFuzzerTestOneInput(bytes.data(), bytes.size());
      ++inputs;
    }
  }
  std::fprintf(stderr, "%d inputs\n", inputs);
  return inputs == 0 ? 1 : 0;
}
