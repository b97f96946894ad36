#include "MigrationPlan.h"

#include <sys/stat.h>

#include <algorithm>
#include <iterator>
#include <map>
#include <set>
#include <tuple>
#include <utility>

#include "Check.h"
#include "Decisions.h"
#include "Digest.h"
#include "InputFiles.h"
#include "OidList.h"
#include "Repair.h"
#include "ResultCheck.h"
#include "Settings.h"
#include "Staging.h"

namespace migration {

namespace {

void checkResult(MigrationPlan* plan) {
  plan->result.reset();
  plan->resultTexts = inNewsLayout(plan->request, plan->threeWay);
  plan->result = Installation::overTexts("result", plan->resultTexts);
  plan->newInResult = newInResult(*plan);
  for (const Finding& finding : plan->newInResult) {
    plan->refusals.push_back(
        {finding.file, finding.line, finding.column, finding.rule, finding.text});
  }
}

// What follows from the comparison.
void draw(MigrationPlan* plan) {
  const ThreeWay& threeWay = plan->threeWay;
  plan->refusals.insert(plan->refusals.end(), threeWay.failures.begin(), threeWay.failures.end());
  plan->undecidedCount = static_cast<std::size_t>(
      std::count_if(threeWay.differences.begin(), threeWay.differences.end(),
                    [](const Verdict& row) { return row.isUndecided(); }));
  if (plan->asked.isChecked) {
    checkResult(plan);
  }
}

class PlanMaker {
 public:
  explicit PlanMaker(const PlanRequest& request)
      : m_request(request), m_limits(request.limits), m_plan(std::make_unique<MigrationPlan>()) {}

  std::unique_ptr<MigrationPlan> make() {
    m_plan->asked = m_request;
    readInputs();
    if (!m_plan->failures.empty()) {
      return std::move(m_plan);
    }
    if (m_request.isChecked) {
      checkInputs();
    }
    // One directory may be two of the inputs.
    dropRepeated(&m_plan->ofInputs);
    dropRepeated(&m_plan->repairs);
    tell("comparing");
    m_plan->threeWay = compareThreeWay(m_plan->request);
    doubtBase();
    m_plan->inputRefusalCount = m_plan->refusals.size();
    if (m_request.isChecked) {
      tell("checking the result");
    }
    draw(m_plan.get());
    return std::move(m_plan);
  }

 private:
  using PlaceKey = std::tuple<std::string, std::uint64_t, std::uint64_t, std::string, std::string>;
  static PlaceKey keyOfPlace(const Finding& finding) {
    return {finding.file, finding.line, finding.column, finding.rule, finding.text};
  }

  static void dropRepeated(Findings* findings) {
    std::set<PlaceKey> told;
    findings->erase(std::remove_if(findings->begin(), findings->end(),
                                   [&](const Finding& finding) {
                                     return !told.insert(keyOfPlace(finding)).second;
                                   }),
                    findings->end());
  }

  void tell(const char* step) const {
    if (m_request.onStep) {
      m_request.onStep(step);
    }
  }

  // ---- Inputs ----

  void readInputs() {
    if (!m_request.base.empty()) {
      tell("reading BASE");
      m_plan->base = readInstallation("base", m_request.base);
      m_plan->request.base = &*m_plan->base;
    }
    tell("reading OLD");
    m_plan->old = readInstallation("old", m_request.old);
    tell("reading NEW");
    m_plan->latest = readInstallation("new", m_request.latest);
    m_plan->request.old = &*m_plan->old;
    m_plan->request.latest = &*m_plan->latest;
    m_plan->request.prefer = m_request.prefer;
    m_plan->request.allowUnused = m_request.allowUnused;
    for (const std::string& path : m_request.excludeLists) {
      m_excludeLists.push_back(readList("exclude", path, &m_plan->request.excluded));
    }
    if (!m_request.withdrawList.empty()) {
      m_withdrawList = readList("withdraw", m_request.withdrawList, &m_plan->request.withdrawn);
    }
    for (const std::string& path : m_request.decisions) {
      if (const Source* const source = readFile("decisions", path)) {
        readDecisions(*source, &m_plan->request.decisions, &m_plan->failures);
      }
    }
  }

  std::optional<Installation> readInstallation(const char* role, const std::string& directory) {
    Installation installation = Installation::fromDirectory(directory, m_limits, &m_plan->failures);
    m_limits.used += installation.size();
    for (const SchemaFile& file : installation.files()) {
      note(role, *file.source);
    }
    readSettings(directory);
    if (m_request.isRepaired) {
      std::vector<NamedText>& read = m_plan->asRead[role];
      for (const SchemaFile& file : installation.files()) {
        read.push_back({file.name, std::string(file.source->bytes()), file.mode});
      }
      installation = repaired(installation);
    }
    for (const SchemaFile& file : installation.files()) {
      if (file.kept->ending() != ReadingEnd::kWhole) {
        failToRead(file);
      }
    }
    return installation;
  }

  // What an installation says of its own findings, if it does.
  void readSettings(const std::string& directory) {
    const std::string path = directory + "/" + kSettingsFile;
    struct stat status {};
    Settings& settings = m_settings[directory];
    if (::stat(path.c_str(), &status) != 0) {
      return;
    }
    if (const Source* const source = readFile("settings", path)) {
      settings = migration::readSettings(*source, &m_plan->failures);
    }
  }

  // A copy in which is mended what can be, and whose places are those of the mended text.
  Installation repaired(const Installation& installation) {
    std::vector<NamedText> texts;
    for (const SchemaFile& file : installation.files()) {
      Repair repair = migration::repair(*file.written);
      for (RepairedPlace& change : repair.changes) {
        m_plan->repairs.push_back({std::move(change.rule), Severity::kWarning, file.source->path(),
                                   change.place.line, change.place.column, std::move(change.text),
                                   ""});
      }
      texts.push_back({file.name, std::move(repair.bytes), file.mode});
    }
    return Installation::fromTexts(installation.directory(), std::move(texts), ReadLimits::none(),
                                   &m_plan->failures);
  }

  // What is wrong with the text up to there, and then that the library does not get past it.
  void failToRead(const SchemaFile& file) {
    const Place place = file.source->placeOf(file.kept->endOffset());
    Findings findings;
    checkText(file, &findings);
    std::stable_sort(findings.begin(), findings.end(),
                     [](const Finding& one, const Finding& other) {
                       return std::tie(one.line, one.column) < std::tie(other.line, other.column);
                     });
    for (const Finding& finding : findings) {
      if (finding.severity == Severity::kError && finding.line <= place.line) {
        m_plan->failures.push_back(
            {finding.file, finding.line, finding.column, finding.rule, finding.text});
      }
    }
    m_plan->failures.push_back(
        {file.source->path(), place.line, place.column, "",
         file.kept->ending() == ReadingEnd::kNeverEnds
             ? "the server's library would never come to the end of this file, and stands here"
             : "the server's library fails to read this file, and stops here"});
  }

  const Source* readFile(const char* role, const std::string& path) {
    std::unique_ptr<Source> source = readSource(path, m_limits, &m_plan->failures);
    if (source == nullptr) {
      return nullptr;
    }
    m_limits.used += source->bytes().size();
    note(role, *source);
    m_plan->lists.push_back(std::move(source));
    return m_plan->lists.back().get();
  }

  const Source* readList(const char* role, const std::string& path, std::set<std::string>* oids) {
    const Source* const source = readFile(role, path);
    if (source != nullptr) {
      m_plan->oidLists.push_back(source);
      for (const OidWord& word : readOidList(*source)) {
        if (word.use == WordUse::kTaken) {
          oids->emplace(word.text);
        }
      }
    }
    return source;
  }

  void note(const char* role, const Source& source) {
    m_plan->inputs.push_back({role, source.path(), sha256Of(source.bytes())});
  }

  // ---- Findings ----

  void checkInputs() {
    if (m_plan->base) {
      tell("checking BASE");
      CheckRequest request;
      request.installation = &*m_plan->base;
      addFindings(request, m_request.base, false);
    }
    tell("checking OLD");
    CheckRequest request;
    request.installation = &*m_plan->old;
    request.against = &*m_plan->latest;
    request.excludeLists = m_excludeLists;
    request.withdrawList = m_withdrawList;
    addFindings(request, m_request.old, true);
    tell("checking NEW");
    CheckRequest ofNew;
    ofNew.installation = &*m_plan->latest;
    addFindings(ofNew, m_request.latest, true);
  }

  // Those that the directory's settings accept do not refuse. The result may have what OLD or NEW
  // has.
  void addFindings(const CheckRequest& request, const std::string& directory, bool mayBeInResult) {
    JudgedFindings judged = checkWithSettings(request, m_settings[directory], true);
    std::map<std::string, std::size_t> counts;
    for (const Finding& finding : judged.findings) {
      ++counts[keyOf(finding)];
      refuseLoss(finding);
    }
    for (const AcceptedFinding& accepted : judged.accepted) {
      ++counts[keyOf(accepted.finding)];
    }
    for (const auto& [key, count] : counts) {
      std::size_t& known = m_plan->knownFindings[key];
      known = mayBeInResult ? std::max(known, count) : known;
    }
    std::move(judged.findings.begin(), judged.findings.end(), std::back_inserter(m_plan->ofInputs));
  }

  // What the library's reading loses must not get lost unseen.
  void refuseLoss(const Finding& finding) {
    const bool isLoss =
        finding.rule.front() == 'L' || finding.rule.front() == 'D' || finding.rule == "O501";
    if (isLoss && finding.severity == Severity::kError &&
        m_losses.insert(keyOfPlace(finding)).second) {
      m_plan->refusals.push_back(
          {finding.file, finding.line, finding.column, finding.rule, finding.text});
    }
  }

  // ---- The comparison ----

  void doubtBase() {
    const std::string& equal = m_plan->threeWay.suspiciousBase;
    if (equal.empty() || m_request.acceptBase) {
      return;
    }
    const std::string what = equal == "OLD" ? "the site has changed nothing, and all that it has "
                                              "beside the release is taken for the release's own"
                                            : "the release has changed nothing";
    m_plan->refusals.insert(
        m_plan->refusals.begin(),
        {m_request.base, 0, 0, "",
         "BASE equals " + equal + " definition by definition, while OLD and NEW differ: then " +
             what + "; if that is meant, give --accept-base"});
  }

  const PlanRequest& m_request;
  ReadLimits m_limits;
  std::map<std::string, Settings> m_settings;  // by directory
  std::unique_ptr<MigrationPlan> m_plan;
  std::vector<const Source*> m_excludeLists;
  const Source* m_withdrawList = nullptr;
  std::set<PlaceKey> m_losses;  // that refuse already
};

}  // namespace

std::unique_ptr<MigrationPlan> makePlan(const PlanRequest& request) {
  return PlanMaker(request).make();
}

void decideAnew(std::vector<Decision> decisions, MigrationPlan* plan) {
  plan->request.decisions = std::move(decisions);
  plan->refusals.resize(plan->inputRefusalCount);
  plan->newInResult.clear();
  plan->threeWay = compareThreeWay(plan->request);
  draw(plan);
}

}  // namespace migration
