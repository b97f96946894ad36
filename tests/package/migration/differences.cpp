// Compares two schema directories, neither of them changed.
#include <libschema-migration/Comparison.h>

#include <iostream>

using migration::Comparison;
using migration::Installation;

int main(int argc, char** argv) {
  migration::Failures failures;
  const Installation left = Installation::fromDirectory(argc > 2 ? argv[1] : ".", {}, &failures);
  const Installation right = Installation::fromDirectory(argc > 2 ? argv[2] : ".", {}, &failures);
  for (const migration::Compared& pair : compare(left, right)) {
    if (pair.result == Comparison::kOnlyLeft) {
      std::cout << "< " << describe(*pair.left) << "\n";
    } else if (pair.result == Comparison::kOnlyRight) {
      std::cout << "> " << describe(*pair.right) << "\n";
    } else if (pair.result == Comparison::kDifferent) {
      std::cout << "! " << describe(*pair.left) << " in line " << pair.left->place().line
                << " and line " << pair.right->place().line << "\n";
    }
  }
}
