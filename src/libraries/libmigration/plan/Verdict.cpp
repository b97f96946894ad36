#include "Verdict.h"

#include <algorithm>
#include <array>

namespace migration {

std::string nameOf(Change change) {
  constexpr std::array<const char*, 11> kNames = {"same",
                                                  "added by site",
                                                  "removed by site",
                                                  "changed by site",
                                                  "added by release",
                                                  "removed by release",
                                                  "changed by release",
                                                  "changed by both, mergeable",
                                                  "changed by both, in conflict",
                                                  "taken",
                                                  "unknown"};
  return kNames[static_cast<std::size_t>(change)];
}

std::string wordOf(Change change) {
  std::string word = nameOf(change);
  word.erase(std::remove(word.begin(), word.end(), ','), word.end());
  std::replace(word.begin(), word.end(), ' ', '-');
  return word;
}

std::string_view wordOf(Outcome outcome) {
  constexpr std::array<std::string_view, 12> kWords = {
      "old",     "new",  "same",     "merged",    "added", "kept",
      "dropped", "gone", "excluded", "withdrawn", "text",  "undecided"};
  return kWords[static_cast<std::size_t>(outcome)];
}

const Entry& Verdict::entry() const {
  const Entry* const newer = match.old != nullptr ? match.old : match.latest;
  return newer != nullptr ? *newer : *match.base;
}

Content baseContentOf(const Verdict& difference) {
  return difference.followedBase != nullptr ? *difference.followedBase
                                            : contentOf(*difference.match.base->kept);
}

std::string describe(const Verdict& difference) { return describe(*difference.entry().kept); }

std::string firstNameOf(const Verdict& difference, const std::vector<Verdict>& differences) {
  const bool isExtension = difference.kind() == Kind::kVendorExtension;
  if (isExtension && difference.match.attribute == kNoRow) {
    return "";
  }
  const Entry& named =
      isExtension ? differences[difference.match.attribute].entry() : difference.entry();
  const Values& names = named.kept->object->namesInPlace();
  return names.empty() ? std::string() : names.front();
}

std::string describe(const Verdict& difference, const std::vector<Verdict>& differences) {
  const std::string name = firstNameOf(difference, differences);
  if (difference.kind() != Kind::kVendorExtension || name.empty()) {
    return describe(difference);
  }
  return std::string(nameOf(difference.kind())) + " of " + name + " (" +
         difference.entry().kept->object->oidInPlace() + ")";
}

}  // namespace migration
