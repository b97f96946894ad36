#include "SavedPlan.h"

#include <algorithm>
#include <cstddef>
#include <map>
#include <nlohmann/json.hpp>
#include <string_view>
#include <utility>

#include "CountingIterator.h"
#include "PlanDocument.h"

namespace migration {

namespace {

// The order of members means nothing here.
using Json = nlohmann::json;
using Pointer = Json::json_pointer;

// ---- Places ----

// Where a document, which can be parsed, has the member or element that `wanted` leads to.
class Finder {
 public:
  explicit Finder(const Pointer& wanted) : m_wanted(wanted.to_string()) {}

  std::size_t offsetIn(std::string_view bytes) {
    const char* reached = bytes.data();
    const auto look = [&](int /*depth*/, Json::parse_event_t event, const Json& parsed) {
      enter(event, parsed);
      if (m_offset == 0 && path() == m_wanted) {
        m_offset = static_cast<std::size_t>(reached - bytes.data());
      }
      leave(event);
      return true;
    };
    const Json whole = Json::parse(CountingIterator(bytes.data(), &reached),
                                   CountingIterator(bytes.data() + bytes.size(), &reached), look);
    return m_offset == 0 ? 0 : m_offset - 1;
  }

 private:
  struct Step {
    bool isArray = false;
    std::size_t index = 0;  // of the next element
    std::string key;
  };

  void enter(Json::parse_event_t event, const Json& parsed) {
    if (event == Json::parse_event_t::key) {
      m_steps.back().key = parsed.get<std::string>();
    }
  }

  void leave(Json::parse_event_t event) {
    using Event = Json::parse_event_t;
    if (event == Event::object_start || event == Event::array_start) {
      m_steps.push_back({event == Event::array_start, 0, ""});
      return;
    }
    if (event == Event::object_end || event == Event::array_end) {
      m_steps.pop_back();
    }
    if (event != Event::key && !m_steps.empty()) {
      ++m_steps.back().index;
    }
  }

  std::string path() const {
    Pointer pointer;
    for (const Step& step : m_steps) {
      if (step.isArray) {
        pointer /= step.index;
      } else {
        pointer /= step.key;
      }
    }
    return pointer.to_string();
  }

  std::string m_wanted;
  std::vector<Step> m_steps;
  std::size_t m_offset = 0;
};

// ---- Reading ----

struct Malformed {
  Pointer at;
  std::string text;
};

// A value of the document and where it stands.
class Value {
 public:
  Value(const Json& json, Pointer at) : m_json(json), m_at(std::move(at)) {}

  Value member(const char* name) const {
    if (!m_json.is_object() || !m_json.contains(name)) {
      throw Malformed{m_at, std::string("has no member ") + name};
    }
    return {m_json.at(name), m_at / std::string(name)};
  }

  std::vector<Value> elements() const {
    expect(m_json.is_array(), "is no array");
    std::vector<Value> elements;
    elements.reserve(m_json.size());
    for (std::size_t i = 0; i < m_json.size(); ++i) {
      elements.emplace_back(m_json[i], m_at / i);
    }
    return elements;
  }

  bool boolean() const {
    expect(m_json.is_boolean(), "is neither true nor false");
    return m_json.get<bool>();
  }

  std::string text() const {
    expect(m_json.is_string(), "is no text");
    return m_json.get<std::string>();
  }
  std::string path() const {
    std::string path = text();
    expect(!path.empty() && path.find('\0') == std::string::npos, "is no path");
    return path;
  }
  std::string pathOrNull() const { return m_json.is_null() ? std::string() : path(); }
  std::string sha256() const {
    std::string digest = text();
    expect(digest.size() == 64 && digest.find_first_not_of("0123456789abcdef") == std::string::npos,
           "is no SHA-256");
    return digest;
  }
  std::vector<std::string> paths() const {
    std::vector<std::string> paths;
    for (const Value& element : elements()) {
      paths.push_back(element.path());
    }
    return paths;
  }

  const Json& json() const { return m_json; }

  void expect(bool isSo, const char* otherwise) const {
    if (!isSo) {
      throw Malformed{m_at, otherwise};
    }
  }

 private:
  const Json& m_json;
  Pointer m_at;
};

Prefer preferOf(const Value& value) {
  if (value.json().is_null()) {
    return Prefer::kNothing;
  }
  const std::string side = value.text();
  value.expect(side == "old" || side == "new", "is neither old nor new");
  return side == "old" ? Prefer::kOld : Prefer::kNew;
}

PlanRequest requestOf(const Value& options) {
  PlanRequest request;
  request.base = options.member("base").pathOrNull();
  request.old = options.member("from").path();
  request.latest = options.member("to").path();
  request.excludeLists = options.member("excludeOids").paths();
  request.withdrawList = options.member("withdraw").pathOrNull();
  request.decisions = options.member("decisions").paths();
  request.prefer = preferOf(options.member("prefer"));
  request.acceptBase = options.member("acceptBase").boolean();
  request.allowUnused = options.member("allowUnused").boolean();
  request.isRepaired = options.member("repair").boolean();
  return request;
}

void checkOrigin(const Value& document) {
  document.member("version").expect(document.member("version").json() == 1,
                                    "is no version of the document that can be read here");
  const Value name = document.member("program").member("name");
  name.expect(name.text() == "schema-migrate", "is another program");
  const Value command = document.member("command");
  command.expect(command.text() != "diff", "is diff, whose document need not be the whole plan");
  command.expect(command.text() == "plan" || command.text() == "migrate",
                 "is no command that makes a plan");
}

SavedPlan planOf(const Source& source, const Value& document) {
  checkOrigin(document);
  SavedPlan plan;
  plan.source = &source;
  plan.command = document.member("command").text();
  plan.programVersion = document.member("program").member("version").text();
  plan.request = requestOf(document.member("options"));
  for (const Value& input : document.member("inputs").elements()) {
    plan.inputs.push_back({input.member("role").text(), input.member("path").path(),
                           input.member("sha256").sha256()});
  }
  for (const Value& output : document.member("outputs").elements()) {
    plan.outputs.push_back({output.member("file").path(), output.member("sha256").sha256()});
  }
  for (const Value& definition : document.member("definitions").elements()) {
    static_cast<void>(definition.member("kind").text());
  }
  return plan;
}

Failure failureAt(const Source& source, std::size_t offset, const std::string& text) {
  const Place place = source.placeOf(offset);
  return {source.path(), place.line, place.column, "", text};
}

// ---- What holds no longer ----

using InputKey = std::pair<std::string, std::string>;  // role and path

std::map<InputKey, std::string> byKey(const std::vector<PlanInput>& inputs) {
  std::map<InputKey, std::string> digests;
  for (const PlanInput& input : inputs) {
    digests[{input.role, input.path}] = input.sha256;
  }
  return digests;
}

std::string whyGone(const std::string& path, const Failures& failures) {
  const auto found = std::find_if(failures.begin(), failures.end(),
                                  [&](const Failure& failure) { return failure.file == path; });
  if (found == failures.end()) {
    return "is no longer there";
  }
  constexpr std::string_view kBeginning = "cannot be read: ";
  const bool isUsual = found->text.compare(0, kBeginning.size(), kBeginning) == 0;
  return "cannot be read any more: " + found->text.substr(isUsual ? kBeginning.size() : 0);
}

void compareInputs(const SavedPlan& saved, const MigrationPlan& again, Failures* changes) {
  const std::map<InputKey, std::string> then = byKey(saved.inputs);
  const std::map<InputKey, std::string> now = byKey(again.inputs);
  for (const auto& [key, digest] : then) {
    const auto found = now.find(key);
    if (found == now.end()) {
      changes->push_back({key.second, 0, 0, "",
                          "the plan was made from it (" + key.first + "), and it " +
                              whyGone(key.second, again.failures)});
    } else if (found->second != digest) {
      changes->push_back({key.second, 0, 0, "",
                          "is not what the plan was made from (" + key.first +
                              "): its SHA-256 was " + digest + ", and is " + found->second});
    }
  }
  for (const auto& [key, digest] : now) {
    if (then.count(key) == 0) {
      changes->push_back(
          {key.second, 0, 0, "", "is new: the plan was made without it (" + key.first + ")"});
    }
  }
}

std::string shown(const Json& value) {
  return value.is_string() ? value.get<std::string>()
                           : value.dump(-1, ' ', true, Json::error_handler_t::replace);
}

std::string nameOf(const Json& definition) {
  return shown(definition.value("kind", Json(""))) + " " +
         shown(definition.value("name", Json(""))) + " (" +
         shown(definition.value("oid", Json(""))) + ")";
}

void compareMembers(const SavedPlan& saved, const Json& then, const Json& now, Failures* changes) {
  for (const auto& [key, value] : now.items()) {
    const Json recorded = then.value(key, Json(nullptr));
    if (recorded != value) {
      changes->push_back({saved.source->path(), 0, 0, "",
                          nameOf(then) + ": " + key + " is " + shown(recorded) +
                              " in the plan, and its inputs give " + shown(value)});
    }
  }
  for (const auto& [key, value] : then.items()) {
    if (!now.contains(key)) {
      changes->push_back({saved.source->path(), 0, 0, "",
                          nameOf(then) + ": " + key + " does not belong into a plan"});
    }
  }
}

void compareDefinitions(const SavedPlan& saved, const Json& then, const Json& now,
                        Failures* changes) {
  const std::size_t count = std::max(then.size(), now.size());
  for (std::size_t i = 0; i < count; ++i) {
    const Json& one = i < then.size() ? then[i] : now[i];
    if (i >= then.size() || i >= now.size()) {
      changes->push_back({saved.source->path(), 0, 0, "",
                          nameOf(one) + (i < now.size() ? " is missing in the plan"
                                                        : " is nothing that its inputs give")});
      continue;
    }
    compareMembers(saved, one, now[i], changes);
  }
}

// The plan was changed after it was made.
void compareDocuments(const SavedPlan& saved, const MigrationPlan& again, Failures* changes) {
  const std::string fresh = planDocument(again, {saved.command, saved.programVersion});
  if (fresh == saved.source->bytes()) {
    return;
  }
  const Json then = Json::parse(saved.source->bytes());
  const Json now = Json::parse(fresh);
  compareDefinitions(saved, then["definitions"], now["definitions"], changes);
  for (const auto& [key, value] : now.items()) {
    if (key != "definitions" && then.value(key, Json(nullptr)) != value) {
      changes->push_back({saved.source->path(), 0, 0, "",
                          "\"" + key + "\" is not what the inputs of the plan give"});
    }
  }
  for (const auto& [key, value] : then.items()) {
    if (!now.contains(key)) {
      changes->push_back(
          {saved.source->path(), 0, 0, "", "\"" + key + "\" does not belong into a plan"});
    }
  }
}

}  // namespace

std::optional<SavedPlan> readSavedPlan(const Source& source, Failures* failures) {
  try {
    const Json document = Json::parse(source.bytes());
    try {
      return planOf(source, Value(document, Pointer()));
    } catch (const Malformed& malformed) {
      const std::string where = malformed.at.to_string();
      failures->push_back(
          failureAt(source, Finder(malformed.at).offsetIn(source.bytes()),
                    "is no saved plan: " + (where.empty() ? "it" : where) + " " + malformed.text));
    }
  } catch (const Json::parse_error& error) {
    const std::size_t offset = error.byte == 0 ? 0 : error.byte - 1;
    failures->push_back(
        failureAt(source, offset, "is no saved plan: the JSON text is wrong or ends here"));
  }
  return std::nullopt;
}

Failures changesSince(const SavedPlan& saved, const MigrationPlan& again,
                      const std::string& programVersion) {
  Failures changes;
  if (saved.programVersion != programVersion) {
    changes.push_back({saved.source->path(), 0, 0, "",
                       "was made by version " + saved.programVersion +
                           " of the program, and this is " + programVersion});
  }
  compareInputs(saved, again, &changes);
  if (changes.empty() && again.failures.empty()) {
    compareDocuments(saved, again, &changes);
  }
  return changes;
}

}  // namespace migration
