#include "Inputs.h"

#include <cstdlib>
#include <filesystem>
#include <fstream>
#include <iterator>
#include <stdexcept>
#include <utility>

#include "floor/Tokenizer.h"

namespace bench {

namespace {

// Definitions as a reader meets them: parentheses that are in no others, between two definition
// keywords or braces.
double countDefinitions(const std::string& path) {
  minimal::FileText file;
  if (!file.read(path)) {
    return 0;
  }
  double count = 0;
  int depth = 0;
  minimal::Tokenizer input(file);
  for (minimal::Token token = input.next(); token != minimal::kEnd; token = input.next()) {
    count += token == minimal::kOpen && depth == 0 ? 1 : 0;
    depth += token == minimal::kOpen ? 1 : token == minimal::kClose ? -1 : 0;
  }
  return count;
}

bool hasExtensions(const std::string& text) {
  return text.find("ORVAttributetypes") != std::string::npos ||
         text.find("ORVattributeTypes") != std::string::npos;
}

}  // namespace

TemporaryFolder::TemporaryFolder()
    : m_path((std::filesystem::temp_directory_path() / "schema-bench-XXXXXX").string()) {
  if (::mkdtemp(m_path.data()) == nullptr) {
    throw std::runtime_error("cannot make a temporary folder");
  }
}

TemporaryFolder::~TemporaryFolder() {
  std::error_code error;
  std::filesystem::remove_all(m_path, error);
}

std::string TemporaryFolder::folder(const std::string& name) const {
  const std::string path = m_path + "/" + name;
  std::filesystem::create_directories(path);
  return path;
}

void writeText(const std::string& path, const std::string& text) {
  std::ofstream out(path, std::ios::binary);
  out << text;
  out.close();
  if (!out.good()) {
    throw std::runtime_error("cannot write " + path);
  }
}

std::string readText(const std::string& path) {
  std::ifstream in(path, std::ios::binary);
  return {std::istreambuf_iterator<char>(in), std::istreambuf_iterator<char>()};
}

const std::vector<std::string> kReadable = {"V3.system.at", "V3.system.oc", "V3.orv.at",
                                            "V3.orv.oc",    "V3.user.at",   "V3.user.oc",
                                            "V3.config.at", "V3.config.oc", "V3.modifiedschema"};

const std::vector<std::string> kWritable = {"V3.system.at",     "V3.system.oc", "V3.orv.at",
                                            "V3.orv.oc",        "V3.user.at",   "V3.user.oc",
                                            "V3.modifiedschema"};

FileList filesOf(const std::string& directory, bool isPlain) {
  FileList list;
  list.directory = directory;
  for (const std::string& name : kReadable) {
    const std::string path = directory + "/" + name;
    if (!std::filesystem::is_regular_file(path) || (isPlain && hasExtensions(readText(path)))) {
      continue;
    }
    list.names.push_back(name);
    list.bytes += static_cast<double>(std::filesystem::file_size(path));
    list.definitions += countDefinitions(path);
  }
  return list;
}

Input makeInput(std::string name, Origin origin, std::string older, std::string newer) {
  Input input;
  input.name = std::move(name);
  input.origin = origin;
  input.older = std::move(older);
  input.newer = std::move(newer);
  input.olderFiles = filesOf(input.older, false);
  input.newerFiles = filesOf(input.newer, false);
  input.all.push_back(input.olderFiles);
  input.plain.push_back(filesOf(input.older, true));
  if (origin != Origin::kGenerated) {
    input.all.push_back(input.newerFiles);
    input.plain.push_back(filesOf(input.newer, true));
  }
  return input;
}

}  // namespace bench
