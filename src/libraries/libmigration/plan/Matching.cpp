#include "Matching.h"
#include "RuleSupport.h"

#include <unordered_map>

namespace migration {

namespace {

using Member = const Entry* MatchRow::*;
constexpr Member kSides[3] = {&MatchRow::base, &MatchRow::old, &MatchRow::latest};

// The rows of one kind while they are made.
class Rows {
 public:
  Rows(Kind kind, const Side* base, const Side& old, const Side& latest)
      : m_kind(kind), m_sides{base, &old, &latest} {}

  std::vector<MatchRow> make() {
    for (std::size_t side = 0; side < 3; ++side) {
      if (m_sides[side] == nullptr) {
        continue;
      }
      for (const Entry* const entry : m_sides[side]->of(m_kind)) {
        m_rowOf[entry] = m_rows.size();
        m_rows.push_back({m_kind, nullptr, nullptr, nullptr, kNoRow});
        m_rows.back().*kSides[side] = entry;
      }
    }
    match(0, 1);
    match(0, 2);
    match(1, 2);
    return inOrder();
  }

 private:
  // Matches what of both sides has no partner on the other yet.
  void match(std::size_t left, std::size_t right) {
    if (m_sides[left] == nullptr || m_sides[right] == nullptr) {
      return;
    }
    std::vector<const Entry*> rest;
    for (const Entry* const mine : m_sides[left]->of(m_kind)) {
      const Entry* const theirs = m_sides[right]->byOid(m_kind, oidOf(*mine));
      if (theirs == nullptr || m_sides[left]->byOid(m_kind, oidOf(*mine)) != mine ||
          !join(mine, left, theirs, right)) {
        rest.push_back(mine);
      }
    }
    for (const Entry* const mine : rest) {
      const Entry* const theirs = m_sides[right]->byFirstName(m_kind, foldedFirstNameOf(*mine));
      if (theirs != nullptr) {
        join(mine, left, theirs, right);
      }
    }
  }

  // Two rows become one unless both have a definition of the same side.
  bool join(const Entry* mine, std::size_t left, const Entry* theirs, std::size_t right) {
    MatchRow& row = m_rows[m_rowOf[mine]];
    MatchRow& other = m_rows[m_rowOf[theirs]];
    if (&row == &other || row.*kSides[right] != nullptr || other.*kSides[left] != nullptr) {
      return false;
    }
    for (const Member side : kSides) {
      if (row.*side != nullptr && other.*side != nullptr) {
        return false;
      }
    }
    for (const Member side : kSides) {
      if (other.*side != nullptr) {
        row.*side = other.*side;
        m_rowOf[other.*side] = static_cast<std::size_t>(&row - m_rows.data());
        other.*side = nullptr;
      }
    }
    return true;
  }

  std::vector<MatchRow> inOrder() const {
    std::vector<MatchRow> ordered;
    const auto take = [&](std::size_t side, auto isFirst) {
      if (m_sides[side] == nullptr) {
        return;
      }
      for (const Entry* const entry : m_sides[side]->of(m_kind)) {
        const MatchRow& row = m_rows[m_rowOf.at(entry)];
        if (isFirst(row)) {
          ordered.push_back(row);
        }
      }
    };
    take(2, [](const MatchRow&) { return true; });
    take(1, [](const MatchRow& row) { return row.latest == nullptr; });
    take(0, [](const MatchRow& row) { return row.latest == nullptr && row.old == nullptr; });
    return ordered;
  }

  Kind m_kind;
  const Side* m_sides[3];
  std::vector<MatchRow> m_rows;
  std::unordered_map<const Entry*, std::size_t> m_rowOf;
};

// The extensions of the attribute types in `rows`, and then those without one.
class Extensions {
 public:
  Extensions(const Side* base, const Side& old, const Side& latest)
      : m_sides{base, &old, &latest} {}

  void addTo(std::vector<MatchRow>* rows, std::size_t attributeCount) {
    for (std::size_t attribute = 0; attribute < attributeCount; ++attribute) {
      MatchRow row{Kind::kVendorExtension, nullptr, nullptr, nullptr, attribute};
      for (std::size_t side = 0; side < 3; ++side) {
        const Entry* const type = (*rows)[attribute].*kSides[side];
        const Entry* const extension =
            type == nullptr ? nullptr : m_sides[side]->byOid(row.kind, oidOf(*type));
        if (extension != nullptr && m_taken.emplace(extension, true).second) {
          row.*kSides[side] = extension;
        }
      }
      if (row.base != nullptr || row.old != nullptr || row.latest != nullptr) {
        rows->push_back(row);
      }
    }
    addRest(rows);
  }

 private:
  void addRest(std::vector<MatchRow>* rows) {
    std::unordered_map<std::string_view, std::size_t> byOid;
    for (std::size_t row = 0; row < rows->size(); ++row) {
      for (const Member side : kSides) {
        const Entry* const extension = (*rows)[row].*side;
        if ((*rows)[row].kind == Kind::kVendorExtension && extension != nullptr) {
          byOid.emplace(oidOf(*extension), row);
        }
      }
    }
    for (const std::size_t side : {2U, 1U, 0U}) {
      if (m_sides[side] == nullptr) {
        continue;
      }
      for (const Entry* const extension : m_sides[side]->of(Kind::kVendorExtension)) {
        if (m_taken.count(extension) != 0) {
          continue;
        }
        const auto place = byOid.find(oidOf(*extension));
        std::size_t row = place == byOid.end() ? rows->size() : place->second;
        if (row != rows->size() && !mayStandIn((*rows)[row], side, *extension, *rows)) {
          row = rows->size();
        }
        if (row == rows->size()) {
          rows->push_back({Kind::kVendorExtension, nullptr, nullptr, nullptr, kNoRow});
          byOid[oidOf(*extension)] = row;
        }
        (*rows)[row].*kSides[side] = extension;
      }
    }
  }

  // One that is without an attribute type on its side is not that of another one.
  static bool mayStandIn(const MatchRow& row, std::size_t side, const Entry& extension,
                         const std::vector<MatchRow>& rows) {
    const Entry* const type = row.attribute == kNoRow ? nullptr : rows[row.attribute].*kSides[side];
    return row.*kSides[side] == nullptr && (type == nullptr || oidOf(*type) == oidOf(extension));
  }

  const Side* m_sides[3];
  std::unordered_map<const Entry*, bool> m_taken;
};

}  // namespace

std::vector<MatchRow> matchDefinitions(const Side* base, const Side& old, const Side& latest) {
  std::vector<MatchRow> rows = Rows(Kind::kAttributeType, base, old, latest).make();
  const std::size_t attributeCount = rows.size();
  const std::vector<MatchRow> classes = Rows(Kind::kObjectClass, base, old, latest).make();
  rows.insert(rows.end(), classes.begin(), classes.end());
  Extensions(base, old, latest).addTo(&rows, attributeCount);
  return rows;
}

}  // namespace migration
