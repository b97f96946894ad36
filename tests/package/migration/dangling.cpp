// Prints every name in SUP, MUST and MAY that names nothing.
#include <libschema-migration/Installation.h>

#include <iostream>

int main(int argc, char** argv) {
  migration::Failures failures;
  const migration::Installation schema =
      migration::Installation::fromDirectory(argc > 1 ? argv[1] : ".", {}, &failures);
  for (const migration::Reference& reference : schema.danglingReferences()) {
    const migration::Place place = reference.place();
    std::cout << reference.file->name << ":" << place.line << ":" << place.column << ": "
              << keywordOf(reference.clause) << " of " << describe(reference) << " names "
              << reference.name << "\n";
  }
}
