// The decisions file that `decide` adds answers to. What stood in it is never changed: an answer is
// appended and brought to the disk, and taken back only as long as it is still the end of the file.

#ifndef SCHEMA_MIGRATE_ANSWER_FILE_H
#define SCHEMA_MIGRATE_ANSWER_FILE_H

#include <libschema-migration/Decisions.h>
#include <libschema-migration/Descriptor.h>

#include <cstddef>
#include <string>
#include <vector>

class AnswerFile {
 public:
  // Whether there is something of this name.
  static bool isThere(const std::string& path);

  // Opens the file, or creates it when there is none. Throws a Failure when it cannot be written,
  // is no regular file, or another run adds to it.
  explicit AnswerFile(std::string path);
  AnswerFile(const AnswerFile&) = delete;
  AnswerFile& operator=(const AnswerFile&) = delete;
  // Removes a file that it created when nothing stands in it.
  ~AnswerFile();

  const std::string& path() const { return m_path; }

  // Whether the file holds what it held when this object read it or wrote to it last.
  bool isUnchanged() const;
  // Takes what the file holds now, and forgets what could be taken back. Throws a Failure as the
  // constructor does.
  void reopen();

  // The decision as it would be read from the file with the entry at its end; what is wrong is in
  // *failures.
  migration::Decision readBack(const std::string& entry, migration::Failures* failures) const;

  // Throws a Failure when it cannot be written; then the file holds what it held before.
  void append(const std::string& entry);

  // Takes the last entry that was appended out of the file again. The file must be unchanged, and
  // there must be one.
  void takeBack();

 private:
  void open(bool isNew);
  void readWhole();
  std::string asAppended(const std::string& entry) const;
  void shorten(std::size_t size);

  std::string m_path;
  migration::Descriptor m_file;
  bool m_isCreated = false;
  std::string m_known;
  std::vector<std::size_t> m_sizes;  // of the file before each entry
};

#endif  // SCHEMA_MIGRATE_ANSWER_FILE_H
