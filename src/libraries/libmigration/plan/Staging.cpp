#include "Staging.h"

#include <algorithm>
#include <array>
#include <functional>
#include <map>
#include <string_view>
#include <unordered_map>
#include <utility>

#include "References.h"
#include "ResultIndex.h"
#include "RuleSupport.h"
#include "TextEdits.h"

namespace migration {

namespace {

constexpr std::array<const char*, 3> kKeywords = {"attributetypes", "objectclasses",
                                                  "ORVAttributetypes"};

// Above what is added to a file.
constexpr std::string_view kHeading =
    "# Carried over from the installation before the migration:\n";

std::string keywordOf(Kind kind) { return kKeywords[static_cast<std::size_t>(kind)]; }

// "(…)" as OLD has it, when the result is just that; as it is composed otherwise.
std::string textOfResult(const Verdict& row) {
  const Entry* const old = row.match.old;
  if (old != nullptr && old->written != nullptr && old->written->isClosed &&
      contentOf(*old->kept).values == row.result->values) {
    const WrittenDefinition& written = *old->written;
    return std::string(
        old->file->source->bytes().substr(written.offset, written.end - written.offset));
  }
  return textOf(*row.result);
}

std::string lineOf(Kind kind, const std::string& text) {
  return keywordOf(kind) + "=" + text + "\n";
}

// The comment lines that stand directly above it in OLD.
std::string commentsOf(const Verdict& row) {
  const Entry* const old = row.match.old;
  if (old == nullptr || old->written == nullptr) {
    return "";
  }
  const WrittenDefinition& written = *old->written;
  std::string comments(old->file->source->bytes().substr(
      written.commentsBegin, written.commentsEnd - written.commentsBegin));
  if (!comments.empty() && comments.back() != '\n') {
    comments += '\n';
  }
  // That of an earlier migration is not the definition's own.
  const std::size_t heading = comments.find(kHeading);
  return heading == std::string::npos ? comments : comments.substr(heading + kHeading.size());
}

// Whether the library's comparison takes the result for what NEW has, and would leave it out. It
// looks from one side only, and not at the order of names.
bool isEqualToTheLibrary(const Verdict& row) {
  const Source source("result", lineOf(row.kind(), textOf(*row.result)));
  const KeptFile kept(source);
  if (kept.definitions().size() != 1) {
    return false;
  }
  const KeptDefinition& mine = kept.definitions().front();
  const KeptDefinition& theirs = *row.match.latest->kept;
  switch (row.kind()) {
    case Kind::kAttributeType:
      return mine.attribute().isEqualTo(theirs.attribute());
    case Kind::kObjectClass:
      return mine.objectClass().isEqualTo(theirs.objectClass());
    case Kind::kVendorExtension:
      return mine.extension().isEqualTo(theirs.extension());
  }
  return false;
}

// Whether NEW's definition has to go before the result's can come: the merge replaces only what has
// the same OID and first name, and the comparison must see a difference.
bool isInTheWay(const Verdict& row) {
  if (!row.isCarried() || row.match.latest == nullptr) {
    return row.isTakenOut;
  }
  const Values names = row.result->names();
  return row.result->oid() != oidOf(*row.match.latest) ||
         (row.kind() != Kind::kVendorExtension &&
          (names.empty() ? std::string() : folded(names.front())) !=
              foldedFirstNameOf(*row.match.latest)) ||
         isEqualToTheLibrary(row);
}

// Every definition of NEW that has kind, OID and first name of one that counts: the library writes
// a definition into each file that has its OID.
class Repeats {
 public:
  explicit Repeats(const Installation& latest) {
    for (const Entry& entry : latest.entries()) {
      if (!isConfigFile(*entry.file)) {
        m_byOid[keyOf(entry)].push_back(&entry);
      }
    }
  }
  const std::vector<const Entry*>& of(const Entry& entry) const {
    static const std::vector<const Entry*> kNone;
    const auto found = m_byOid.find(keyOf(entry));
    return found == m_byOid.end() ? kNone : found->second;
  }

 private:
  static std::string keyOf(const Entry& entry) {
    return static_cast<char>('0' + static_cast<int>(entry.kind())) + oidOf(entry) + ' ' +
           foldedFirstNameOf(entry);
  }
  std::unordered_map<std::string, std::vector<const Entry*>> m_byOid;
};

// The bytes of a definition: of the "(…)" itself, and with its keyword where it stands alone.
struct Span {
  std::size_t begin;
  std::size_t end;
};
Span parenthesesOf(const Entry& entry) {
  return entry.written == nullptr ? Span{entry.kept->offset, entry.kept->end}
                                  : Span{entry.written->offset, entry.written->end};
}
Span wholeOf(const Entry& entry) {
  Span span = parenthesesOf(entry);
  if (entry.written != nullptr && !entry.written->isInBlock) {
    span.begin = entry.written->section;
  }
  const std::string_view bytes = entry.file->source->bytes();
  const bool beginsLine = span.begin == 0 || bytes[span.begin - 1] == '\n';
  if (beginsLine && span.end < bytes.size() && bytes[span.end] == '\n') {
    ++span.end;
  }
  return span;
}

using EditsByFile = std::map<const SchemaFile*, TextEdits>;

void cut(const Entry& entry, EditsByFile* edits) {
  const Span span = wholeOf(entry);
  (*edits)[entry.file].replace(span.begin, span.end, "");
}

std::string editedText(const SchemaFile& file, const EditsByFile& edits) {
  const auto found = edits.find(&file);
  return found == edits.end() ? std::string(file.source->bytes())
                              : found->second.applyTo(file.source->bytes());
}

// Where the result has it: NEW's place, that of its attribute type in NEW, or that of an addition.
std::string fileInResult(const Verdict& row, const std::vector<Verdict>& rows) {
  if (row.match.latest != nullptr) {
    return row.match.latest->file->name;
  }
  const bool goesWithNews =
      row.match.attribute != kNoRow && rows[row.match.attribute].match.latest != nullptr;
  return goesWithNews ? rows[row.match.attribute].match.latest->file->name : row.file;
}

std::vector<NamedText> textsOf(const std::map<std::string, std::string>& byFile) {
  std::vector<NamedText> texts;
  for (const char* const name : kSchemaFiles) {
    const auto found = byFile.find(name);
    if (found != byFile.end()) {
      texts.push_back({name, found->second});
    }
  }
  return texts;
}

// The additions of one file: attribute types with their extensions, and classes, each behind what
// it refers to as far as that is added to the same file.
class Additions {
 public:
  explicit Additions(const std::vector<Verdict>& rows) : m_rows(rows) {
    for (std::size_t row = 0; row < rows.size(); ++row) {
      const Verdict& difference = rows[row];
      if (!isAddition(difference)) {
        continue;
      }
      if (difference.kind() == Kind::kVendorExtension && difference.match.attribute != kNoRow &&
          isAddition(rows[difference.match.attribute])) {
        m_extensionOf[difference.match.attribute] = row;
        continue;
      }
      m_byFile[fileInResult(difference, rows)].push_back(row);
      for (const std::string& name : difference.result->names()) {
        m_byName.emplace(keyOf(difference.kind(), name), row);
      }
      m_byName.emplace(keyOf(difference.kind(), difference.result->oid()), row);
    }
  }

  // The lines for one file, in their order; empty when nothing is added.
  std::string linesFor(const std::string& file) {
    const auto found = m_byFile.find(file);
    if (found == m_byFile.end()) {
      return "";
    }
    std::string lines;
    for (const std::size_t row : found->second) {
      addWithSuperiors(row, file, &lines);
    }
    return lines;
  }

  std::vector<std::string> files() const {
    std::vector<std::string> names;
    for (const auto& entry : m_byFile) {
      names.push_back(entry.first);
    }
    return names;
  }

 private:
  static bool isAddition(const Verdict& row) {
    return row.isCarried() && (row.match.latest == nullptr);
  }
  static std::string keyOf(Kind kind, const std::string& name) {
    return static_cast<char>('0' + static_cast<int>(kind)) + folded(name);
  }

  // Goes down to what it refers to first; what is met again on the way up is written once.
  void addWithSuperiors(std::size_t start, const std::string& file, std::string* lines) {
    std::vector<std::pair<std::size_t, bool>> open = {{start, false}};
    while (!open.empty()) {
      const auto [row, isReady] = open.back();
      open.pop_back();
      if (isReady) {
        addLines(row, lines);
        continue;
      }
      if (!m_done.insert(row).second) {
        continue;
      }
      open.emplace_back(row, true);
      const std::vector<ReferringAspect>& aspects = referringAspects(m_rows[row].kind());
      for (auto referring = aspects.rbegin(); referring != aspects.rend(); ++referring) {
        const Values& names = (*m_rows[row].result)[referring->aspect];
        for (auto name = names.rbegin(); name != names.rend(); ++name) {
          const auto found = m_byName.find(keyOf(referring->target, *name));
          if (found != m_byName.end() && fileInResult(m_rows[found->second], m_rows) == file) {
            open.emplace_back(found->second, false);
          }
        }
      }
    }
  }

  void addLines(std::size_t row, std::string* lines) const {
    addLine(m_rows[row], lines);
    const auto extension = m_extensionOf.find(row);
    if (extension != m_extensionOf.end()) {
      addLine(m_rows[extension->second], lines);
    }
  }

  static void addLine(const Verdict& row, std::string* lines) {
    lines->append(commentsOf(row)).append(lineOf(row.kind(), textOfResult(row)));
  }

  const std::vector<Verdict>& m_rows;
  std::map<std::string, std::vector<std::size_t>> m_byFile;
  std::unordered_map<std::size_t, std::size_t> m_extensionOf;
  std::unordered_map<std::string, std::size_t> m_byName;
  std::set<std::size_t> m_done;
};

}  // namespace

StagedTexts stage(const ThreeWayRequest& request, const ThreeWay& threeWay) {
  const std::vector<Verdict>& rows = threeWay.differences;
  const Repeats repeats(*request.latest);
  std::map<std::string, std::string> old;
  EditsByFile edits;
  for (const Verdict& row : rows) {
    const bool isListed = row.outcome == Outcome::kExcluded || row.outcome == Outcome::kWithdrawn;
    if (row.isCarried()) {
      old[fileInResult(row, rows)] += lineOf(row.kind(), textOf(*row.result));
    } else if (isListed && row.match.old != nullptr) {
      old[row.match.old->file->name] += lineOf(row.kind(), textOf(contentOf(*row.match.old->kept)));
    }
    if (row.match.latest != nullptr && isInTheWay(row)) {
      for (const Entry* const entry : repeats.of(*row.match.latest)) {
        cut(*entry, &edits);
      }
    }
  }
  std::map<std::string, std::string> latest;
  for (const SchemaFile& file : request.latest->files()) {
    latest[file.name] = editedText(file, edits);
  }
  return {textsOf(old), textsOf(latest)};
}

std::vector<NamedText> inNewsLayout(const ThreeWayRequest& request, const ThreeWay& threeWay) {
  const std::vector<Verdict>& rows = threeWay.differences;
  const Repeats repeats(*request.latest);
  EditsByFile edits;
  for (const Verdict& row : rows) {
    if (row.match.latest == nullptr) {
      continue;
    }
    for (const Entry* const entry : repeats.of(*row.match.latest)) {
      if (row.isCarried()) {
        const Span span = parenthesesOf(*entry);
        edits[entry->file].replace(span.begin, span.end, textOfResult(row));
      } else if (row.isTakenOut) {
        cut(*entry, &edits);
      }
    }
  }
  std::map<std::string, std::string> texts;
  for (const SchemaFile& file : request.latest->files()) {
    texts[file.name] = editedText(file, edits);
  }
  Additions additions(rows);
  for (const std::string& file : additions.files()) {
    std::string& text = texts[file];
    if (!text.empty() && text.back() != '\n') {
      text += '\n';
    }
    text +=
        "# Carried over from the installation before the migration:\n" + additions.linesFor(file);
  }
  return textsOf(texts);
}

}  // namespace migration
