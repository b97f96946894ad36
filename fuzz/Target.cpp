#include "Target.h"

#include <libschema-migration/Kept.h>
#include <unistd.h>

#include <cstdio>
#include <cstdlib>
#include <filesystem>
#include <fstream>
#include <iostream>
#include <sstream>

#include "ldtr.h"

namespace fuzz {

namespace {

constexpr std::uint64_t kAllEvents = 0x0403f000;

class Folder {
 public:
  Folder() {
    const bool hasMemory = ::access("/dev/shm", W_OK | X_OK) == 0;
    const std::filesystem::path parent =
        hasMemory ? "/dev/shm" : std::filesystem::temp_directory_path();
    m_path = (parent / "libschema-fuzz-XXXXXX").string();
    require(::mkdtemp(m_path.data()) != nullptr, "no folder can be made in " + parent.string());
    // What a definition prints is of no interest.
    std::cout.rdbuf(nullptr);
  }
  ~Folder() {
    std::error_code ignored;
    std::filesystem::remove_all(m_path, ignored);
  }
  Folder(const Folder&) = delete;
  Folder& operator=(const Folder&) = delete;

  const std::string& path() const { return m_path; }

 private:
  std::string m_path;
};

}  // namespace

void traceByLength(std::size_t size) { trcEvents = size % 2 == 0 ? 0 : kAllEvents; }

std::string textOf(const std::uint8_t* data, std::size_t size) {
  traceByLength(size);
  return std::string(data, data + size);
}

void require(bool holds, const std::string& what) {
  if (!holds) {
    std::fprintf(stderr, "fuzzing target: %s\n", what.c_str());
    std::abort();
  }
}

void requireEqual(const std::string& expected, const std::string& actual, const std::string& what) {
  require(expected == actual, what + "\n--- expected\n" + expected + "\n--- is\n" + actual);
}

const std::string& folder() {
  static const Folder folder;
  return folder.path();
}

std::string write(const std::string& name, const std::string& text) {
  std::string path = folder() + "/" + name;
  std::ofstream out(path, std::ios::binary);
  out.write(text.data(), static_cast<std::streamsize>(text.size()));
  out.close();
  require(out.good(), path + " cannot be written");
  return path;
}

std::string read(const std::string& path) {
  std::ifstream in(path, std::ios::binary);
  require(in.is_open(), path + " cannot be read");
  std::ostringstream text;
  text << in.rdbuf();
  return text.str();
}

namespace {

migration::ReadingEnd endOf(const std::string& text) {
  const migration::Source source("V3.user.at", text);
  return migration::KeptFile(source).ending();
}

}  // namespace

bool neverEnds(const std::string& text) { return endOf(text) == migration::ReadingEnd::kNeverEnds; }

bool isReadWhole(const std::string& text) { return endOf(text) == migration::ReadingEnd::kWhole; }

}  // namespace fuzz
