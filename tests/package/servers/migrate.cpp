// What every server here does with libschema, in the program or in a plug-in: it reads a file,
// writes it and prints the result, and uses its own symbol table before, meanwhile and afterwards.

#include <cstdio>
#include <fstream>
#include <sstream>
#include <string>

#include "SchemaManager.h"
#include "symbols.h"

extern "C" __attribute__((visibility("default"))) int migrate() {
  std::printf("%s\n", useSymbols().c_str());
  std::ofstream("V3.user.at") << "attributetypes=( 1.1.2 NAME 'sn' DESC 'family name' )\n";
  {
    SchemaManager manager(".");
    const int read = manager.readFile("V3.user.at");
    std::printf("%s\n", useSymbols().c_str());
    const int written = manager.writeFile("out", "V3.user.at");
    std::printf("read %d, written %d\n", read, written);
  }
  std::ostringstream file;
  file << std::ifstream("out/V3.user.at").rdbuf();
  std::printf("%s%s\n", file.str().c_str(), useSymbols().c_str());
  return 0;
}
