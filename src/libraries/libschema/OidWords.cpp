#include "OidWords.h"

#include <fstream>
#include <limits>

namespace libschema {

namespace {

// A directory opens as well as a file; only a read tells.
bool opensForReading(const std::string& path, std::ifstream* in) {
  in->open(path);
  if (!in->good()) {
    return false;
  }
  try {
    in->rdbuf()->sgetc();
  } catch (...) {
    return false;
  }
  return true;
}

}  // namespace

bool readOidWords(const std::string& path, std::set<std::string>* oids) {
  std::ifstream in;
  if (!opensForReading(path, &in)) {
    return false;
  }
  // The test comes after each read: the word that meets the end of the file is not used.
  std::string word;
  for (in >> word; in.good(); in >> word) {
    if (word.find('#') != std::string::npos) {
      in.ignore(std::numeric_limits<std::streamsize>::max(), '\n');
    } else {
      oids->insert(oids->end(), word);
    }
  }
  return true;
}

}  // namespace libschema
