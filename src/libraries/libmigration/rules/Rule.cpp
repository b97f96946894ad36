#include "Rule.h"

#include <algorithm>

namespace migration {

const std::vector<const RuleInfo*>& allRules() {
  static const std::vector<const RuleInfo*> kAll = [] {
    std::vector<const RuleInfo*> all;
    for (const auto& family : {textRules, definitionRules, tableRules, referenceRules, listRules,
                               extensionRules, installationRules, settingsRules}) {
      for (const RuleInfo& rule : family()) {
        all.push_back(&rule);
      }
    }
    std::sort(all.begin(), all.end(), [](const RuleInfo* left, const RuleInfo* right) {
      return std::string_view(left->id) < right->id;
    });
    return all;
  }();
  return kAll;
}

const RuleInfo* findRule(std::string_view id) {
  for (const RuleInfo* const rule : allRules()) {
    if (rule->id == id) {
      return rule;
    }
  }
  return nullptr;
}

}  // namespace migration
