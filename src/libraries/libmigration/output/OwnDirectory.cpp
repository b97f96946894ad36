#include "OwnDirectory.h"

#include <fcntl.h>
#include <sys/file.h>
#include <sys/random.h>
#include <unistd.h>

#include <array>
#include <cerrno>
#include <cstdint>
#include <ctime>
#include <vector>

#include "OutputStop.h"

namespace migration {

namespace {

constexpr int kTries = 100;

// The lock says no more than that the run is under way, so the run does without where it cannot be
// had. Another run that looks whether this one is under way holds it for a moment.
void lock(int directory) {
  constexpr timespec kMoment{0, 1000000};
  for (int tries = 0; tries < kTries; ++tries) {
    if (::flock(directory, LOCK_EX | LOCK_NB) == 0 || errno != EWOULDBLOCK) {
      return;
    }
    ::nanosleep(&kMoment, nullptr);
  }
}

}  // namespace

std::string randomSuffix() {
  constexpr char kCharacters[] = "abcdefghijklmnopqrstuvwxyzABCDEFGHIJKLMNOPQRSTUVWXYZ0123456789";
  constexpr std::uint64_t kCount = sizeof kCharacters - 1;
  std::uint64_t bits = 0;
  if (::getrandom(&bits, sizeof bits, GRND_NONBLOCK) != static_cast<ssize_t>(sizeof bits)) {
    // Nothing depends on nobody foreseeing it: what is made must be new.
    timespec now{};
    ::clock_gettime(CLOCK_REALTIME, &now);
    bits = static_cast<std::uint64_t>(now.tv_nsec) * 1000003U +
           static_cast<std::uint64_t>(::getpid()) + static_cast<std::uint64_t>(now.tv_sec);
  }
  std::string suffix;
  for (int i = 0; i < 6; ++i, bits /= kCount) {
    suffix += kCharacters[bits % kCount];
  }
  return suffix;
}

OwnDirectory::~OwnDirectory() { remove(); }

std::string OwnDirectory::make(const Directory& parent, const std::string& name,
                               Removals* removals) {
  m_removals = removals;
  m_parent = &parent;
  m_name = name;
  // Entered before it is there, so that an interruption finds it at any time.
  m_entry = removals->add(parent.number(), name);
  if (m_entry == nullptr) {
    return textOfError(ENAMETOOLONG);
  }
  if (::mkdirat(parent.number(), name.c_str(), 0700) != 0) {
    const int error = errno;
    forget();
    errno = error;
    return textOfError(error);
  }
  std::string problem = open();
  if (!problem.empty()) {
    // Nothing but an empty directory is removed by this.
    ::unlinkat(parent.number(), name.c_str(), AT_REMOVEDIR);
    forget();
    errno = 0;
  }
  return problem;
}

std::string OwnDirectory::makeUnique(const Directory& parent, const std::string& prefix,
                                     Removals* removals) {
  for (int tries = 1;; ++tries) {
    std::string problem = make(parent, prefix + randomSuffix(), removals);
    if (problem.empty() || errno != EEXIST || tries == kTries) {
      return problem;
    }
  }
}

// What stands at the name now is taken for the one that was made only if it might be: made by this
// user, open to nobody else, and with nothing in it.
std::string OwnDirectory::open() {
  Directory opened = m_parent->open(m_name);
  if (!opened.isOpen()) {
    return "it cannot be opened: " + textOfError(errno);
  }
  const struct stat status = opened.status();
  std::vector<std::string> names;
  if (!opened.list(&names)) {
    return "it cannot be read: " + textOfError(errno);
  }
  const bool isOwn = status.st_uid == ::geteuid() && (status.st_mode & (S_IWGRP | S_IWOTH)) == 0;
  if (!isOwn || !names.empty()) {
    return "something else was put in its place as soon as it was made";
  }
  m_directory = std::move(opened);
  m_identity = FileIdentity::of(status);
  Removals::hold(m_entry, m_directory.number(), m_identity);
  lock(m_directory.number());
  return "";
}

bool OwnDirectory::isAtItsName() const { return m_parent->has(m_name, m_identity); }

Descriptor OwnDirectory::createFile(const std::string& name, mode_t mode) const {
  return Descriptor(::openat(m_directory.number(), name.c_str(),
                             O_WRONLY | O_CREAT | O_EXCL | O_NOFOLLOW | O_CLOEXEC, mode));
}

bool OwnDirectory::setPlace(const std::string& place) { return Removals::setPlace(m_entry, place); }

void OwnDirectory::keep() {
  m_removals->settle(m_entry);
  m_entry = nullptr;
}

void OwnDirectory::forget() {
  Removals::drop(m_entry);
  m_entry = nullptr;
}

void OwnDirectory::remove() {
  if (m_entry == nullptr) {
    return;
  }
  removeFiles(m_directory.number());
  if (isAtItsName()) {
    ::unlinkat(m_parent->number(), m_name.c_str(), AT_REMOVEDIR);
  }
  forget();
}

Use useOf(const Directory& parent, const std::string& name) {
  const Directory directory = parent.open(name);
  if (!directory.isOpen()) {
    return Use::kUnknown;
  }
  if (::flock(directory.number(), LOCK_EX | LOCK_NB) == 0) {
    return Use::kLeftBehind;
  }
  return errno == EWOULDBLOCK ? Use::kInUse : Use::kUnknown;
}

}  // namespace migration
