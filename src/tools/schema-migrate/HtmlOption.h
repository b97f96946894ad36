// --html, which several commands have.

#ifndef SCHEMA_MIGRATE_HTML_OPTION_H
#define SCHEMA_MIGRATE_HTML_OPTION_H

#include <libschema-migration/NewFile.h>

#include <CLI/CLI.hpp>
#include <memory>
#include <string>

class HtmlOption {
 public:
  // Adds it to a command; it refers to this object.
  void declare(CLI::App* command);

  bool isWanted() const { return !m_path.empty(); }

  // Throws a Failure, a wrong command line, when the page would lie in the directory that `option`
  // creates; an empty one is none.
  void refuseIn(const std::string& option, const std::string& directory) const;

  // To be called before the work is done: throws a Failure where no page can be written. Does
  // nothing when none is wanted.
  void open();
  // Puts the page in its place, whole; throws a Failure when that cannot be done.
  void write(const std::string& page);

 private:
  std::string m_path;
  std::unique_ptr<migration::NewFile> m_file;
};

#endif  // SCHEMA_MIGRATE_HTML_OPTION_H
