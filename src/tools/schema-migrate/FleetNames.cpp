#include "FleetNames.h"

#include <algorithm>
#include <filesystem>
#include <map>
#include <set>

#include "Messages.h"

namespace {

using Parts = std::vector<std::string>;

struct Unnamed {
  std::size_t at = 0;  // its place among the plans
  Parts parts;         // of its path
};

// Of a word NAME=PLAN, the length of NAME; a path with a slash before its "=" is no such word.
std::size_t nameLength(const std::string& word) {
  const std::size_t equals = word.find('=');
  return equals == std::string::npos || equals == 0 || word.find('/') < equals ||
                 equals + 1 == word.size()
             ? 0
             : equals;
}

bool isDirectory(const std::string& path) {
  std::error_code error;
  return std::filesystem::is_directory(path, error);
}

Parts partsOf(const std::string& path) {
  Parts parts;
  for (const auto& part : std::filesystem::path(path).lexically_normal()) {
    if (!part.empty() && part != "." && part != "/") {
      parts.push_back(part.string());
    }
  }
  return parts;
}

std::string endOf(const Parts& parts, std::size_t count) {
  std::string text;
  for (std::size_t at = parts.size() - std::min(count, parts.size()); at < parts.size(); ++at) {
    text += (text.empty() ? "" : "/") + parts[at];
  }
  return text;
}

// A file name that all have tells nothing.
void dropCommonEnds(std::vector<Unnamed>* unnamed) {
  const auto isDroppable = [&](const Unnamed& one) {
    return one.parts.size() > 1 && one.parts.back() == unnamed->front().parts.back();
  };
  while (unnamed->size() > 1 && std::all_of(unnamed->begin(), unnamed->end(), isDroppable)) {
    for (Unnamed& one : *unnamed) {
      one.parts.pop_back();
    }
  }
}

// The shortest ends that no other has.
void nameByEnds(const std::vector<Unnamed>& unnamed, std::vector<NamedPlan>* plans) {
  std::set<std::string> taken;
  std::size_t most = 0;
  for (const NamedPlan& plan : *plans) {
    taken.insert(plan.name);
  }
  for (const Unnamed& one : unnamed) {
    most = std::max(most, one.parts.size());
  }
  for (std::size_t count = 1; count <= most; ++count) {
    std::map<std::string, std::size_t> ends;
    for (const Unnamed& one : unnamed) {
      ++ends[endOf(one.parts, count)];
    }
    for (const Unnamed& one : unnamed) {
      std::string& name = (*plans)[one.at].name;
      const std::string end = endOf(one.parts, count);
      if (name.empty() && ends[end] == 1 && taken.insert(end).second) {
        name = end;
      }
    }
  }
}

void refuseTwins(const std::vector<NamedPlan>& plans) {
  std::set<std::string> paths;
  std::map<std::string, std::string> names;
  for (const NamedPlan& plan : plans) {
    if (!paths.insert(std::filesystem::path(plan.path).lexically_normal().string()).second) {
      throw Failure(kUsage, errorLine(plan.path + " is given twice"));
    }
    const auto [place, isNew] = names.emplace(plan.name, plan.path);
    if (!isNew) {
      throw Failure(kUsage,
                    errorLine(place->second + " and " + plan.path + " would both be called " +
                              plan.name + "; give one of them another name, as in NAME=PLAN"));
    }
  }
}

}  // namespace

std::vector<NamedPlan> namePlans(const std::vector<std::string>& words) {
  constexpr std::string_view kEnding = ".json";
  std::vector<NamedPlan> plans;
  std::vector<Unnamed> unnamed;
  plans.reserve(words.size());
  for (const std::string& word : words) {
    const std::size_t length = nameLength(word);
    const std::string path = length == 0 ? word : word.substr(length + 1);
    const bool isInside = isDirectory(path);
    plans.push_back({word.substr(0, length), path + (isInside ? "/plan.json" : "")});
    if (length != 0) {
      continue;
    }
    Unnamed one{plans.size() - 1, partsOf(path)};
    if (one.parts.empty()) {
      one.parts.push_back(path);
    }
    std::string& last = one.parts.back();
    if (!isInside && last.size() > kEnding.size() &&
        last.compare(last.size() - kEnding.size(), kEnding.size(), kEnding) == 0) {
      last.erase(last.size() - kEnding.size());
    }
    unnamed.push_back(std::move(one));
  }
  dropCommonEnds(&unnamed);
  nameByEnds(unnamed, &plans);
  for (NamedPlan& plan : plans) {
    plan.name = plan.name.empty() ? plan.path : plan.name;
  }
  refuseTwins(plans);
  return plans;
}
