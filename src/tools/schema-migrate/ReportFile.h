// A page that a run writes beside its result, whole or not at all. One of an earlier run is
// replaced; nothing else is.

#ifndef SCHEMA_MIGRATE_REPORT_FILE_H
#define SCHEMA_MIGRATE_REPORT_FILE_H

#include <sys/stat.h>

#include <string>

#include "Directory.h"

class ReportFile {
 public:
  // Throws a Failure unless `path` names nothing, or a regular file that begins as `beginning`,
  // which whatever is written must do, too. Nothing is opened through a symbolic link.
  ReportFile(const std::string& path, std::string beginning);
  ~ReportFile();
  ReportFile(const ReportFile&) = delete;
  ReportFile& operator=(const ReportFile&) = delete;

  // Brings these bytes to the disk, beside the place; throws a Failure when that cannot be done.
  void write(const std::string& bytes);

  // Puts them in their place, at once. Throws a Failure, and leaves there what was there, when that
  // cannot be done.
  void put();

 private:
  [[noreturn]] void fail(const std::string& text) const;
  [[noreturn]] void failSystem(const std::string& text) const;
  bool look();
  void open();
  void nameIt();

  std::string m_path;
  std::string m_beginning;
  Directory m_parent;
  std::string m_name;
  std::string m_partial;  // its name before it is in its place; empty while it has none
  Descriptor m_file;
  mode_t m_mode = 0;  // of the file that is replaced
  bool m_replaces = false;
};

#endif  // SCHEMA_MIGRATE_REPORT_FILE_H
