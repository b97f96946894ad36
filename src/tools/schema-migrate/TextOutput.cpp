#include "TextOutput.h"

#include <algorithm>
#include <cerrno>
#include <cstddef>

#include "Descriptor.h"
#include "InputFile.h"
#include "Messages.h"

namespace {

using migration::NamedText;

void writeTo(const OwnDirectory& directory, const std::vector<NamedText>& texts) {
  for (const NamedText& text : texts) {
    const Descriptor file = directory.createFile(text.name, 0600);
    if (!file.isOpen() || !writeAll(file.number(), text.bytes)) {
      throw Failure(kNotWritten, errorLine(directory.directory().pathOf(text.name),
                                           "cannot be written: " + systemError(errno)));
    }
  }
}

std::string readBack(const Directory& directory, const std::string& name) {
  InputFile file(directory, name);
  std::string bytes;
  std::vector<char> buffer(std::size_t{1} << 16);
  while (const std::size_t count = file.read(buffer.data(), buffer.size())) {
    bytes.append(buffer.data(), count);
  }
  if (!file.problem().empty()) {
    throw Failure(kNotWritten,
                  errorLine(directory.pathOf(name), "cannot be read back: " + file.problem()));
  }
  return bytes;
}

// What stands in the output is the result, byte for byte, and nothing else.
void verify(const Directory& directory, const std::vector<NamedText>& texts) {
  std::vector<std::string> names;
  std::vector<std::string> wanted;
  for (const NamedText& text : texts) {
    wanted.push_back(text.name);
    if (readBack(directory, text.name) != text.bytes) {
      throw Failure(kNotWritten,
                    errorLine(directory.pathOf(text.name), "does not hold what was written to it"));
    }
  }
  std::sort(wanted.begin(), wanted.end());
  if (!directory.list(&names) || names != wanted) {
    throw Failure(kNotWritten,
                  errorLine(directory.path(), "holds other files than those that were written"));
  }
}

}  // namespace

void publishTexts(const std::vector<NamedText>& texts, const ModeOf& modeOf, PrivatePlace* place,
                  OutputDirectory* output) {
  const OwnDirectory& result = place->makeDirectory("result");
  writeTo(result, texts);
  output->create();
  for (const NamedText& text : texts) {
    output->copyIn(result.directory(), text.name, modeOf(text.name));
  }
  output->sync();
  verify(output->directory(), texts);
  output->publish();
}
