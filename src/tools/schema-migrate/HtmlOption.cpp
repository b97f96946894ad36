#include "HtmlOption.h"

#include <filesystem>

#include "CommandLine.h"
#include "HtmlReport.h"
#include "Messages.h"

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
    m_file.emplace(m_path, kHtmlBeginning);
  }
}

void HtmlOption::write(const std::string& page) {
  m_file->write(page);
  m_file->put();
}
