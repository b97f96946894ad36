#include "Differences.h"

#include <algorithm>
#include <array>
#include <utility>

#include "KeptFields.h"
#include "Keywords.h"

namespace migration {

namespace {

constexpr std::array<Clause, 3> kKinds = {Clause::kStructural, Clause::kAuxiliary,
                                          Clause::kAbstract};

std::string joined(const std::vector<std::string>& texts) {
  std::string text;
  for (const std::string& part : texts) {
    text += text.empty() ? "" : ", ";
    text += quotedForMessage(part);
  }
  return text.empty() ? "nothing" : text;
}

std::string orNothing(const std::string& text) {
  return text.empty() ? "nothing" : quotedForMessage(text);
}

std::string described(const KeptDefinition& definition) {
  const std::vector<std::string>& names = definition.object->namesInPlace();
  std::string text(nameOf(definition.kind));
  text += names.empty() ? "" : " " + names.front();
  return text + " (" + definition.object->oidInPlace() + ")";
}

// Compares the clauses of one definition with its fields.
class FieldComparison {
 public:
  FieldComparison(const WrittenFile& written, std::uint32_t number, const KeptDefinition& kept,
                  std::vector<Difference>* differences)
      : m_written(written),
        m_definition(written.definitions()[number]),
        m_number(number),
        m_fields(kept),
        m_differences(*differences) {}

  void run() {
    for (const WrittenClause& clause : m_written.clausesOf(m_definition)) {
      lookAt(clause);
    }
    for (std::size_t i = 0; i < KeptFields::kClauses; ++i) {
      lookAtField(static_cast<Clause>(i));
    }
  }

 private:
  void lookAt(const WrittenClause& clause) {
    const auto number = static_cast<std::size_t>(clause.clause);
    if (const std::string* const text = m_fields.text(clause.clause)) {
      if (clause.valueCount == 0) {
        // What is kept in its place is looked at with the fields that are not written.
        return;
      }
      lookAtText(clause, *text);
    } else if (const std::vector<std::string>* const list = m_fields.list(clause.clause)) {
      for (const WrittenValue& value : m_written.valuesOf(clause)) {
        const std::size_t place = m_listSizes[number]++;
        m_listDiffers |=
            place >= list->size() || !isKeptAs(value, (*list)[place]) ? 1U << number : 0U;
      }
    } else if (m_fields.isFlag(clause.clause)) {
      if (!m_fields.isSet(clause.clause)) {
        add(clause, sourceText(clause), "nothing");
      }
    } else if (!isRepeatedOid(clause)) {
      add(clause, sourceText(clause), "nothing");
    }
    m_isWritten |= 1U << number;
  }

  void lookAtText(const WrittenClause& clause, const std::string& text) {
    const Slice<WrittenValue> values = m_written.valuesOf(clause);
    if (values.size() != 1 || !isKeptAs(values.front(), text)) {
      add(clause, written(values), orNothing(text));
      if (clause.clause == Clause::kOid) {
        m_differences.back().begin = m_differences.back().end = m_definition.end;
      }
    }
  }

  // A word that is the OID a second time does not change it.
  bool isRepeatedOid(const WrittenClause& clause) const {
    const std::string& oid = *m_fields.text(Clause::kOid);
    return clause.clause == Clause::kUnknown && clause.valueCount == 0 && clause.keyword == oid &&
           m_written.textOf(m_definition, Clause::kOid) == oid;
  }

  // What is kept and stands in no clause, and what lists have altogether.
  void lookAtField(Clause clause) {
    const auto number = static_cast<std::size_t>(clause);
    const bool isWritten = (m_isWritten >> number & 1U) != 0;
    if (const std::vector<std::string>* const list = m_fields.list(clause)) {
      if ((m_listDiffers >> number & 1U) != 0 || m_listSizes[number] != list->size()) {
        lookAtList(clause, *list);
      }
    } else if (const std::string* const text = m_fields.text(clause)) {
      if (!isWritten && *text != KeptFields::valueWithout(clause)) {
        addMade(clause, quotedForMessage(*text));
      }
    } else if (m_fields.isFlag(clause) && m_fields.isSet(clause) && !isWritten &&
               (clause != Clause::kStructural || namesKind())) {
      addMade(clause, std::string(keywordOf(clause)));
    }
  }

  // A class that names no kind is a structural one.
  bool namesKind() const {
    return std::any_of(kKinds.begin(), kKinds.end(), [&](Clause kind) {
      return (m_isWritten >> static_cast<std::size_t>(kind) & 1U) != 0;
    });
  }

  // What stands between the values that are kept at both ends of the list differs.
  void lookAtList(Clause clause, const std::vector<std::string>& list) {
    std::vector<const WrittenValue*> values;
    for (const WrittenClause& candidate : m_written.clausesOf(m_definition)) {
      if (candidate.clause == clause) {
        for (const WrittenValue& value : m_written.valuesOf(candidate)) {
          values.push_back(&value);
        }
      }
    }
    std::size_t same = 0;
    while (same < values.size() && same < list.size() && isKeptAs(*values[same], list[same])) {
      ++same;
    }
    std::size_t sameBehind = 0;
    while (sameBehind < values.size() - same && sameBehind < list.size() - same &&
           isKeptAs(*values[values.size() - 1 - sameBehind], list[list.size() - 1 - sameBehind])) {
      ++sameBehind;
    }
    std::vector<std::string> reads;
    for (std::size_t i = same; i < values.size() - sameBehind; ++i) {
      reads.emplace_back(values[i]->raw);
    }
    const std::vector<std::string> kept(list.begin() + static_cast<std::ptrdiff_t>(same),
                                        list.end() - static_cast<std::ptrdiff_t>(sameBehind));
    Difference made{Difference::kField, clause,           m_number,      0,
                    m_definition.end,   m_definition.end, joined(reads), joined(kept)};
    if (!reads.empty()) {
      made.begin = values[same]->offset;
      made.end = values[values.size() - 1 - sameBehind]->end;
    }
    made.offset =
        values.empty() ? m_definition.offset : values[std::min(same, values.size() - 1)]->offset;
    m_differences.push_back(std::move(made));
  }

  std::string sourceText(const WrittenClause& clause) const {
    return quotedForMessage(
        m_written.source().bytes().substr(clause.offset, clause.end - clause.offset));
  }

  static std::string written(const Slice<WrittenValue>& values) {
    std::vector<std::string> texts;
    for (const WrittenValue& value : values) {
      texts.emplace_back(value.raw);
    }
    return joined(texts);
  }

  void add(const WrittenClause& clause, std::string reads, std::string kept) {
    m_differences.push_back({Difference::kField, clause.clause, m_number, clause.offset,
                             clause.offset, clause.end, std::move(reads), std::move(kept)});
  }
  void addMade(Clause clause, std::string kept) {
    m_differences.push_back({Difference::kField, clause, m_number, m_definition.offset,
                             m_definition.end, m_definition.end, "nothing", std::move(kept)});
  }

  const WrittenFile& m_written;
  const WrittenDefinition& m_definition;
  std::uint32_t m_number;
  KeptFields m_fields;
  std::vector<Difference>& m_differences;
  std::array<std::size_t, KeptFields::kClauses> m_listSizes{};
  std::uint32_t m_listDiffers = 0;
  std::uint32_t m_isWritten = 0;
};

}  // namespace

bool isKeptAs(const WrittenValue& value, const std::string& kept) {
  if (value.raw == kept) {
    return true;
  }
  if (value.form == Form::kNumber) {
    return value.text() == kept;
  }
  const Keyword keyword = exactKeyword(value.raw);
  return keyword.sort == Keyword::kSection && keyword.text == kept;
}

std::string quotedForMessage(std::string_view text) {
  constexpr std::size_t kLongest = 60;
  constexpr char kDigits[] = "0123456789abcdef";
  std::string shown = "\"";
  const std::string_view beginning = text.substr(0, kLongest);
  for (const char c : beginning) {
    if (c >= ' ' && c < 127) {
      shown += c;
    } else {
      const auto byte = static_cast<unsigned char>(c);
      shown.append("\\x").append(1, kDigits[byte / 16]).append(1, kDigits[byte % 16]);
    }
  }
  return shown + (beginning.size() < text.size() ? "…\"" : "\"");
}

Differences::Differences(const WrittenFile& written, const KeptFile& kept)
    : m_written(written),
      m_kept(kept),
      m_keptOf(written.definitions().size(), Difference::kNone),
      m_beginsAlike(written.definitions().size(), false) {
  match();
  for (std::size_t i = 0; i < m_keptOf.size(); ++i) {
    compare(i);
  }
  if (kept.ending() != ReadingEnd::kWhole) {
    const bool isEndless = kept.ending() == ReadingEnd::kNeverEnds;
    add({Difference::kEnds, Clause::kUnknown, Difference::kNone, kept.endOffset(), kept.endOffset(),
         kept.endOffset(), "text",
         isEndless ? "nothing: the reading does not come back" : "nothing: the reading fails"});
  }
  std::stable_sort(
      m_differences.begin(), m_differences.end(),
      [](const Difference& left, const Difference& right) { return left.begin < right.begin; });
}

const KeptDefinition* Differences::keptOf(std::size_t definition) const {
  const std::uint32_t number = m_keptOf[definition];
  return number == Difference::kNone ? nullptr : &m_kept.definitions()[number];
}

bool Differences::isUnread(std::size_t offset) const {
  return m_kept.ending() != ReadingEnd::kWhole && offset >= m_kept.endOffset();
}

// A kept definition is the one that is written where it begins: at its "(", or where a "(" that the
// reader takes for something else leaves it to begin. Of several, the last one.
void Differences::match() {
  const std::vector<KeptDefinition>& kept = m_kept.definitions();
  std::size_t next = 0;
  const auto made = [&](std::size_t number) {
    const KeptDefinition& definition = kept[number];
    if (definition.isEntered) {
      add({Difference::kMade, Clause::kUnknown, Difference::kNone, definition.offset,
           definition.offset, definition.offset, "nothing", described(definition)});
    }
  };
  for (std::size_t i = 0; i < m_keptOf.size(); ++i) {
    const WrittenDefinition& definition = m_written.definitions()[i];
    const std::size_t inside = definition.clauseCount == 0
                                   ? definition.offset
                                   : m_written.clausesOf(definition).front().offset;
    std::size_t found = kept.size();
    for (; next < kept.size() && kept[next].offset <= inside; ++next) {
      if (found != kept.size()) {
        made(found);
      }
      found = next;
    }
    if (found == kept.size()) {
      continue;
    }
    if (kept[found].kind != definition.kind || kept[found].end <= definition.offset) {
      made(found);
      continue;
    }
    m_keptOf[i] = static_cast<std::uint32_t>(found);
    m_beginsAlike[i] =
        kept[found].offset >= definition.offset && kept[found].isInBlock == definition.isInBlock;
  }
  for (; next < kept.size(); ++next) {
    made(next);
  }
}

void Differences::compare(std::size_t definition) {
  const WrittenDefinition& written = m_written.definitions()[definition];
  const auto number = static_cast<std::uint32_t>(definition);
  const KeptDefinition* const kept = keptOf(definition);
  if (kept == nullptr || !kept->isEntered) {
    add({Difference::kLost, kept == nullptr ? Clause::kUnknown : Clause::kOid, number,
         written.offset, written.offset, written.end, m_written.describe(written), "nothing"});
  }
  if (kept != nullptr) {
    FieldComparison(m_written, number, *kept, &m_differences).run();
  }
}

}  // namespace migration
