#include "Origins.h"

#include <map>
#include <string_view>
#include <unordered_map>
#include <utility>

#include "ResultIndex.h"

namespace migration {

namespace {

std::string idOf(Kind kind, const std::string& oid) {
  return static_cast<char>('0' + static_cast<int>(kind)) + oid;
}

SourcePlace placeOf(const char* side, const Entry& entry) {
  return {side, entry.file->source->path(), entry.place().line};
}

class Tracer {
 public:
  explicit Tracer(const MigrationPlan& plan) : m_plan(plan) {
    for (const Verdict& row : plan.threeWay.differences) {
      if (row.isInResult()) {
        m_rows.emplace(idOf(row.kind(), oidInResult(row)), &row);
      }
    }
  }

  Origin originOf(const Entry& entry) {
    Origin origin;
    origin.file = entry.file->name;
    origin.line = entry.place().line;
    origin.kind = entry.kind();
    origin.oid = entry.kept->object->oidInPlace();
    const Values& names = entry.kept->object->namesInPlace();
    origin.name = names.empty() ? std::string() : names.front();
    const std::string id = idOf(entry.kind(), origin.oid);
    const std::size_t before = m_seen[origin.file + " " + id]++;
    const auto found = m_rows.find(id);
    if (found != m_rows.end()) {
      const Verdict& row = *found->second;
      origin.outcome = row.outcome;
      origin.decision = row.decision;
      origin.sources = row.isCarried() ? sourcesOf(row) : ofNew(row, origin, before);
    }
    return origin;
  }

 private:
  static std::vector<SourcePlace> sourcesOf(const Verdict& row) {
    std::vector<SourcePlace> sources;
    if (row.outcome == Outcome::kText) {
      return sources;
    }
    if (row.match.old != nullptr) {
      sources.push_back(placeOf("old", *row.match.old));
    }
    if (row.outcome == Outcome::kMerged && row.match.latest != nullptr) {
      sources.push_back(placeOf("new", *row.match.latest));
    }
    return sources;
  }

  // Of several that NEW has in a file, the one in the same order.
  std::vector<SourcePlace> ofNew(const Verdict& row, const Origin& origin,
                                 std::size_t before) const {
    for (const Entry* const entry : m_plan.latest->allByOid(origin.kind, origin.oid)) {
      if (entry->file->name == origin.file && before-- == 0) {
        return {placeOf("new", *entry)};
      }
    }
    return {placeOf("new", *row.match.latest)};
  }

  const MigrationPlan& m_plan;
  std::unordered_map<std::string, const Verdict*> m_rows;
  std::unordered_map<std::string, std::size_t> m_seen;
};

// So that neither a tab nor a line end in it is taken for the table's.
std::string cell(std::string_view text) {
  constexpr std::string_view kDigits = "0123456789ABCDEF";
  std::string escaped;
  for (const char c : text) {
    const auto byte = static_cast<unsigned char>(c);
    if (byte >= 0x20 && byte != 0x7f) {
      escaped += c;
    } else {
      escaped.append("\\x").append(1, kDigits[byte >> 4U]).append(1, kDigits[byte & 15U]);
    }
  }
  return escaped.empty() ? "-" : escaped;
}

}  // namespace

std::vector<Origin> originsOf(const MigrationPlan& plan, const std::vector<NamedText>& outputs) {
  const Installation installation = Installation::overTexts("output", outputs);
  Tracer tracer(plan);
  std::vector<Origin> origins;
  origins.reserve(installation.entries().size());
  for (const Entry& entry : installation.entries()) {
    origins.push_back(tracer.originOf(entry));
  }
  return origins;
}

std::string tableOf(const std::vector<Origin>& origins) {
  std::string table = "file\tline\tkind\toid\tname\toutcome\tfrom\tdecision\n";
  for (const Origin& origin : origins) {
    std::string from;
    for (const SourcePlace& source : origin.sources) {
      from.append(from.empty() ? "" : ", ")
          .append(source.side)
          .append(" ")
          .append(source.path)
          .append(":")
          .append(std::to_string(source.line));
    }
    table.append(cell(origin.file))
        .append("\t")
        .append(std::to_string(origin.line))
        .append("\t")
        .append(wordOf(origin.kind))
        .append("\t")
        .append(cell(origin.oid))
        .append("\t")
        .append(cell(origin.name))
        .append("\t")
        .append(wordOf(origin.outcome))
        .append("\t")
        .append(cell(from))
        .append("\t")
        .append(cell(origin.decision))
        .append("\n");
  }
  return table;
}

}  // namespace migration
