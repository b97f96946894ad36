#include "Staging.h"

#include <algorithm>
#include <functional>
#include <map>
#include <string_view>
#include <unordered_map>
#include <utility>

#include "References.h"
#include "ResultIndex.h"
#include "ResultText.h"
#include "RuleSupport.h"
#include "TextEdits.h"

namespace migration {

namespace {

// Above what is added to a file.
constexpr std::string_view kHeading =
    "# Carried over from the installation before the migration:\n";

// The comment lines that stand directly above it in OLD.
std::string commentsOf(const Verdict& row) {
  const Entry* const old = row.match.old;
  if (old == nullptr || old->written == nullptr) {
    return "";
  }
  const WrittenDefinition& written = *old->written;
  std::string comments =
      withLineEnds(std::string(old->file->source->bytes().substr(
                       written.commentsBegin, written.commentsEnd - written.commentsBegin)),
                   false);
  if (!comments.empty() && comments.back() != '\n') {
    comments += '\n';
  }
  // That of an earlier migration is not the definition's own.
  const std::size_t heading = comments.find(kHeading);
  return heading == std::string::npos ? comments : comments.substr(heading + kHeading.size());
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

// Something that the library's comparison finds to differ, so that the merge replaces it.
Content altered(Content content) {
  const Aspect aspect =
      content.kind == Kind::kVendorExtension ? Aspect::kAccessClass : Aspect::kDesc;
  std::string text = content[aspect].empty() ? std::string() : content[aspect].front();
  content[aspect] = {text + "x"};
  return content;
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

// Where what is carried stands.
class Places {
 public:
  Places(const Installation& latest, const std::vector<Verdict>& rows)
      : m_rows(rows), m_repeats(latest) {}

  const std::vector<const Entry*>& repeatsOf(const Verdict& row) const {
    static const std::vector<const Entry*> kNone;
    return row.match.latest == nullptr ? kNone : m_repeats.of(*row.match.latest);
  }

  // Of NEW's definitions that have to go, the one in whose place the result stands: the merge puts
  // an OID into one file alone, an extension where its attribute type is, and nothing into
  // V3.modifiedschema. Null when none of them will do.
  const Entry* homeOf(const Verdict& row) const {
    const std::string file = fileOfType(row);
    const std::vector<const Entry*>& repeats = repeatsOf(row);
    const auto home = std::find_if(repeats.begin(), repeats.end(), [&](const Entry* entry) {
      return file.empty() ? !isModifiedSchema(*entry->file) : entry->file->name == file;
    });
    return home == repeats.end() ? nullptr : *home;
  }

  // Whether it is written behind a file, and not in NEW's place.
  bool isAddition(const Verdict& row) const {
    return row.isCarried() &&
           (row.match.latest == nullptr || (row.isNewsInTheWay && homeOf(row) == nullptr));
  }

  // NEW's place, that of its attribute type, or that of an addition.
  std::string fileOf(const Verdict& row) const {
    if (row.match.latest != nullptr && !row.isNewsInTheWay) {
      return row.match.latest->file->name;
    }
    std::string file = fileOfType(row);
    if (!file.empty()) {
      return file;
    }
    if (row.match.latest == nullptr) {
      return row.file;
    }
    const Entry* const home = homeOf(row);
    return home != nullptr                    ? home->file->name
           : row.kind() == Kind::kObjectClass ? "V3.user.oc"
                                              : "V3.user.at";
  }

 private:
  // Of a vendor extension whose attribute type is in the result.
  std::string fileOfType(const Verdict& row) const {
    if (row.match.attribute == kNoRow || !m_rows[row.match.attribute].isInResult()) {
      return "";
    }
    return fileOf(m_rows[row.match.attribute]);
  }

  const std::vector<Verdict>& m_rows;
  Repeats m_repeats;
};

std::vector<NamedText> textsOf(std::map<std::string, std::string> byFile) {
  std::vector<NamedText> texts;
  for (const char* const name : kSchemaFiles) {
    const auto found = byFile.find(name);
    if (found != byFile.end()) {
      texts.push_back({name, std::move(found->second)});
    }
  }
  return texts;
}

// The additions of one file: attribute types with their extensions, and classes, each behind what
// it refers to as far as that is added to the same file.
class Additions {
 public:
  Additions(const ThreeWayRequest& request, const std::vector<Verdict>& rows, const Places& places)
      : m_rows(rows), m_places(places) {
    for (const SchemaFile& file : request.latest->files()) {
      m_endsWithReturns[file.name] = endsLinesWithReturns(file.source->bytes());
    }
    for (std::size_t row = 0; row < rows.size(); ++row) {
      const Verdict& difference = rows[row];
      if (!places.isAddition(difference)) {
        continue;
      }
      if (difference.kind() == Kind::kVendorExtension && difference.match.attribute != kNoRow &&
          places.isAddition(rows[difference.match.attribute])) {
        m_extensionOf[difference.match.attribute] = row;
        continue;
      }
      m_byFile[places.fileOf(difference)].push_back(row);
      for (const std::string& name : difference.result->names()) {
        m_byName.emplace(keyOf(difference.kind(), name), row);
      }
      m_byName.emplace(keyOf(difference.kind(), difference.result->oid()), row);
    }
  }

  // Adds the lines for one file of files(), with those above them, in their order.
  void addTo(const std::string& file, std::string* text) {
    m_areReturns = m_endsWithReturns[file];
    text->append(withLineEnds(std::string(kHeading), m_areReturns));
    for (const std::size_t row : m_byFile.at(file)) {
      addWithSuperiors(row, file, text);
    }
  }

  std::vector<std::string> files() const {
    std::vector<std::string> names;
    for (const auto& entry : m_byFile) {
      names.push_back(entry.first);
    }
    return names;
  }

 private:
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
          if (found != m_byName.end() && m_places.fileOf(m_rows[found->second]) == file) {
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

  void addLine(const Verdict& row, std::string* lines) const {
    const std::string comments = withLineEnds(commentsOf(row), m_areReturns);
    const std::string keyword = lineOf(row.kind(), "");
    lines->reserve(lines->size() + comments.size() + keyword.size() + row.text.size() + 2);
    lines->append(comments)
        .append(keyword, 0, keyword.size() - 1)
        .append(withLineEnds(row.kind(), row.text, m_areReturns))
        .append(m_areReturns ? "\r\n" : "\n");
  }

  const std::vector<Verdict>& m_rows;
  const Places& m_places;
  std::map<std::string, std::vector<std::size_t>> m_byFile;
  std::unordered_map<std::size_t, std::size_t> m_extensionOf;
  std::unordered_map<std::string, std::size_t> m_byName;
  std::set<std::size_t> m_done;
  std::map<std::string, bool> m_endsWithReturns;  // by file
  bool m_areReturns = false;                      // of the file that lines are made for
};

}  // namespace

StagedTexts stage(const ThreeWayRequest& request, const ThreeWay& threeWay) {
  const std::vector<Verdict>& rows = threeWay.differences;
  const Places places(*request.latest, rows);
  std::map<std::string, std::string> old;
  EditsByFile edits;
  for (const Verdict& row : rows) {
    const bool isListed = row.outcome == Outcome::kExcluded || row.outcome == Outcome::kWithdrawn;
    if (row.isCarried()) {
      old[places.fileOf(row)] += lineOf(row.kind(), textOf(*row.result));
    } else if (isListed && row.match.old != nullptr) {
      old[row.match.old->file->name] += lineOf(row.kind(), textOf(contentOf(*row.match.old->kept)));
    }
    for (const Entry* const entry : places.repeatsOf(row)) {
      if (row.isNewsInTheWay) {
        cut(*entry, &edits);
      } else if (row.isEqualToNews) {
        const Span span = parenthesesOf(*entry);
        edits[entry->file].replace(span.begin, span.end, textOf(altered(*row.result)));
      }
    }
  }
  std::map<std::string, std::string> latest;
  for (const SchemaFile& file : request.latest->files()) {
    latest[file.name] = editedText(file, edits);
  }
  return {textsOf(std::move(old)), textsOf(std::move(latest))};
}

std::vector<NamedText> inNewsLayout(const ThreeWayRequest& request, const ThreeWay& threeWay) {
  const std::vector<Verdict>& rows = threeWay.differences;
  const Places places(*request.latest, rows);
  EditsByFile edits;
  for (const Verdict& row : rows) {
    if (row.match.latest == nullptr) {
      continue;
    }
    const Entry* const home = row.isNewsInTheWay ? places.homeOf(row) : nullptr;
    for (const Entry* const entry : places.repeatsOf(row)) {
      if (row.isCarried() && (!row.isNewsInTheWay || entry == home)) {
        const Span span = parenthesesOf(*entry);
        const bool areReturns = endsLinesWithReturns(entry->file->source->bytes());
        edits[entry->file].replace(span.begin, span.end,
                                   withLineEnds(row.kind(), row.text, areReturns));
      } else if (row.isNewsInTheWay) {
        cut(*entry, &edits);
      }
    }
  }
  std::map<std::string, std::string> texts;
  for (const SchemaFile& file : request.latest->files()) {
    texts[file.name] = editedText(file, edits);
  }
  Additions additions(request, rows, places);
  for (const std::string& file : additions.files()) {
    std::string& text = texts[file];
    if (!text.empty() && text.back() != '\n') {
      text += endsLinesWithReturns(text) ? "\r\n" : "\n";
    }
    additions.addTo(file, &text);
  }
  return textsOf(std::move(texts));
}

}  // namespace migration
