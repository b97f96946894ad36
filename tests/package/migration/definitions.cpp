// Prints every definition of a schema directory with all its fields, its file and its line.
#include <libschema-migration/Fields.h>
#include <libschema-migration/Installation.h>

#include <iostream>

int main(int argc, char** argv) {
  migration::Failures failures;
  const migration::Installation schema =
      migration::Installation::fromDirectory(argc > 1 ? argv[1] : ".", {}, &failures);
  for (const migration::Entry& entry : schema.entries()) {
    std::cout << entry.file->name << ":" << entry.place().line << ": " << describe(entry) << "\n";
    for (const migration::Field& field : fieldsOf(*entry.kept)) {
      std::cout << "  " << keywordOf(field.clause);
      for (const std::string& value : field.values) {
        std::cout << " " << value;
      }
      std::cout << "\n";
    }
  }
  for (const migration::Failure& failure : failures) {
    std::cerr << failure.file << ": " << failure.text << "\n";
  }
  return failures.empty() ? 0 : 3;
}
