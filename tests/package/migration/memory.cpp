// Checks schema files that lie in memory, and takes no more than 200 bytes of them.
#include <libschema-migration/Check.h>

#include <iostream>

int main() {
  migration::Failures failures;
  migration::ReadLimits limits;
  limits.bytes = 200;
  const migration::Installation schema = migration::Installation::fromTexts(
      "upload",
      {{"V3.user.at", "attributetypes=( 1.1 NAME 'badge' SUP card )\n"},
       {"V3.user.oc", std::string(1000, '#')}},
      limits, &failures);
  migration::CheckRequest request;
  request.installation = &schema;
  for (const migration::Finding& finding : check(request)) {
    std::cout << finding.file << ":" << finding.line << ":" << finding.column << ": "
              << finding.rule << "\n";
  }
  for (const migration::Failure& failure : failures) {
    std::cout << failure.file << ": " << failure.text << "\n";
  }
}
