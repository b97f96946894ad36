#include "HtmlOption.h"

#include <filesystem>

#include "CommandLine.h"
#include "HtmlReport.h"
#include "Interruption.h"
#include "Messages.h"
#include "Outputs.h"

namespace {

void failUnlessNone(const migration::Failures& failures) {
  if (!failures.empty()) {
    throw Failure(kNotWritten, errorLinesOf(failures));
  }
}

}  // namespace

void HtmlOption::declare(CLI::App* command) {
  command
      ->add_option("--html", m_path,
                   "write the report as a page for a browser, too; an earlier page is replaced")
      ->check(notEmpty())
      ->type_name("FILE");
}

void HtmlOption::refuseIn(const std::string& option, const std::string& directory) const {
  const auto whole = [](const std::string& path) {
    return std::filesystem::absolute(path).lexically_normal().string();
  };
  if (isWanted() && !directory.empty() && whole(m_path).rfind(whole(directory + "/"), 0) == 0) {
    throw Failure(kUsage, errorLine("--html " + m_path + " lies in the directory that " + option +
                                    " creates; name a file elsewhere"));
  }
}

void HtmlOption::open() {
  if (isWanted()) {
    migration::Failures failures;
    m_file = migration::NewFile::open(
        {m_path, migration::Over::kFileOfItsKind, kHtmlBeginning, "report of this program"},
        interruption::removals(), &failures);
    failUnlessNone(failures);
  }
}

void HtmlOption::write(const std::string& page) {
  migration::Failures failures;
  static_cast<void>(m_file->write(page, &failures) && m_file->put(&failures));
  failUnlessNone(failures);
}
