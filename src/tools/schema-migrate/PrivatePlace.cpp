#include "PrivatePlace.h"

#include <sys/statvfs.h>
#include <unistd.h>

#include <cerrno>
#include <cstdlib>
#include <ctime>
#include <memory>

#include "Messages.h"

namespace {

constexpr char kPrefix[] = "schema-migrate-";

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

PrivatePlace::PrivatePlace(const PrivatePlaceOptions& options, Removals* removals,
                           std::string* warnings)
    : m_removals(removals) {
  for (const bool needsRoom : {true, false}) {
    for (const std::string& candidate : options.candidates) {
      if (tryCandidate(candidate, options, needsRoom)) {
        findLeftovers(warnings);
        return;
      }
    }
  }
  throw Failure(
      kNotWritten,
      errorLine(
          "no place can be had for the private copies of the files that are read and written" +
          m_problems + "; name one in TMPDIR"));
}

bool PrivatePlace::tryCandidate(const std::string& candidate, const PrivatePlaceOptions& options,
                                bool needsRoom) {
  m_base = Directory(candidate);
  std::string problem;
  if (!m_base.isOpen()) {
    problem = systemError(errno);
  } else if (needsRoom && !hasRoom(m_base, options.room)) {
    return false;
  } else {
    problem = m_own.makeUnique(m_base, kPrefix, m_removals);
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

bool PrivatePlace::findPath(const std::string& openFiles) {
  m_path = openFiles + "/" + std::to_string(m_own.directory().number());
  if (leadsTo(m_path, m_own.identity())) {
    return true;
  }
  m_path = resolved(m_own.directory().path());
  return leadsTo(m_path, m_own.identity()) && isBeyondOthers(m_path);
}

void PrivatePlace::findLeftovers(std::string* warnings) const {
  const std::string prefix = kPrefix;
  std::vector<std::string> names;
  if (!m_base.list(&names)) {
    throw Failure(kNotWritten, errorLine(m_base.path(), "cannot be read: " + systemError(errno)));
  }
  for (const std::string& name : names) {
    struct stat status {};
    const bool isOwn = name.compare(0, prefix.size(), prefix) == 0 && name != m_own.name() &&
                       m_base.look(name, &status) && S_ISDIR(status.st_mode) &&
                       status.st_uid == ::geteuid() &&
                       status.st_mtime + kMoment < std::time(nullptr);
    if (isOwn && useOf(m_base, name) == Use::kLeftBehind) {
      *warnings += warningLine(
          m_base.pathOf(name),
          "private copies left behind by a run that was killed; they are not used, and can be removed");
    }
  }
}

const OwnDirectory& PrivatePlace::makeDirectory(const std::string& name) {
  OwnDirectory& made = m_directories.emplace_back();
  const std::string problem = made.make(m_own.directory(), name, m_removals);
  if (!problem.empty()) {
    throw Failure(kNotWritten,
                  errorLine(m_own.directory().pathOf(name), "cannot be created: " + problem));
  }
  return made;
}
