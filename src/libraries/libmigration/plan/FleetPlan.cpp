#include "FleetPlan.h"

#include <algorithm>
#include <array>
#include <cstdint>
#include <map>
#include <nlohmann/json.hpp>
#include <string_view>
#include <utility>

#include "CountingIterator.h"

namespace migration {

namespace {

using Json = nlohmann::json;

enum class Shape : std::uint8_t { kNull, kFlag, kNumber, kText, kObject, kArray };

// What stands at a place of the document.
struct Token {
  Shape shape = Shape::kNull;
  const std::string* text = nullptr;  // of a text
  bool flag = false;
  std::uint64_t number = 0;
};

constexpr std::string_view kNoText = "is no text";
constexpr std::string_view kNoObject = "is no object";
constexpr std::string_view kNoArray = "is no array";

constexpr std::array<std::string_view, 9> kSections = {"version",     "program",  "command",
                                                       "ready",       "options",  "inputs",
                                                       "definitions", "refusals", "failures"};
constexpr std::array<std::string_view, 10> kMembers = {
    "kind",   "oid",         "name",    "class",        "outcome",
    "reason", "fingerprint", "clauses", "otherClauses", "places"};

constexpr std::array<std::string_view, 3> kKinds = {"attribute-type", "object-class",
                                                    "vendor-extension"};

template <std::size_t kCount>
std::size_t placeIn(const std::array<std::string_view, kCount>& names, std::string_view name) {
  return static_cast<std::size_t>(std::find(names.begin(), names.end(), name) - names.begin());
}

// "'cn'" without its quotes.
std::string withoutQuotes(const std::string& text) {
  const bool isQuoted = text.size() > 1 && text.front() == '\'' && text.back() == '\'';
  return isQuoted ? text.substr(1, text.size() - 2) : text;
}

// By what all installations of a release know it: BASE's OID and name, or without BASE NEW's. What
// a site added goes by its own.
void nameAlike(bool hasBase, FleetPlanRow* row) {
  row->commonOid = row->oid;
  row->commonName = row->name;
  row->side = hasBase && row->isInBase   ? 'b'
              : !hasBase && row->isInNew ? 'n'
              : row->isInOld             ? 's'
                                         : 'r';
  for (const FleetClause& clause : row->clauses) {
    const std::string& value = hasBase ? clause.base : clause.latest;
    if (clause.clause == "OID" && !value.empty()) {
      row->commonOid = value;
    } else if (clause.clause == "NAME" && !value.empty()) {
      row->commonName = withoutQuotes(value);
    }
  }
}

// Takes the events of a parser, which goes on as long as they return true.
class PlanReading {
 public:
  explicit PlanReading(FleetPlan* plan) : m_plan(*plan) {}

  // What is wrong, and where in the document; empty when the text is no JSON.
  const std::string& problem() const { return m_problem; }

  // ---- Events ----

  bool null() { return value({}); }
  bool boolean(bool flag) { return value({Shape::kFlag, nullptr, flag, 0}); }
  bool number_integer(std::int64_t /*number*/) {
    return value({Shape::kNumber, nullptr, false, 0});
  }
  bool number_unsigned(std::uint64_t number) {
    return value({Shape::kNumber, nullptr, false, number});
  }
  bool number_float(double /*number*/, const std::string& /*text*/) {
    return value({Shape::kNumber, nullptr, false, 0});
  }
  bool string(std::string& text) { return value({Shape::kText, &text, false, 0}); }
  bool binary(Json::binary_t& /*bytes*/) { return value({}); }

  bool start_object(std::size_t /*size*/) { return open({Shape::kObject, nullptr, false, 0}); }
  bool start_array(std::size_t /*size*/) { return open({Shape::kArray, nullptr, false, 0}); }

  bool key(std::string& name) {
    m_steps.back().key = name;
    if (m_steps.size() == 1) {
      m_section = placeIn(kSections, name);
      m_seenSections |= 1U << m_section;
    } else if (m_steps.size() == 3 && isIn("definitions")) {
      m_member = placeIn(kMembers, name);
      m_seenMembers |= 1U << m_member;
    }
    return true;
  }

  bool end_object() {
    m_steps.pop_back();
    if (m_steps.empty()) {
      return hasAll(kSections, m_seenSections);
    }
    if (m_steps.size() == 2 && isIn("definitions") && !finishRow()) {
      return false;
    }
    return close();
  }
  bool end_array() {
    m_steps.pop_back();
    return close();
  }
  bool parse_error(std::size_t /*position*/, const std::string& /*token*/,
                   const Json::exception& /*error*/) {
    return false;
  }

 private:
  struct Step {
    bool isArray = false;
    std::size_t index = 0;  // of the element that comes next
    std::string key;
  };

  // ---- The way to where it stands ----

  bool isIn(std::string_view section) const {
    return m_section < kSections.size() && kSections[m_section] == section;
  }
  bool isAt(std::string_view member) const {
    return m_member < kMembers.size() ? kMembers[m_member] == member : m_steps[2].key == member;
  }
  const std::string& keyAt(std::size_t depth) const { return m_steps[depth - 1].key; }

  bool fail(std::string_view text) {
    std::string where;
    for (const Step& step : m_steps) {
      where += "/" + (step.isArray ? std::to_string(step.index) : step.key);
    }
    m_problem = (where.empty() ? "it" : where) + " " + std::string(text);
    return false;
  }
  bool expect(bool isSo, std::string_view otherwise) { return isSo || fail(otherwise); }

  template <std::size_t kCount>
  bool hasAll(const std::array<std::string_view, kCount>& names, std::uint32_t seen) {
    for (std::size_t i = 0; i < kCount; ++i) {
      if ((seen & (1U << i)) == 0) {
        return fail("has no member " + std::string(names[i]));
      }
    }
    return true;
  }

  bool open(const Token& token) {
    if (!look(token)) {
      return false;
    }
    m_steps.push_back({token.shape == Shape::kArray, 0, ""});
    return true;
  }
  bool close() {
    m_steps.back().index += m_steps.back().isArray ? 1 : 0;
    return true;
  }
  bool value(const Token& token) { return look(token) && (m_steps.empty() || close()); }

  // ---- What stands there ----

  bool takeText(const Token& token, std::string* text) {
    if (token.shape != Shape::kText) {
      return fail(kNoText);
    }
    *text = *token.text;  // which has room already, mostly
    return true;
  }
  // What one of the sides may not have.
  bool takeTextOrNull(const Token& token, std::string* text) {
    return token.shape == Shape::kNull || takeText(token, text);
  }
  bool addText(const Token& token, std::vector<std::string>* texts) {
    texts->emplace_back();
    return takeText(token, &texts->back());
  }

  bool look(const Token& token) {
    switch (m_steps.size()) {
      case 0:
        return expect(token.shape == Shape::kObject, kNoObject);
      case 1:
        return lookAtSection(token);
      case 2:
        return lookInSection(token);
      default:
        return isIn("definitions")
                   ? (m_steps.size() == 3 ? lookAtMember(token) : lookInMember(token))
               : isIn("inputs") ? lookInInput(token)
                                : true;
    }
  }

  bool lookAtSection(const Token& token) {
    if (isIn("version")) {
      return expect(token.shape == Shape::kNumber, "is no number") &&
             expect(token.number == 1, "is " + std::to_string(token.number) +
                                           ", and this program reads version 1; it was written by "
                                           "another version of the program");
    }
    if (isIn("command")) {
      return expect(token.shape == Shape::kText, kNoText) &&
             expect(*token.text != "diff", "is diff, whose document need not be the whole plan") &&
             expect(*token.text == "plan" || *token.text == "migrate",
                    "is no command that makes a plan");
    }
    if (isIn("ready")) {
      m_plan.isReady = token.flag;
      return expect(token.shape == Shape::kFlag, "is neither true nor false");
    }
    if (isIn("program") || isIn("options")) {
      return expect(token.shape == Shape::kObject, kNoObject);
    }
    return m_section == kSections.size() || expect(token.shape == Shape::kArray, kNoArray);
  }

  bool lookInSection(const Token& token) {
    if (isIn("program") && keyAt(2) == "name") {
      return expect(token.shape == Shape::kText && *token.text == "schema-migrate",
                    "is another program");
    }
    if (isIn("options")) {
      m_isWithoutBase = m_isWithoutBase || (keyAt(2) == "base" && token.shape == Shape::kNull);
      return keyAt(2) == "base" ? takeTextOrNull(token, &m_plan.base)
             : keyAt(2) == "to" ? takeText(token, &m_plan.latest)
                                : true;
    }
    if (isIn("refusals") || isIn("failures")) {
      ++m_plan.refusals;
    } else if (isIn("inputs")) {
      m_plan.files.emplace_back();
      return expect(token.shape == Shape::kObject, kNoObject);
    } else if (isIn("definitions")) {
      beginRow();
      return expect(token.shape == Shape::kObject, kNoObject);
    }
    return true;
  }

  bool lookInInput(const Token& token) {
    FleetPlanFile& file = m_plan.files.back();
    if (m_steps.size() != 3) {
      return true;
    }
    return keyAt(3) == "role"     ? takeText(token, &file.role)
           : keyAt(3) == "path"   ? takeText(token, &file.path)
           : keyAt(3) == "sha256" ? takeText(token, &file.sha256)
                                  : true;
  }

  // A member of a definition.
  bool lookAtMember(const Token& token) {
    constexpr std::array<std::string FleetPlanRow::*, 7> kTexts = {
        &FleetPlanRow::kind,       &FleetPlanRow::oid,     &FleetPlanRow::name,
        &FleetPlanRow::change,     &FleetPlanRow::outcome, &FleetPlanRow::reason,
        &FleetPlanRow::fingerprint};
    FleetPlanRow& row = m_row;
    if (m_member < kTexts.size()) {
      return takeText(token, &(row.*kTexts[m_member])) &&
             (m_member != 0 || expect(placeIn(kKinds, row.kind) != kKinds.size(), "is no kind"));
    }
    if (isAt("clauses") || isAt("otherClauses")) {
      return expect(token.shape == Shape::kArray, kNoArray);
    }
    if (isAt("question")) {
      row.isQuestion = token.shape == Shape::kObject;
      m_hasQuestions = true;
      return expect(row.isQuestion || token.shape == Shape::kNull, kNoObject);
    }
    return !isAt("places") || expect(token.shape == Shape::kObject, kNoObject);
  }

  // And what stands in it.
  bool lookInMember(const Token& token) {
    FleetPlanRow& row = m_row;
    if (isAt("clauses")) {
      return lookInClauses(token, &row.clauses);
    }
    if (isAt("otherClauses")) {
      return lookInValues(token);
    }
    if (isAt("question")) {
      return lookInQuestion(token, &row);
    }
    if (isAt("places") && m_steps.size() == 4) {
      const bool isThere = token.shape == Shape::kObject;
      const std::string& side = keyAt(4);
      row.isInBase = side == "base" ? isThere : row.isInBase;
      row.isInOld = side == "old" ? isThere : row.isInOld;
      row.isInNew = side == "new" ? isThere : row.isInNew;
      return expect(isThere || token.shape == Shape::kNull, kNoObject);
    }
    return true;
  }

  bool lookInClauses(const Token& token, std::vector<FleetClause>* clauses) {
    if (m_steps.size() == 4) {
      clauses->emplace_back();
      return expect(token.shape == Shape::kObject, kNoObject);
    }
    const std::string& member = keyAt(5);
    FleetClause& clause = clauses->back();
    return m_steps.size() != 5  ? true
           : member == "clause" ? takeText(token, &clause.clause)
           : member == "base"   ? takeTextOrNull(token, &clause.base)
           : member == "old"    ? takeTextOrNull(token, &clause.old)
           : member == "new"    ? takeTextOrNull(token, &clause.latest)
                                : true;
  }

  bool lookInValues(const Token& token) {
    if (m_steps.size() == 4) {
      if (m_valueCount++ == m_row.values.size()) {
        m_row.values.emplace_back();
      }
      return expect(token.shape == Shape::kObject, kNoObject);
    }
    const std::string& member = keyAt(5);
    FleetValue& value = m_row.values[m_valueCount - 1];
    return m_steps.size() != 5  ? true
           : member == "clause" ? takeText(token, &value.first)
           : member == "value"  ? takeText(token, &value.second)
                                : true;
  }

  bool lookInQuestion(const Token& token, FleetPlanRow* row) {
    const std::string& member = keyAt(4);
    if (m_steps.size() == 4) {
      if (member == "by" && token.shape == Shape::kText) {
        row->isByName = *token.text == "name";
      } else if (member == "move") {
        row->mayMove = token.flag;
      }
      return true;
    }
    if (member == "take" && m_steps.size() == 5) {
      return addText(token, &row->takes);
    }
    const bool isClause = member == "clauses" && m_steps.size() == 6 && keyAt(6) == "clause";
    return !isClause || addText(token, &row->openClauses);
  }

  // What is read of a row stands where the last one stood, unless that was kept.
  void beginRow() {
    m_seenMembers = 0;
    m_valueCount = 0;
    m_row.clauses.clear();
    m_row.takes.clear();
    m_row.openClauses.clear();
    m_row.isInBase = m_row.isInOld = m_row.isInNew = false;
    m_row.isQuestion = m_row.isByName = m_row.mayMove = false;
  }

  // What nobody but the release touched, whatever else the document says.
  bool isUntouched() const {
    const bool isSame = m_row.change == "same" && m_row.isInOld && m_row.clauses.empty() &&
                        (m_row.isInBase || m_isWithoutBase);
    return !m_row.isUndecided() &&
           (isSame || m_row.change == "changed-by-release" || m_row.change == "added-by-release");
  }

  bool finishRow() {
    if (!hasAll(kMembers, m_seenMembers)) {
      return false;
    }
    if (isUntouched()) {
      nameAlike(!m_isWithoutBase, &m_row);
      m_plan.untouched.add(m_row);
      return true;
    }
    // A document that does not tell its questions yet.
    m_row.isQuestion = m_row.isUndecided() && (m_row.isQuestion || !m_hasQuestions);
    m_row.values.resize(m_valueCount);
    m_plan.rows.push_back(std::move(m_row));
    m_row = FleetPlanRow();
    return true;
  }

  FleetPlan& m_plan;
  std::string m_problem;
  std::vector<Step> m_steps;
  std::size_t m_section = kSections.size();
  std::size_t m_member = kMembers.size();
  std::uint32_t m_seenSections = 0;
  std::uint32_t m_seenMembers = 0;
  bool m_hasQuestions = false;
  bool m_isWithoutBase = false;  // that it has none is known
  FleetPlanRow m_row;            // that is being read
  std::size_t m_valueCount = 0;  // of its values that it has
};

void nameAll(FleetPlan* plan) {
  for (FleetPlanRow& row : plan->rows) {
    nameAlike(!plan->base.empty(), &row);
    if (row.kind == "attribute-type" && row.oid != row.commonOid) {
      plan->renumbered[row.oid] = row.commonOid;
    }
  }
  for (FleetPlanRow& row : plan->rows) {
    plan->followAttribute(&row);
  }
}

}  // namespace

void UntouchedRows::add(const FleetPlanRow& row) {
  Row added;
  added.begin = m_bytes.size();
  added.lengths = {row.commonOid.size(), row.commonName.size(), row.oid.size()};
  added.kind = static_cast<std::uint8_t>(placeIn(kKinds, row.kind));
  added.side = row.side;
  m_bytes.append(row.commonOid).append(row.commonName).append(row.oid);
  m_rows.push_back(added);
}

void UntouchedRows::copy(std::size_t at, FleetPlanRow* row) const {
  const Row& kept = m_rows[at];
  const auto& [common, name, own] = kept.lengths;
  row->kind = kKinds[kept.kind];
  row->side = kept.side;
  row->commonOid.assign(m_bytes, kept.begin, common);
  row->commonName.assign(m_bytes, kept.begin + common, name);
  row->oid.assign(m_bytes, kept.begin + common + name, own);
}

void FleetPlan::followAttribute(FleetPlanRow* row) const {
  const auto found = row->kind == "vendor-extension" && !renumbered.empty()
                         ? renumbered.find(row->oid)
                         : renumbered.end();
  if (found != renumbered.end()) {
    row->commonOid = found->second;
  }
}

bool readFleetPlan(const Source& source, FleetPlan* plan, Failures* failures) {
  const std::string_view bytes = source.bytes();
  const char* reached = bytes.data();
  PlanReading reading(plan);
  if (Json::sax_parse(CountingIterator(bytes.data(), &reached),
                      CountingIterator(bytes.data() + bytes.size(), &reached), &reading)) {
    nameAll(plan);
    return true;
  }
  // What is told is the last that was read.
  const auto offset = static_cast<std::size_t>(reached - bytes.data());
  const Place place = source.placeOf(offset == 0 ? 0 : offset - 1);
  failures->push_back(
      {source.path(), place.line, place.column, "",
       "is no saved plan: " + (reading.problem().empty() ? "the JSON text is wrong or ends here"
                                                         : reading.problem())});
  return false;
}

}  // namespace migration
