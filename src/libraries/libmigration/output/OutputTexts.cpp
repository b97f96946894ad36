#include "OutputTexts.h"

#include <fcntl.h>
#include <unistd.h>

#include <algorithm>
#include <cerrno>
#include <cstdint>
#include <set>
#include <string_view>

#include "OutputStop.h"

namespace migration {

namespace {

// How far a file is what it has to be.
struct Comparison {
  std::size_t same = 0;    // bytes at its beginning
  bool isAtItsEnd = true;  // it ends there
  int error = 0;           // when it cannot be read
};

Comparison compare(const Directory& directory, const OutputText& wanted) {
  constexpr int kFlags = O_RDONLY | O_NOFOLLOW | O_NONBLOCK | O_CLOEXEC;
  const Descriptor file(::openat(directory.number(), wanted.name.c_str(), kFlags));
  Comparison result;
  if (!file.isOpen()) {
    result.error = errno;
    return result;
  }
  std::vector<char> buffer(std::size_t{1} << 16);
  for (;;) {
    const ssize_t count = ::read(file.number(), buffer.data(), buffer.size());
    if (count < 0 && errno == EINTR) {
      continue;
    }
    if (count <= 0) {
      result.error = count < 0 ? errno : 0;
      return result;
    }
    const std::string_view found(buffer.data(), static_cast<std::size_t>(count));
    const std::string_view rest = std::string_view(wanted.bytes).substr(result.same);
    const auto common = static_cast<std::ptrdiff_t>(std::min(found.size(), rest.size()));
    const auto end = std::mismatch(found.begin(), found.begin() + common, rest.begin()).first;
    result.same += static_cast<std::size_t>(end - found.begin());
    if (end != found.end()) {
      result.isAtItsEnd = false;
      return result;
    }
  }
}

void verify(const Directory& directory, const OutputText& wanted) {
  const std::string path = directory.pathOf(wanted.name);
  const Comparison result = compare(directory, wanted);
  if (result.error != 0) {
    stopOutput(path, "cannot be read back: " + textOfError(result.error));
  }
  if (!result.isAtItsEnd) {
    const auto end = wanted.bytes.begin() + static_cast<std::ptrdiff_t>(result.same);
    const auto line = 1 + std::count(wanted.bytes.begin(), end, '\n');
    throw OutputStop{{path, static_cast<std::uint64_t>(line), 0, "",
                      "does not hold what was written; is the disk in order?"}};
  }
  if (result.same != wanted.bytes.size()) {
    stopOutput(path, "was not written completely: it has " + std::to_string(result.same) + " of " +
                         std::to_string(wanted.bytes.size()) +
                         (wanted.bytes.size() == 1 ? " byte" : " bytes") +
                         "; is there space left on the file system?");
  }
}

// What is in this folder of the output.
void verifyFolder(const Directory& directory, const std::vector<OutputText>& texts,
                  const std::string& folder) {
  std::set<std::string> expected;
  for (const OutputText& text : texts) {
    if (text.folder == folder) {
      verify(directory, text);
      expected.insert(text.name);
    } else if (folder.empty()) {
      expected.insert(text.folder);
    }
  }
  const std::vector<std::string> wanted(expected.begin(), expected.end());
  std::vector<std::string> names;
  if (!directory.list(&names)) {
    stopOutput(directory.path(), "cannot be read back: " + textOfError(errno));
  }
  if (names != wanted) {
    stopOutput(directory.path(), "holds other files than those that were written");
  }
}

}  // namespace

void verifyAllTexts(const OutputWork& output, const std::vector<OutputText>& texts) {
  std::set<std::string> folders = {""};
  for (const OutputText& text : texts) {
    folders.insert(text.folder);
  }
  for (const std::string& folder : folders) {
    verifyFolder(output.folder(folder), texts, folder);
  }
}

void writeTexts(const std::vector<OutputText>& texts, OutputWork* output) {
  output->create();
  std::set<std::string> folders;
  for (const OutputText& text : texts) {
    if (!text.folder.empty() && folders.insert(text.folder).second) {
      output->makeFolder(text.folder);
    }
    output->write(text);
  }
  output->sync();
  verifyAllTexts(*output, texts);
}

}  // namespace migration
