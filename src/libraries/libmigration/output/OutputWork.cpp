#include "OutputWork.h"

#include <fcntl.h>
#include <unistd.h>

#include <cerrno>
#include <cstdio>
#include <utility>

#include "OutputStop.h"

namespace migration {

OutputWork::OutputWork(const OutputOptions& options, Removals* removals, Failures* leftovers)
    : m_place(options, leftovers),
      m_mask(options.mask),
      m_removals(removals),
      m_noun(options.noun) {}

void OutputWork::create() {
  const std::string problem =
      m_own.makeUnique(m_place.parent(), m_place.partialPrefix(), m_removals);
  if (!problem.empty()) {
    stopOutput(m_place.path(), "the " + m_noun + " cannot be created in " +
                                   m_place.parent().path() + ": " + problem);
  }
  m_own.setPlace(m_place.name());
}

// What is in it goes with the directory.
void OutputWork::makeFolder(const std::string& name) {
  const std::string path = directory().pathOf(name);
  if (::mkdirat(directory().number(), name.c_str(), 0700) != 0) {
    stopOutputOfSystem(path, "cannot be created");
  }
  Directory folder = directory().open(name);
  if (!folder.isOpen()) {
    stopOutputOfSystem(path, "cannot be opened");
  }
  m_folders.emplace(name, std::move(folder));
}

const Directory& OutputWork::folder(const std::string& name) const {
  return name.empty() ? directory() : m_folders.at(name);
}

void OutputWork::write(const OutputText& text) {
  const Directory& parent = folder(text.folder);
  const std::string path = parent.pathOf(text.name);
  Descriptor file(::openat(parent.number(), text.name.c_str(),
                           O_WRONLY | O_CREAT | O_EXCL | O_NOFOLLOW | O_CLOEXEC,
                           text.mode ? 0600 : 0666));
  if (!file.isOpen()) {
    stopOutputOfSystem(path, "cannot be created");
  }
  if (!writeAll(file.number(), text.bytes)) {
    stopOutputOfSystem(path, "cannot be written");
  }
  if (text.mode && ::fchmod(file.number(), *text.mode) != 0) {
    stopOutputOfSystem(path, "its mode cannot be set");
  }
  m_files.push_back({path, std::move(file)});
}

// All are on their way before the first is waited for, so that they go to the disk together.
void OutputWork::sync() {
  for (const Written& written : m_files) {
    static_cast<void>(::sync_file_range(written.file.number(), 0, 0, SYNC_FILE_RANGE_WRITE));
  }
  for (const Written& written : m_files) {
    if (::fsync(written.file.number()) != 0) {
      stopOutputOfSystem(written.path, "cannot be brought to the disk");
    }
    // What is read back then comes from the disk. Not every file system does so, and none has to.
    static_cast<void>(::posix_fadvise(written.file.number(), 0, 0, POSIX_FADV_DONTNEED));
  }
  m_files.clear();
}

// Owner and mode of the empty directory that it replaces, or the mode of any new directory, which
// has the bit that hands the group down when its parent has it.
void OutputWork::giveAttributes() {
  const struct stat own = directory().status();
  mode_t mode = (0777 & ~m_mask) | (own.st_mode & S_ISGID);
  if (m_place.replacesEmpty()) {
    const struct stat& replaced = m_place.replaced();
    mode = replaced.st_mode & 07777;
    const bool isOther = own.st_uid != replaced.st_uid || own.st_gid != replaced.st_gid;
    if (isOther && ::fchown(directory().number(), replaced.st_uid, replaced.st_gid) != 0) {
      stopOutputOfSystem(
          m_place.path(),
          "the owner of the empty directory cannot be given to the one that replaces it");
    }
  }
  if (::fchmod(directory().number(), mode) != 0) {
    stopOutputOfSystem(directory().path(), "its mode cannot be set");
  }
}

void OutputWork::publish() {
  giveAttributes();
  for (const auto& [name, folder] : m_folders) {
    if (::fchmod(folder.number(), 0777 & ~m_mask) != 0 || ::fsync(folder.number()) != 0) {
      stopOutputOfSystem(folder.path(), "cannot be brought to the disk");
    }
  }
  if (::fsync(directory().number()) != 0) {
    stopOutputOfSystem(directory().path(), "cannot be brought to the disk");
  }
  if (!m_own.isAtItsName()) {
    stopOutput(
        directory().path(),
        "something else was put in the place of this directory while the run was under way; nothing was published");
  }
  if (!m_place.isParentAtItsPath()) {
    stopOutput(
        m_place.parent().path(),
        "something else was put in the place of this directory while the run was under way; nothing was published");
  }
  rename();
  if (!m_place.holds(m_own.identity())) {
    takeBack();
    stopOutput(
        m_place.path(),
        "something else was put in the place of this run's directory while it was renamed; nothing was published, and what is there is not the output of this run");
  }
  m_own.keep();
  m_isPublished = true;
  if (::fsync(m_place.parent().number()) != 0) {
    stopOutputOfSystem(m_place.path(),
                       "is complete and in place, but its entry cannot be brought to the disk");
  }
}

// Never over anything but an empty directory: a plain rename of a directory does not either.
void OutputWork::rename() {
  const int parent = m_place.parent().number();
  const char* const from = m_own.name().c_str();
  const char* const to = m_place.name().c_str();
  int result = -1;
  if (!m_place.replacesEmpty()) {
    result = ::renameat2(parent, from, parent, to, RENAME_NOREPLACE);
  }
  if (m_place.replacesEmpty() || (result != 0 && (errno == EINVAL || errno == ENOSYS))) {
    result = ::renameat(parent, from, parent, to);
  }
  if (result != 0 && (errno == EEXIST || errno == ENOTEMPTY)) {
    stopOutput(m_place.path(),
               "something else was put there while this run was under way; it was left alone");
  }
  if (result != 0) {
    stopOutputOfSystem(m_place.path(), "the finished directory cannot be renamed to this");
  }
}

// What was renamed, which is not this run's directory, gets back the name that it had, or, when
// that is taken by now, another one of its kind.
void OutputWork::takeBack() {
  const int parent = m_place.parent().number();
  const std::string other = m_place.partialPrefix() + randomSuffix();
  for (const std::string& name : {m_own.name(), other}) {
    if (::renameat2(parent, m_place.name().c_str(), parent, name.c_str(), RENAME_NOREPLACE) == 0) {
      return;
    }
  }
}

}  // namespace migration
