#include "Json.h"

#include <array>
#include <cstdio>
#include <cstdlib>

#include "Files.h"

bool canValidateJson() { return std::system("python3 -c 'import jsonschema' 2>/dev/null") == 0; }

std::string problemsOf(const std::string& document, const std::string& schema) {
  const support::TemporaryDirectory folder;
  const std::string file = folder.write("document.json", document);
  const std::string command = VALIDATE_JSON " '" + schema + "' '" + file + "' 2>&1";
  std::FILE* const pipe = ::popen(command.c_str(), "r");
  std::string problems;
  std::array<char, 4096> buffer{};
  while (std::fgets(buffer.data(), buffer.size(), pipe) != nullptr) {
    problems += buffer.data();
  }
  if (::pclose(pipe) != 0 && problems.empty()) {
    problems = "the validator failed\n";
  }
  return problems;
}
