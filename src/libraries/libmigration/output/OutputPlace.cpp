#include "OutputPlace.h"

#include <fcntl.h>
#include <unistd.h>

#include <cerrno>
#include <utility>

#include "OutputStop.h"
#include "OwnDirectory.h"

namespace migration {

namespace {

// Nothing on the system has to change, so it is about no file.
[[noreturn]] void stopRequest(const std::string& text) {
  throw OutputStop{{"", 0, 0, "", text}, true};
}

std::string withoutLastSlashes(std::string path) {
  while (path.size() > 1 && path.back() == '/') {
    path.pop_back();
  }
  return path;
}

FileIdentity identityOf(int descriptor) {
  struct stat status {};
  ::fstat(descriptor, &status);
  return FileIdentity::of(status);
}

// True when the directory is `other` or lies in it, however both are named: by another path, a
// link, a second mount.
bool isWithin(const Directory& directory, const FileIdentity& other) {
  Descriptor above(::openat(directory.number(), ".", O_PATH | O_DIRECTORY | O_CLOEXEC));
  FileIdentity identity = identityOf(above.number());
  while (above.isOpen() && identity != other) {
    above = Descriptor(::openat(above.number(), "..", O_PATH | O_DIRECTORY | O_CLOEXEC));
    const FileIdentity next = identityOf(above.number());
    if (!above.isOpen() || next == identity) {
      return false;
    }
    identity = next;
  }
  return above.isOpen();
}

}  // namespace

std::string parentOf(const std::string& path) {
  const std::string shortened = withoutLastSlashes(path);
  const std::size_t slash = shortened.rfind('/');
  return slash == std::string::npos ? "." : slash == 0 ? "/" : shortened.substr(0, slash);
}

OutputPlace::OutputPlace(const OutputOptions& options, Failures* leftovers)
    : m_noun(options.noun), m_path(withoutLastSlashes(options.path)) {
  const std::size_t slash = m_path.rfind('/');
  const std::string parent = parentOf(m_path);
  m_name = m_path.substr(slash == std::string::npos ? 0 : slash + 1);
  if (m_name.empty() || m_name == "." || m_name == "..") {
    stopRequest(options.option + " must end in the name of the directory to create, not in \"" +
                m_path + "\"");
  }
  m_parent = Directory(parent);
  if (!m_parent.isOpen() && errno == ENOTDIR && ::access(parent.c_str(), F_OK) == 0) {
    stopOutput(m_path,
               "the " + m_noun + " cannot be created in " + parent + ", which is not a directory");
  }
  if (!m_parent.isOpen()) {
    stopOutputOfSystem(m_path, "the directory to create it in, " + parent + ", cannot be used");
  }
  for (const std::string& input : options.inputs) {
    checkIsOutside(input);
  }
  checkParent(options);
  checkName();
  findLeftovers(leftovers);
}

// The inputs are never written, and a directory inside one would be.
void OutputPlace::checkIsOutside(const std::string& input) const {
  struct stat status {};
  if (::stat(input.c_str(), &status) == 0 && isWithin(m_parent, FileIdentity::of(status))) {
    stopRequest("the " + m_noun + " " + m_path + " lies inside " + input +
                ", which is only read; name a place outside");
  }
}

// Who may rename what lies in the parent could put something else in the place of the output.
void OutputPlace::checkParent(const OutputOptions& options) const {
  const struct stat status = m_parent.status();
  const bool isForeign = status.st_uid != 0 && status.st_uid != ::geteuid();
  const bool isOpen = (status.st_mode & S_IWOTH) != 0 && (status.st_mode & S_ISVTX) == 0;
  if ((!isForeign && !isOpen) || options.allowForeignParent) {
    return;
  }
  const std::string whose = isForeign
                                ? "belongs to another user (" + std::to_string(status.st_uid) + ")"
                                : std::string("is writable by everybody and not sticky");
  const std::string risk =
      options.riskOption.empty() ? "" : ", or take the risk with " + options.riskOption;
  stopOutput(
      m_path,
      "the directory to create it in, " + m_parent.path() + ", " + whose +
          ", who could put something else in the place of the output; create it in a directory of your own" +
          risk);
}

void OutputPlace::checkName() {
  if (!m_parent.look(m_name, &m_replaced)) {
    if (errno != ENOENT) {
      stopOutputOfSystem(m_path, "the " + m_noun + " cannot be looked at");
    }
    return;
  }
  if (!S_ISDIR(m_replaced.st_mode)) {
    stopOutput(m_path, "exists and is not a directory; the " + m_noun + " must be new or empty");
  }
  const Directory existing = m_parent.open(m_name);
  std::vector<std::string> names;
  if (!existing.isOpen() || !existing.list(&names)) {
    stopOutputOfSystem(m_path, "the " + m_noun + " cannot be read");
  }
  if (!names.empty()) {
    stopOutput(m_path, "the " + m_noun + " is not empty; name a new or an empty one");
  }
  m_replacesEmpty = true;
}

void OutputPlace::findLeftovers(Failures* leftovers) const {
  const std::string prefix = partialPrefix();
  std::vector<std::string> names;
  if (!m_parent.list(&names)) {
    stopOutputOfSystem(m_parent.path(), "cannot be read");
  }
  for (const std::string& name : names) {
    if (name.compare(0, prefix.size(), prefix) != 0) {
      continue;
    }
    const char* text = "left behind by a run that was killed; it is not used, and can be removed";
    switch (useOf(m_parent, name)) {
      case Use::kInUse:
        text =
            "another run is writing to the same output directory; the one that ends first gets it";
        break;
      case Use::kUnknown:
        text =
            "left behind by a run that was killed, or being written by one that is under way, which cannot be told here; it is not used, and can be removed once no other run is";
        break;
      case Use::kLeftBehind:
        break;
    }
    leftovers->push_back({m_parent.pathOf(name), 0, 0, "", text});
  }
}

bool OutputPlace::holds(const FileIdentity& identity) const {
  struct stat status {};
  return m_parent.has(m_name, identity) && ::lstat(m_path.c_str(), &status) == 0 &&
         FileIdentity::of(status) == identity;
}

bool OutputPlace::isParentAtItsPath() const {
  struct stat status {};
  return ::stat(m_parent.path().c_str(), &status) == 0 &&
         FileIdentity::of(status) == m_parent.identity();
}

}  // namespace migration
