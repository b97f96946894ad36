#include "MigrationRecord.h"

#include <algorithm>
#include <array>
#include <cstddef>
#include <ctime>
#include <map>
#include <utility>

#include "Digest.h"
#include "Origins.h"
#include "PlanDocument.h"

namespace migration {

namespace {

// A word as a shell takes it for itself.
std::string quoted(const std::string& word) {
  const auto isPlain = [](char c) {
    return (c >= 'a' && c <= 'z') || (c >= 'A' && c <= 'Z') || (c >= '0' && c <= '9') ||
           std::string_view("-_./=:,+@%").find(c) != std::string_view::npos;
  };
  if (!word.empty() && std::all_of(word.begin(), word.end(), isPlain)) {
    return word;
  }
  std::string text = "'";
  for (const char c : word) {
    if (c == '\'') {
      text += "'\\''";
    } else {
      text += c;
    }
  }
  return text + "'";
}

std::string timeText(std::int64_t seconds) {
  const auto time = static_cast<std::time_t>(seconds);
  std::tm utc{};
  ::gmtime_r(&time, &utc);
  std::array<char, 64> text{};
  const std::size_t length = std::strftime(text.data(), text.size(), "%Y-%m-%dT%H:%M:%SZ", &utc);
  return {text.data(), length};
}

class RecordMaker {
 public:
  explicit RecordMaker(const RecordRequest& request) : m_request(request), m_plan(*request.plan) {}

  std::vector<RecordFile> make() {
    add("", "plan.json", planDocument(m_plan, {"plan", m_request.programVersion}));
    add("", "report.txt", m_request.textReport);
    if (!m_request.htmlReport.empty()) {
      add("", "report.html", m_request.htmlReport);
    }
    add("", "origins.tsv", tableOf(originsOf(m_plan, m_request.outputs)));
    if (m_plan.base) {
      addInstallation("base", *m_plan.base);
    }
    addInstallation("old", *m_plan.old);
    addInstallation("new", *m_plan.latest);
    addLists();
    for (const NamedText& output : m_request.outputs) {
      add("output", output.name, output.bytes);
    }
    add("", "command.txt", command());
    add("", "SHA256SUMS", sums());
    return std::move(m_files);
  }

 private:
  void add(const std::string& folder, const std::string& name, std::string bytes) {
    m_files.push_back({folder, name, std::move(bytes)});
  }

  void addInstallation(const std::string& folder, const Installation& installation) {
    const auto asRead = m_plan.asRead.find(folder);
    if (asRead == m_plan.asRead.end()) {
      for (const SchemaFile& file : installation.files()) {
        add(folder, file.name, std::string(file.source->bytes()));
      }
    } else {
      // As the sums of the plan have them; what was mended is told.
      for (const NamedText& text : asRead->second) {
        add(folder, text.name, text.bytes);
      }
    }
    m_copied += folder + "/: copies of the files of " + quoted(installation.directory()) + "\n";
  }

  // Under names of their own: two may have the same name in different directories.
  void addLists() {
    std::map<std::string, std::size_t> counts;
    auto source = m_plan.lists.begin();
    for (const PlanInput& input : m_plan.inputs) {
      if (input.role == "base" || input.role == "old" || input.role == "new") {
        continue;
      }
      const std::string name =
          input.role + "-" + std::to_string(++counts[input.role]) +
          (input.role == "decisions" || input.role == "settings" ? ".toml" : ".txt");
      add("lists", name, std::string((*source++)->bytes()));
      m_copied += "lists/" + name + ": a copy of " + quoted(input.path) + "\n";
    }
  }

  std::string command() const {
    std::string words;
    for (const std::string& word : m_request.command) {
      words += (words.empty() ? "" : " ") + quoted(word);
    }
    return "schema-migrate " + m_request.programVersion + "\ntime: " + timeText(m_request.time) +
           "\ndirectory: " + quoted(m_request.directory) + "\ncommand: " + words +
           "\nlayout: " + m_request.layout + "\n\n" + m_copied +
           "output/: copies of the files of " + quoted(m_request.out) + "\n";
  }

  std::string sums() const {
    std::map<std::string, std::string> digests;
    for (const RecordFile& file : m_files) {
      digests[(file.folder.empty() ? "" : file.folder + "/") + file.name] = sha256Of(file.bytes);
    }
    std::string text;
    for (const auto& [path, digest] : digests) {
      text.append(digest).append("  ").append(path).append("\n");
    }
    return text;
  }

  const RecordRequest& m_request;
  const MigrationPlan& m_plan;
  std::vector<RecordFile> m_files;
  std::string m_copied;  // a line for each copy
};

}  // namespace

std::vector<RecordFile> recordOf(const RecordRequest& request) {
  return RecordMaker(request).make();
}

}  // namespace migration
