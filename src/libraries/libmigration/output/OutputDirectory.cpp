#include "OutputDirectory.h"

#include <filesystem>

#include "OutputStop.h"
#include "OutputTexts.h"
#include "OutputWork.h"

namespace migration {

namespace {

// With a slash at its end, so that one path that begins as another lies in it.
std::string folderPath(const std::string& path) {
  return (std::filesystem::absolute(path) / "").lexically_normal().string();
}

bool begins(const std::string& text, const std::string& beginning) {
  return text.compare(0, beginning.size(), beginning) == 0;
}

}  // namespace

struct OutputDirectory::Parts {
  Removals own;  // for who has none
  std::optional<OutputWork> work;
};

OutputDirectory::OutputDirectory() : m_parts(std::make_unique<Parts>()) {}
OutputDirectory::~OutputDirectory() = default;

std::unique_ptr<OutputDirectory> OutputDirectory::open(const OutputOptions& options,
                                                       Removals* removals, Problems* problems) {
  std::unique_ptr<OutputDirectory> output(new OutputDirectory);
  try {
    output->m_parts->work.emplace(options, removals == nullptr ? &output->m_parts->own : removals,
                                  &problems->leftovers);
  } catch (const OutputStop& stop) {
    problems->failures.push_back(stop.failure);
    problems->isOfRequest = stop.isOfRequest;
    return nullptr;
  }
  return output;
}

bool OutputDirectory::fill(const std::vector<OutputText>& texts, Failures* failures) {
  return runToEnd([&] { writeTexts(texts, &*m_parts->work); }, failures);
}

bool OutputDirectory::verify(const std::vector<OutputText>& texts, Failures* failures) const {
  return runToEnd([&] { verifyAllTexts(*m_parts->work, texts); }, failures);
}

bool OutputDirectory::publish(Failures* failures) {
  return runToEnd([&] { m_parts->work->publish(); }, failures);
}

bool OutputDirectory::isPublished() const { return m_parts->work->isPublished(); }

std::string OutputDirectory::temporaryPath() const { return m_parts->work->directory().path(); }

bool areApart(const std::string& left, const std::string& right) {
  const std::string leftPath = folderPath(left);
  const std::string rightPath = folderPath(right);
  return !begins(leftPath, rightPath) && !begins(rightPath, leftPath);
}

}  // namespace migration
