#include "PlanOptions.h"

#include <cctype>
#include <charconv>
#include <cstddef>
#include <filesystem>
#include <limits>
#include <string_view>
#include <system_error>
#include <utility>

#include "CommandLine.h"
#include "Messages.h"
#include "PlanFile.h"
#include "PlanReport.h"
#include "Progress.h"

namespace {

// Bytes; K, M and G stand for 1024 of what comes before. Returns 0 for what is no size.
std::uint64_t bytesOf(const std::string& text) {
  constexpr std::string_view kUnits = "KMG";
  const char* const end = text.data() + text.size();
  std::uint64_t bytes = 0;
  const std::from_chars_result read = std::from_chars(text.data(), end, bytes);
  if (read.ec != std::errc() || end - read.ptr > 1) {
    return 0;
  }
  std::size_t unit = 0;
  if (read.ptr != end) {
    unit = kUnits.find(static_cast<char>(std::toupper(static_cast<unsigned char>(*read.ptr)))) + 1;
    if (unit == 0) {
      return 0;
    }
  }
  const std::uint64_t factor = std::uint64_t{1} << (10 * unit);
  return bytes > std::numeric_limits<std::uint64_t>::max() / factor ? 0 : bytes * factor;
}

const CLI::Validator kSize(
    [](std::string& value) {
      const std::uint64_t bytes = bytesOf(value);
      if (bytes == 0) {
        return "\"" + printable(value) +
               "\" is no size; write a number of bytes, or one with K, M or G behind it, as in 500M";
      }
      value = std::to_string(bytes);
      return std::string();
    },
    "");

}  // namespace

void addMaxInput(CLI::App* command, migration::ReadLimits* limits) {
  command
      ->add_option(
          "--max-input", limits->bytes,
          "refuse inputs of more than SIZE bytes in all, as in 500M or 2G; 1G unless given")
      ->transform(kSize)
      ->type_name("SIZE");
  limits->advice = "if they are meant to, allow more with --max-input";
}

void PlanOptions::declareInputs(CLI::App* command) {
  command->add_option("--from", request.old, "directory with the old installation's V3.* files")
      ->required()
      ->check(notEmpty())
      ->type_name("OLD");
  command->add_option("--to", request.latest, "directory with the new release's V3.* files")
      ->required()
      ->check(notEmpty())
      ->type_name("NEW");
  command
      ->add_option("--base", request.base,
                   "directory with the V3.* files of the old release as it was shipped")
      ->check(notEmpty())
      ->type_name("BASE");
  command->add_flag("--accept-base", request.acceptBase,
                    "BASE may equal OLD or NEW, as that of an installation never customised does");
  addMaxInput(command, &request.limits);
  command->add_flag("--repair", request.isRepaired,
                    "mend in private copies what can be mended without changing what is said");
}

void PlanOptions::declareDecisions(CLI::App* command) {
  addList(command, "--exclude-oids", &request.excludeLists, "FILE",
          "list of OIDs that are not carried over")
      ->check(notEmpty());
  command->add_option("--withdraw", request.withdrawList, "list of OIDs that OLD takes back")
      ->check(notEmpty())
      ->type_name("FILE");
  addList(command, "--decisions", &request.decisions, "FILE", "what was decided about definitions")
      ->check(notEmpty());
  command->add_flag("--allow-unused", request.allowUnused,
                    "decisions may be about definitions, or texts of them, that are not here");
  command
      ->add_option("--prefer", m_prefer, "decide clauses that were changed in two ways: old or new")
      ->check(oneOf({"old", "new"}))
      ->type_name("SIDE");
}

void PlanOptions::declarePlan(CLI::App* command) {
  command
      ->add_option("--plan", m_plan,
                   "carry out this saved plan, which stands for all the options above")
      ->check(notEmpty())
      ->type_name("PLAN");
  std::vector<const CLI::Option*> replaced;
  for (const char* const name :
       {"--from", "--to", "--base", "--accept-base", "--exclude-oids", "--withdraw", "--decisions",
        "--allow-unused", "--prefer", "--repair"}) {
    CLI::Option* const option = command->get_option(name);
    option->required(false);
    replaced.push_back(option);
  }
  command->parse_complete_callback([this, replaced] {
    for (const CLI::Option* const option : replaced) {
      if (!m_plan.empty() && option->count() != 0) {
        throw CLI::ValidationError(option->get_name(), "cannot be given with --plan, which has it");
      }
    }
  });
}

void PlanOptions::readPlan() {
  if (m_plan.empty()) {
    if (request.old.empty() || request.latest.empty()) {
      throw Failure(kUsage,
                    errorLine(std::string(request.old.empty() ? "--from" : "--to") +
                              " is required, or --plan; schema-migrate migrate --help tells "
                              "how it is used"));
    }
    return;
  }
  LoadedPlan loaded = loadPlan(m_plan);
  m_source = std::move(loaded.source);
  m_saved = std::move(loaded.saved);
  migration::ReadLimits limits = std::move(request.limits);
  request = m_saved->request;
  request.limits = std::move(limits);
}

void PlanOptions::refuseUnlessPlanHolds(const migration::MigrationPlan& again) const {
  const migration::Failures changes =
      migration::changesSince(*m_saved, again, SCHEMA_MIGRATE_VERSION);
  if (!changes.empty()) {
    throw Failure(
        kRefused,
        linesOf(changes) + errorLine("refused: the plan does not hold any more, and nothing was "
                                     "written; make it again with plan --save"));
  }
}

void PlanOptions::makePathsAbsolute() {
  const auto makeAbsolute = [](std::string* path) {
    if (!path->empty()) {
      *path = std::filesystem::absolute(*path).string();
    }
  };
  for (std::string* const path :
       {&request.base, &request.old, &request.latest, &request.withdrawList}) {
    makeAbsolute(path);
  }
  for (std::vector<std::string>* const paths : {&request.excludeLists, &request.decisions}) {
    for (std::string& path : *paths) {
      makeAbsolute(&path);
    }
  }
}

std::vector<std::string> PlanOptions::words() const {
  std::vector<std::string> words;
  const auto add = [&](const std::string& option, const std::string& value) {
    if (!value.empty()) {
      words.push_back(option + " " + shellWord(value));
    }
  };
  add("--from", request.old);
  add("--to", request.latest);
  add("--base", request.base);
  if (request.acceptBase) {
    words.emplace_back("--accept-base");
  }
  for (const std::string& list : request.excludeLists) {
    add("--exclude-oids", list);
  }
  add("--withdraw", request.withdrawList);
  for (const std::string& file : request.decisions) {
    add("--decisions", file);
  }
  if (request.isRepaired) {
    words.emplace_back("--repair");
  }
  if (request.allowUnused) {
    words.emplace_back("--allow-unused");
  }
  add("--prefer", m_prefer);
  return words;
}

std::string shellWord(const std::string& text) {
  constexpr std::string_view kPlain =
      "ABCDEFGHIJKLMNOPQRSTUVWXYZabcdefghijklmnopqrstuvwxyz0123456789_./:=@%+,-";
  const bool isPrintable = wholePrintable(text) == text;
  if (isPrintable && text.find_first_not_of(kPlain) == std::string::npos && !text.empty()) {
    return text;
  }
  std::string quoted;
  for (const char c : text) {
    quoted += c == '\'' || (!isPrintable && c == '\\') ? std::string("\\") + c : std::string(1, c);
  }
  // What a terminal must not get is written so that the shell makes it anew.
  if (!isPrintable) {
    return "$'" + wholePrintable(quoted) + "'";
  }
  std::string word = "'";
  for (const char c : text) {
    word += c == '\'' ? std::string("'\\''") : std::string(1, c);
  }
  return word + "'";
}

std::unique_ptr<migration::MigrationPlan> PlanOptions::makePlan() const {
  migration::PlanRequest wanted = request;
  if (!m_saved) {
    wanted.prefer = m_prefer == "old"   ? migration::Prefer::kOld
                    : m_prefer == "new" ? migration::Prefer::kNew
                                        : migration::Prefer::kNothing;
  }
  wanted.onStep = progress::step;
  std::unique_ptr<migration::MigrationPlan> plan = migration::makePlan(wanted);
  if (m_saved) {
    refuseUnlessPlanHolds(*plan);
  }
  if (!plan->failures.empty()) {
    throw Failure(kBadInput, linesOf(plan->failures));
  }
  // Told first, and alone: everything else would be told of the wrong thing.
  const std::string& equal = plan->threeWay.suspiciousBase;
  if (!equal.empty() && !request.acceptBase) {
    const migration::Failure& doubt = plan->refusals.front();
    throw Failure(kRefused, errorLine(doubt.file, doubt.text));
  }
  return plan;
}
