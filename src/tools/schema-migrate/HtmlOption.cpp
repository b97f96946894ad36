#include "HtmlOption.h"

#include "CommandLine.h"
#include "HtmlReport.h"

void HtmlOption::declare(CLI::App* command) {
  command
      ->add_option("--html", m_path,
                   "write the report as a page for a browser, too; an earlier page is replaced")
      ->check(notEmpty())
      ->type_name("FILE");
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
