#include "Inputs.h"

#include <algorithm>
#include <cerrno>
#include <utility>

#include "Messages.h"

namespace {

constexpr std::size_t kBufferSize = std::size_t{1} << 16;

std::vector<std::string> namesIn(const Directory& directory, const std::string& role) {
  std::vector<std::string> names;
  if (!directory.isOpen() || !directory.list(&names)) {
    throw Failure(kBadInput,
                  errorLine(directory.path(),
                            "the directory of " + role + " cannot be read: " + systemError(errno)));
  }
  return names;
}

bool isSameTime(const timespec& one, const timespec& other) {
  return one.tv_sec == other.tv_sec && one.tv_nsec == other.tv_nsec;
}

bool isUnchanged(const struct stat& before, const struct stat& after) {
  return before.st_size == after.st_size && isSameTime(before.st_mtim, after.st_mtim) &&
         isSameTime(before.st_ctim, after.st_ctim);
}

// As it is given: "1 GiB", "1500 bytes".
std::string shownSize(std::uint64_t bytes) {
  constexpr const char* kUnits[] = {"KiB", "MiB", "GiB", "TiB"};
  std::string text = counted(bytes, "byte");
  for (const char* const unit : kUnits) {
    if (bytes == 0 || bytes % 1024 != 0) {
      break;
    }
    bytes /= 1024;
    text = std::to_string(bytes) + " " + unit;
  }
  return text;
}

}  // namespace

const ListFile& Inputs::openList(const std::string& path) {
  const std::string name = "list-" + std::to_string(m_lists.size() + 1);
  const std::string problem = add(InputFile(path), path, nullptr, name);
  if (!problem.empty()) {
    throw Failure(kBadInput, errorLine(path, "the list of OIDs cannot be read: " + problem));
  }
  return m_lists.emplace_back(ListFile{path, name});
}

const Installation& Inputs::openInstallation(const std::string& role, const std::string& path,
                                             std::string* warnings) {
  Installation& installation = m_installations.emplace_back();
  installation.role = role;
  installation.path = path;
  const Directory directory(path);
  bool isAny = false;
  for (const std::string& name : namesIn(directory, role)) {
    const std::size_t number = schemaFileNumber(name);
    if (number != kNoSchemaFile) {
      InstalledFile& file = installation.files[number];
      file.isThere = true;
      file.problem =
          add(InputFile(directory, name), installation.pathOf(number), &installation, name);
      file.mode = file.problem.empty() ? m_sources.back().status.st_mode & 0777 : 0;
      isAny = true;
    } else if (name.compare(0, 3, "V3.") == 0) {
      *warnings += warningLine(
          path + "/" + name,
          "not read, since no schema file has this name; rename it if it belongs to the schema");
    }
  }
  if (!isAny) {
    throw Failure(kBadInput,
                  errorLine(path, "no V3.* schema file in the directory of " + role +
                                      "; name the directory that holds V3.system.at and its like"));
  }
  return installation;
}

std::string Inputs::add(InputFile file, const std::string& path, const Installation* installation,
                        const std::string& name) {
  if (!file.problem().empty()) {
    return file.problem();
  }
  struct stat status {};
  if (::fstat(file.descriptor(), &status) != 0) {
    return systemError(errno);
  }
  const auto size = static_cast<std::uint64_t>(status.st_size);
  if (size > m_limit - m_size) {
    throw Failure(
        kBadInput,
        errorLine(path, "with this file the inputs have more than " + shownSize(m_limit) +
                            " in all; if they are meant to, allow more with --max-input"));
  }
  m_size += size;
  m_sources.push_back({std::move(file), path, status, installation, name});
  return "";
}

void Inputs::copyTo(PrivatePlace* place) {
  for (ListFile& list : m_lists) {
    list.copy = place->pathOf(list.copy);
  }
  std::vector<char> buffer(kBufferSize);
  for (Installation& installation : m_installations) {
    const OwnDirectory& directory = place->makeDirectory(installation.role);
    installation.directory = place->pathOf(installation.role);
    installation.copies = &directory.directory();
    for (Source& source : m_sources) {
      if (source.installation == &installation) {
        copy(&source, directory, &buffer);
      }
    }
  }
  for (Source& source : m_sources) {
    if (source.installation == nullptr) {
      copy(&source, place->own(), &buffer);
    }
  }
  m_sources.clear();
}

void Inputs::copy(Source* source, const OwnDirectory& directory, std::vector<char>* buffer) {
  const std::string copyPath = directory.directory().pathOf(source->name);
  const Descriptor target = directory.createFile(source->name, 0600);
  if (!target.isOpen()) {
    throw Failure(kNotWritten, errorLine(copyPath, "cannot be created: " + systemError(errno)));
  }
  // Of a file that grows no more is read than it had at first.
  std::uint64_t rest = static_cast<std::uint64_t>(source->status.st_size) + 1;
  while (const std::size_t count = source->file.read(
             buffer->data(),
             static_cast<std::size_t>(std::min<std::uint64_t>(rest, buffer->size())))) {
    if (!writeAll(target.number(), {buffer->data(), count})) {
      throw Failure(kNotWritten, errorLine(copyPath, "cannot be written: " + systemError(errno)));
    }
    rest -= count;
  }
  struct stat after {};
  const std::string problem = !source->file.problem().empty() ? source->file.problem()
                              : ::fstat(source->file.descriptor(), &after) != 0 ? systemError(errno)
                                                                                : "";
  if (!problem.empty()) {
    throw Failure(kBadInput, errorLine(source->path, "cannot be read: " + problem));
  }
  if (rest != 1 || !isUnchanged(source->status, after)) {
    throw Failure(
        kBadInput,
        errorLine(source->path, "changed while it was read; try again when nothing writes to it"));
  }
}
