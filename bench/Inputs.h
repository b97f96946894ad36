// What is measured on: pairs of installations, and folders and files for the time of a run.

#ifndef LIBSCHEMA_BENCH_INPUTS_H
#define LIBSCHEMA_BENCH_INPUTS_H

#include <string>
#include <vector>

namespace bench {

// A new folder that goes, with all that is in it, when the object does.
class TemporaryFolder {
 public:
  TemporaryFolder();
  ~TemporaryFolder();
  TemporaryFolder(const TemporaryFolder&) = delete;
  TemporaryFolder& operator=(const TemporaryFolder&) = delete;

  const std::string& path() const { return m_path; }
  // Makes a folder in it and returns its path.
  std::string folder(const std::string& name) const;

 private:
  std::string m_path;
};

void writeText(const std::string& path, const std::string& text);
std::string readText(const std::string& path);

// Some files of a folder, with what is in them.
struct FileList {
  std::string directory;
  std::vector<std::string> names;
  double bytes = 0;
  double definitions = 0;
};

enum class Origin { kExample, kReal, kGenerated };

struct Input {
  std::string name;
  Origin origin = Origin::kReal;
  std::string older;
  std::string newer;
  std::string base;      // what both came from; "" for none
  std::string excluded;  // lists of OIDs for the older one, "" for none
  std::string withdrawn;
  FileList olderFiles;
  FileList newerFiles;
  // What the readings read: every file, and those without vendor extensions.
  std::vector<FileList> all;
  std::vector<FileList> plain;
};

// The V3.* files that a manager can read, and those that it can write.
extern const std::vector<std::string> kReadable;
extern const std::vector<std::string> kWritable;

// Every V3.* file that is in the folder; `isPlain`: without vendor extensions only.
FileList filesOf(const std::string& directory, bool isPlain);

// Fills in what the readings read: both folders, but of a generated pair the older one alone, which
// has as many definitions as its name says.
Input makeInput(std::string name, Origin origin, std::string older, std::string newer);

}  // namespace bench

#endif  // LIBSCHEMA_BENCH_INPUTS_H
