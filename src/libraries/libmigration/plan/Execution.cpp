#include "Execution.h"

#include <libschema/SchemaManager.h>

#include <algorithm>
#include <array>
#include <cerrno>
#include <fstream>
#include <iterator>
#include <memory>
#include <optional>
#include <set>
#include <system_error>
#include <unordered_map>
#include <unordered_set>
#include <utility>

#include "ResultIndex.h"
#include "RuleSupport.h"
#include "Staging.h"

namespace migration {

namespace {

// Ends the execution, with what is to be told.
struct Stop {
  Failure failure;
  bool isOfPlan = false;  // the library does otherwise than planned
};

[[noreturn]] void stop(const std::string& file, const std::string& text) {
  throw Stop{{file, 0, 0, "", text}, true};
}

[[noreturn]] void stopWriting(const std::string& file, const std::string& text) {
  throw Stop{{file, 0, 0, "", text + "; is there space left for private copies?"}};
}

[[noreturn]] void stopSystem(const std::string& file, const std::string& text) {
  const int error = errno;
  throw Stop{{file, 0, 0, "", text + ": " + std::generic_category().message(error)}};
}

void writeText(const std::string& path, const std::string& bytes) {
  std::ofstream out(path, std::ios::binary);
  out << bytes;
  out.close();
  if (!out) {
    stopSystem(path, "a private copy cannot be written");
  }
}

std::string readText(const std::string& path) {
  std::ifstream in(path, std::ios::binary);
  if (!in.is_open()) {
    stopSystem(path, "a private copy cannot be read");
  }
  in.seekg(0, std::ios::end);
  std::string bytes(static_cast<std::size_t>(std::max<std::streamoff>(in.tellg(), 0)), '\0');
  in.seekg(0);
  if (!in.read(bytes.data(), static_cast<std::streamsize>(bytes.size()))) {
    stopSystem(path, "a private copy cannot be read");
  }
  return bytes;
}

void writeTexts(const std::string& folder, const std::vector<NamedText>& texts) {
  for (const NamedText& text : texts) {
    writeText(folder + "/" + text.name, text.bytes);
  }
}

// The OIDs, as OLD has them, of what has this outcome.
std::string listOf(const ThreeWay& threeWay, Outcome outcome) {
  std::set<std::string> oids;
  for (const Verdict& row : threeWay.differences) {
    if (row.outcome == outcome && row.match.old != nullptr) {
      oids.insert(oidOf(*row.match.old));
    }
  }
  std::string text;
  for (const std::string& oid : oids) {
    text.append(oid).append("\n");
  }
  return text;
}

// The library must come to the end of what it is given.
void guard(const std::string& folder, const NamedText& text) {
  const Source source(text.name, Source::Borrowed{text.bytes});
  const KeptFile kept(source);
  if (kept.ending() != ReadingEnd::kWhole) {
    const Place place = source.placeOf(kept.endOffset());
    throw Stop{{folder + "/" + text.name, place.line, place.column, "",
                "the library would not come to the end of the private copy"},
               true};
  }
}

std::unique_ptr<SchemaManager> readAll(const std::string& folder,
                                       const std::vector<NamedText>& texts) {
  for (const NamedText& text : texts) {
    guard(folder, text);
  }
  auto manager = std::make_unique<SchemaManager>(folder);
  for (const char* const name : kSchemaFiles) {
    const bool isThere = std::any_of(texts.begin(), texts.end(),
                                     [&](const NamedText& text) { return text.name == name; });
    if (isThere && manager->readFile(name) != 0) {
      stop(folder + "/" + name, "the library cannot read the private copy");
    }
  }
  return manager;
}

bool isConfigFile(const std::string& name) { return name.rfind("V3.config.", 0) == 0; }

// What a manager writes of one file.
std::string write(SchemaManager* manager, const std::string& folder, const std::string& file) {
  const std::string path = folder + "/" + file;
  if (manager->writeFile(folder, file) != 0) {
    stopWriting(path, "cannot be created");
  }
  std::string bytes = readText(path);
  // The library does not notice that a write fails.
  if (!bytes.empty() && bytes.back() != '\n') {
    stopWriting(path, "was not written completely");
  }
  return bytes;
}

// The seven files that have a set.
std::vector<NamedText> writeAll(SchemaManager* manager, const std::string& folder) {
  std::vector<NamedText> texts;
  for (const char* const file : kSchemaFiles) {
    if (!isConfigFile(file)) {
      texts.push_back({file, write(manager, folder, file)});
    }
  }
  return texts;
}

// The lines below the header, which holds the time.
std::string_view definitionsOf(std::string_view bytes) {
  const std::size_t end = bytes.find('\n');
  return end == std::string_view::npos ? bytes : bytes.substr(end + 1);
}

std::vector<NamedText> mergeByLibrary(const ThreeWayRequest& request, const ThreeWay& threeWay,
                                      const std::string& directory) {
  StagedTexts staged = stage(request, threeWay);
  const std::string oldFolder = directory + "/old";
  const std::string newFolder = directory + "/new";
  writeTexts(oldFolder, staged.old);
  writeTexts(newFolder, staged.latest);
  writeText(oldFolder + "/excluded", listOf(threeWay, Outcome::kExcluded));
  writeText(oldFolder + "/withdrawn", listOf(threeWay, Outcome::kWithdrawn));
  std::unique_ptr<SchemaManager> old = readAll(oldFolder, staged.old);
  std::unique_ptr<SchemaManager> latest = readAll(newFolder, staged.latest);
  staged = {};
  if (old->modifySchema(oldFolder + "/withdrawn") != 0 ||
      old->readExcludedOids(oldFolder + "/excluded") != 0) {
    stop(oldFolder, "the library cannot read the lists");
  }
  old->compSchemas(latest.get());
  if (!latest->mergeSchemas(old.get())) {
    // Both hold the same definitions now, and must not both be destroyed.
    static_cast<void>(old.release());
    stop(newFolder, "the library cannot merge: a definition belongs to no file");
  }
  return writeAll(latest.get(), directory + "/merged");
}

// Both layouts must be one and the same to the library.
void proveAlike(const std::vector<NamedText>& merged, const std::vector<NamedText>& inNewsLayout,
                const std::string& directory) {
  const std::string folder = directory + "/kept";
  writeTexts(folder, inNewsLayout);
  const std::unique_ptr<SchemaManager> kept = readAll(folder, inNewsLayout);
  for (const NamedText& file : merged) {
    const std::string written = write(kept.get(), directory + "/kept-written", file.name);
    if (definitionsOf(file.bytes) != definitionsOf(written)) {
      stop(file.name, "what the library's merge comes to is not what the planned files hold");
    }
  }
}

std::string writtenByLibrary(const KeptDefinition& definition) {
  std::string line;
  switch (definition.kind) {
    case Kind::kAttributeType:
      definition.attribute().appendLine(&line);
      break;
    case Kind::kObjectClass:
      definition.objectClass().appendLine(&line);
      break;
    case Kind::kVendorExtension:
      definition.extension().appendLine(&line);
  }
  return line;
}

// What is kept of a definition must be what was to be written.
bool isKept(const KeptFile& kept, const Content& wanted) {
  return kept.ending() == ReadingEnd::kWhole && kept.definitions().size() == 1 &&
         contentOf(kept.definitions().front()).values == wanted.values;
}

bool survivesWriting(const Content& content) {
  constexpr std::array<const char*, 3> kKeywords = {
      "attributetypes=", "objectclasses=", "ORVAttributetypes="};
  std::string line;
  {
    const Source planned(
        "result", kKeywords[static_cast<std::size_t>(content.kind)] + textOf(content) + "\n");
    const KeptFile kept(planned);
    if (!isKept(kept, content)) {
      return false;
    }
    line = writtenByLibrary(kept.definitions().front());
  }
  const Source written("result", std::move(line));
  return isKept(KeptFile(written), content);
}

// What the result has must be read again as it is written, in either layout.
Failures unwritable(const ThreeWay& threeWay) {
  Failures failures;
  for (const Verdict& row : threeWay.differences) {
    if (row.isCarried() && !survivesWriting(*row.result)) {
      const Entry& entry = row.entry();
      failures.push_back(
          {entry.file->source->path(), entry.place().line, entry.place().column, "",
           describe(row) +
               " would not be read again as it is written: a value in quotes that is neither a "
               "name nor a description, an empty value and a second SUP do not survive; decide "
               "what comes of it, with a text of its own or NEW's, or exclude its OID"});
    }
  }
  return failures;
}

std::string idOf(Kind kind, const std::string& oid, const std::string& firstName) {
  return static_cast<char>('0' + static_cast<int>(kind)) + oid + ' ' + firstName;
}

std::string idOf(const Entry& entry) {
  return idOf(entry.kind(), oidOf(entry),
              entry.kind() == Kind::kVendorExtension ? std::string() : foldedFirstNameOf(entry));
}

std::string foldedFirstNameInResult(const Verdict& row) {
  const Values names = row.kind() == Kind::kVendorExtension ? Values() : namesInResult(row);
  return names.empty() ? std::string() : folded(names.front());
}

std::string idInResult(const Verdict& row) {
  return idOf(row.kind(), oidInResult(row), foldedFirstNameInResult(row));
}

// What is not as it was planned: of what comes of OLD, or of a decision; and of NEW's own.
struct Deviations {
  Failures ofPlan;
  Failures ofNews;
};

class Comparing {
 public:
  Comparing(const ThreeWay& threeWay, const Installation& result)
      : m_threeWay(threeWay), m_result(result) {
    for (const Entry& entry : result.entries()) {
      m_entries.emplace(idOf(entry), &entry);
    }
  }

  Deviations run() {
    for (const Verdict& row : m_threeWay.differences) {
      if (row.match.latest != nullptr && (row.isCarried() || row.isTakenOut)) {
        m_replaced.insert(idOf(*row.match.latest));
      }
      if (row.isInResult()) {
        lookFor(row);
      }
    }
    for (const Entry* const entry : m_threeWay.uncountedOfNew) {
      lookForUncounted(*entry);
    }
    for (const Entry& entry : m_result.entries()) {
      if (m_planned.count(idOf(entry)) == 0) {
        m_deviations.ofPlan.push_back(
            {entry.file->name, entry.place().line, entry.place().column, "",
             describe(*entry.kept) + " is in the result, and was not planned"});
      }
    }
    return std::move(m_deviations);
  }

 private:
  // What counts in the result must be the planned one.
  void lookFor(const Verdict& row) {
    m_planned.insert(idInResult(row));
    const Entry* const entry = row.kind() == Kind::kVendorExtension
                                   ? m_result.byOid(row.kind(), oidInResult(row))
                                   : m_result.byFirstName(row.kind(), foldedFirstNameInResult(row));
    const bool isThere = entry != nullptr && idOf(*entry) == idInResult(row);
    const bool isAsPlanned =
        isThere && (row.isCarried() ? contentOf(*entry->kept).values == row.result->values
                                    : haveEqualValues(*entry, *row.match.latest));
    if (!isAsPlanned) {
      // NEW's OID may be another definition's in NEW too.
      const bool isNews = row.match.latest != nullptr &&
                          (!row.isCarried() || oidInResult(row) == oidOf(*row.match.latest));
      Failures& failures = isNews ? m_deviations.ofNews : m_deviations.ofPlan;
      const std::string text =
          describe(row) + (isThere ? " is not what was planned" : " is not in the result");
      failures.push_back({m_result.directory(), 0, 0, "", text});
      if (!row.isCarried()) {
        expectAsWritten(*row.match.latest);
      }
    }
  }

  static bool haveEqualValues(const Entry& left, const Entry& right) {
    return contentOf(*left.kept).values == contentOf(*right.kept).values;
  }

  // What the library's writer makes of one of NEW's own, where it does not carry it.
  void expectAsWritten(const Entry& latest) {
    const Source written("result", writtenByLibrary(*latest.kept));
    const KeptFile kept(written);
    for (const KeptDefinition& definition : kept.definitions()) {
      const Values& names = definition.object->namesInPlace();
      const bool isNamed = definition.kind != Kind::kVendorExtension && !names.empty();
      m_planned.insert(idOf(definition.kind, definition.object->oidInPlace(),
                            isNamed ? folded(names.front()) : std::string()));
    }
  }

  // One that does not count in NEW stays, unless it is replaced with the one that does.
  void lookForUncounted(const Entry& entry) {
    const std::string id = idOf(entry);
    if (!isConfigFile(entry.file->name) && m_replaced.count(id) != 0) {
      return;
    }
    m_planned.insert(id);
    const auto [begin, end] = m_entries.equal_range(id);
    const bool isThere = std::any_of(
        begin, end, [&](const auto& found) { return haveEqualValues(*found.second, entry); });
    if (!isThere) {
      m_deviations.ofNews.push_back(
          {m_result.directory(), 0, 0, "",
           describe(*entry.kept) + " of " + fileAndLine(entry) + " in NEW is not in the result"});
      expectAsWritten(entry);
    }
  }

  const ThreeWay& m_threeWay;
  const Installation& m_result;
  std::unordered_multimap<std::string, const Entry*> m_entries;
  std::unordered_set<std::string> m_planned;
  std::unordered_set<std::string> m_replaced;
  Deviations m_deviations;
};

Deviations compareWithPlan(const ThreeWay& threeWay, const std::vector<NamedText>& texts) {
  return Comparing(threeWay, Installation::overTexts("result", texts)).run();
}

Failures together(Deviations deviations) {
  Failures all = std::move(deviations.ofPlan);
  all.insert(all.end(), deviations.ofNews.begin(), deviations.ofNews.end());
  return all;
}

}  // namespace

Failures differencesFromPlan(const ThreeWay& threeWay, const Installation& result) {
  return together(Comparing(threeWay, result).run());
}

Execution execute(const ThreeWayRequest& request, const ThreeWay& threeWay,
                  const std::string& directory) {
  Execution execution;
  execution.failures = unwritable(threeWay);
  execution.departsFromPlan = !execution.failures.empty();
  if (execution.departsFromPlan) {
    return execution;
  }
  try {
    execution.inLibraryLayout = mergeByLibrary(request, threeWay, directory);
    execution.inNewsLayout = inNewsLayout(request, threeWay);
    proveAlike(execution.inLibraryLayout, execution.inNewsLayout, directory);
    for (const SchemaFile& file : request.latest->files()) {
      if (isConfigFile(file.name)) {
        execution.inLibraryLayout.push_back({file.name, std::string(file.source->bytes())});
      }
    }
    execution.failures = together(compareWithPlan(threeWay, execution.inNewsLayout));
    Deviations deviations = compareWithPlan(threeWay, execution.inLibraryLayout);
    execution.failures.insert(execution.failures.end(), deviations.ofPlan.begin(),
                              deviations.ofPlan.end());
    execution.departsFromPlan = !execution.failures.empty();
    execution.notCarriedByLibrary = std::move(deviations.ofNews);
  } catch (const Stop& stopped) {
    execution.failures.push_back(stopped.failure);
    execution.departsFromPlan = stopped.isOfPlan;
  }
  return execution;
}

}  // namespace migration
