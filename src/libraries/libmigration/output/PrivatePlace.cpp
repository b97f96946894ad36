#include "PrivatePlace.h"

#include <sys/statvfs.h>
#include <unistd.h>

#include <cerrno>
#include <cstdlib>
#include <ctime>
#include <list>
#include <utility>

#include "Directory.h"
#include "OutputStop.h"
#include "OwnDirectory.h"

namespace migration {

namespace {

// A run that has made its place a moment ago may not have locked it yet.
constexpr std::time_t kMoment = 60;  // seconds

std::string resolved(const std::string& path) {
  const std::unique_ptr<char, decltype(&std::free)> text(::realpath(path.c_str(), nullptr),
                                                         &std::free);
  return text == nullptr ? std::string() : std::string(text.get());
}

bool leadsTo(const std::string& path, const FileIdentity& identity) {
  struct stat status {};
  return ::stat(path.c_str(), &status) == 0 && FileIdentity::of(status) == identity;
}

// A file system without limits tells that it has no blocks.
bool hasRoom(const Directory& directory, std::uint64_t bytes) {
  struct statvfs status {};
  return ::fstatvfs(directory.number(), &status) == 0 &&
         (status.f_blocks == 0 ||
          static_cast<std::uint64_t>(status.f_bavail) * status.f_frsize >= bytes);
}

// Entries of a directory whose owner is one of the two, or that is sticky, can be renamed by the
// two only if they are theirs.
bool isSafeToLieIn(const struct stat& status) {
  const bool isOwn = status.st_uid == 0 || status.st_uid == ::geteuid();
  const bool isOpen = (status.st_mode & (S_IWGRP | S_IWOTH)) != 0;
  return isOwn && (!isOpen || (status.st_mode & S_ISVTX) != 0);
}

}  // namespace

bool isBeyondOthers(const std::string& path) {
  std::string directory = resolved(path);
  if (directory.empty()) {
    return false;
  }
  struct stat status {};
  if (::lstat(directory.c_str(), &status) != 0 ||
      (status.st_uid != 0 && status.st_uid != ::geteuid())) {
    return false;
  }
  while (directory != "/") {
    const std::size_t slash = directory.rfind('/');
    directory.resize(slash == 0 ? 1 : slash);
    if (::lstat(directory.c_str(), &status) != 0 || !isSafeToLieIn(status)) {
      return false;
    }
  }
  return true;
}

// The place itself, whose making is stopped (OutputStop) where it cannot be done.
class PrivatePlace::Parts {
 public:
  void make(const PrivatePlaceOptions& options, Removals* removals, Failures* leftovers);
  void makeFolder(const std::string& name);

  const std::string& path() const { return m_path; }
  const std::string& shownPath() const { return m_own.directory().path(); }

 private:
  bool tryCandidate(const std::string& candidate, const PrivatePlaceOptions& options,
                    bool needsRoom);
  bool findPath(const std::string& openFiles);
  void findLeftovers(const std::string& prefix, Failures* leftovers) const;

  Removals m_ownRemovals;  // for who has none
  Removals* m_removals = &m_ownRemovals;
  std::string m_problems;  // of each candidate
  Directory m_base{Descriptor(), ""};
  OwnDirectory m_own;
  std::string m_path;
  std::list<OwnDirectory> m_directories;
};

void PrivatePlace::Parts::make(const PrivatePlaceOptions& options, Removals* removals,
                               Failures* leftovers) {
  if (removals != nullptr) {
    m_removals = removals;
  }
  for (const bool needsRoom : {true, false}) {
    for (const std::string& candidate : options.candidates) {
      if (tryCandidate(candidate, options, needsRoom)) {
        findLeftovers(options.prefix, leftovers);
        return;
      }
    }
  }
  stopOutput("",
             "no place can be had for the private copies of the files that are read and written" +
                 m_problems + "; " + options.advice);
}

bool PrivatePlace::Parts::tryCandidate(const std::string& candidate,
                                       const PrivatePlaceOptions& options, bool needsRoom) {
  m_base = Directory(candidate);
  std::string problem;
  if (!m_base.isOpen()) {
    problem = textOfError(errno);
  } else if (needsRoom && !hasRoom(m_base, options.room)) {
    return false;
  } else {
    problem = m_own.makeUnique(m_base, options.prefix, m_removals);
    if (problem.empty() && findPath(options.openFiles)) {
      return true;
    }
  }
  if (problem.empty()) {
    m_own.remove();
    problem = "other users can rename what is in it, or above it";
  }
  if (!needsRoom) {
    m_problems += "; " + candidate + ": " + problem;
  }
  return false;
}

bool PrivatePlace::Parts::findPath(const std::string& openFiles) {
  m_path = openFiles + "/" + std::to_string(m_own.directory().number());
  if (leadsTo(m_path, m_own.identity())) {
    return true;
  }
  m_path = resolved(m_own.directory().path());
  return leadsTo(m_path, m_own.identity()) && isBeyondOthers(m_path);
}

void PrivatePlace::Parts::findLeftovers(const std::string& prefix, Failures* leftovers) const {
  std::vector<std::string> names;
  if (!m_base.list(&names)) {
    stopOutputOfSystem(m_base.path(), "cannot be read");
  }
  for (const std::string& name : names) {
    struct stat status {};
    const bool isOwn = name.compare(0, prefix.size(), prefix) == 0 && name != m_own.name() &&
                       m_base.look(name, &status) && S_ISDIR(status.st_mode) &&
                       status.st_uid == ::geteuid() &&
                       status.st_mtime + kMoment < std::time(nullptr);
    if (isOwn && useOf(m_base, name) == Use::kLeftBehind) {
      leftovers->push_back(
          {m_base.pathOf(name), 0, 0, "",
           "private copies left behind by a run that was killed; they are not used, and can be removed"});
    }
  }
}

void PrivatePlace::Parts::makeFolder(const std::string& name) {
  const std::string problem =
      m_directories.emplace_back().make(m_own.directory(), name, m_removals);
  if (!problem.empty()) {
    m_directories.pop_back();
    stopOutput(m_own.directory().pathOf(name), "cannot be created: " + problem);
  }
}

PrivatePlace::PrivatePlace() : m_parts(std::make_unique<Parts>()) {}
PrivatePlace::~PrivatePlace() = default;

std::unique_ptr<PrivatePlace> PrivatePlace::make(const PrivatePlaceOptions& options,
                                                 Removals* removals, Failures* failures,
                                                 Failures* leftovers) {
  std::unique_ptr<PrivatePlace> place(new PrivatePlace);
  const bool isMade =
      runToEnd([&] { place->m_parts->make(options, removals, leftovers); }, failures);
  return isMade ? std::move(place) : nullptr;
}

const std::string& PrivatePlace::path() const { return m_parts->path(); }

std::string PrivatePlace::pathOf(const std::string& name) const { return path() + "/" + name; }

const std::string& PrivatePlace::shownPath() const { return m_parts->shownPath(); }

bool PrivatePlace::makeFolder(const std::string& name, Failures* failures) {
  return runToEnd([&] { m_parts->makeFolder(name); }, failures);
}

}  // namespace migration
