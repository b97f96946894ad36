#include "Checking.h"

#include <libschema-migration/Check.h>

#include <cstdlib>
#include <memory>
#include <optional>

#include "SchemaManager.h"

namespace bench {

Run checkingRun(const Input& input) {
  return [&input] {
    migration::Failures failures;
    std::optional<migration::Installation> installation;
    migration::Findings findings;
    const double seconds = secondsOf([&] {
      installation =
          migration::Installation::fromDirectory(input.older, migration::ReadLimits(), &failures);
      migration::CheckRequest request;
      request.installation = &*installation;
      findings = check(request);
    });
    if (!failures.empty() || installation->entries().empty()) {
      std::exit(1);
    }
    return seconds;
  };
}

Run ownReadingRun(const Input& input) {
  return [&input] {
    std::unique_ptr<SchemaManager> manager;
    return secondsOf([&] {
      manager = std::make_unique<SchemaManager>(input.older);
      for (const std::string& name : input.olderFiles.names) {
        manager->readFile(name);
      }
    });
  };
}

bool hasCheckGoals(const Input& input) {
  return input.origin == Origin::kReal || input.olderFiles.definitions >= 10000;
}

}  // namespace bench
