// Finds an attribute type by any of its names, in any letter case, or by its OID.
#include <libschema-migration/Inheritance.h>

#include <iostream>

int main(int argc, char** argv) {
  migration::Failures failures;
  const migration::Installation schema =
      migration::Installation::fromDirectory(argc > 2 ? argv[1] : ".", {}, &failures);
  const std::string name = argc > 2 ? argv[2] : "";
  const migration::Entry* found = schema.find(migration::Kind::kAttributeType, name);
  if (found == nullptr) {
    std::cout << "not found:";
    for (const std::string& near : nearestNames(schema, name)) {
      std::cout << " " << near << "?";
    }
    std::cout << "\n";
    return 1;
  }
  std::cout << describe(*found) << " in line " << found->place().line << "\n";
  for (const migration::Reference& reference : schema.referrersOf(*found)) {
    std::cout << keywordOf(reference.clause) << " of " << describe(reference) << "\n";
  }
}
