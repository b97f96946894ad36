// takeover OLD NEW OUT: carries what the user file of OLD adds or changes over into that of NEW.
#include <libschema/SchemaManager.h>

#include <cstdlib>
#include <iostream>

int main(int argc, char** argv) {
  if (argc != 4) {
    std::cerr << "usage: takeover OLD NEW OUT\n";
    return 2;
  }
  SchemaManager site(argv[1]);
  SchemaManager release(argv[2]);
  if (site.readFile("V3.user.at") != 0 || release.readFile("V3.user.at") != 0) {
    std::cerr << "takeover: V3.user.at cannot be read\n";
    return 3;
  }
  site.compSchemas(&release);  // leaves in `site` what `release` lacks or defines differently
  if (!release.mergeSchemas(&site)) {
    std::cerr << "takeover: a definition belongs to no file\n";
    std::_Exit(4);  // both hold the same definitions now, and must not both be destroyed
  }
  if (release.writeFile(argv[3], "V3.user.at") != 0) {
    std::cerr << "takeover: V3.user.at cannot be written\n";
    return 5;
  }
  std::cout << "siteBadgeNumber: " << release.getAttr("siteBadgeNumber").getDescription() << '\n';
}
