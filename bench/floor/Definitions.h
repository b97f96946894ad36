// The floor program's definitions: the members of the library's classes, with the same types and
// the same values to begin with, and nothing else.

#ifndef LIBSCHEMA_BENCH_FLOOR_DEFINITIONS_H
#define LIBSCHEMA_BENCH_FLOOR_DEFINITIONS_H

#include <cstdint>
#include <string>
#include <vector>

namespace minimal {

class Tokenizer;
class LineBuffer;

struct Definition {
  Definition() = default;
  virtual ~Definition() = default;
  Definition(const Definition&) = delete;
  Definition& operator=(const Definition&) = delete;

  // The first name in lower case, "" without one.
  std::string key() const;

  std::vector<std::string> names;
  std::string oid;
  std::string description;
  std::vector<std::string> superiors;
};

struct AttributeType : Definition {
  // Each parse reads one definition, from the token after "=", "{" or the definition before it on,
  // and returns whether it ended well; the tokenizer then stands on the token after it.
  bool parse(Tokenizer* input);
  void write(LineBuffer* out) const;
  bool isEqual(const AttributeType& other) const;
  const std::vector<std::string>& reportNames() const { return names; }

  bool isObsolete = false;
  std::string equality;
  std::string usage = "userApplications";
  std::string syntax;
  std::string ordering;
  std::string substr;
  int singleValue = 1;
  bool isCollective = false;
  bool isUserModifiable = true;
};

struct ObjectClass : Definition {
  enum class Kind : std::int32_t { kStructural, kAuxiliary, kAbstract };

  bool parse(Tokenizer* input);
  void write(LineBuffer* out) const;
  bool isEqual(const ObjectClass& other) const;
  const std::vector<std::string>& reportNames() const { return names; }

  bool isObsolete = false;
  Kind kind = Kind::kStructural;
  std::vector<std::string> required;
  std::vector<std::string> optional;
};

// The vendor extension has the members of an attribute type beside its own.
struct Extension : AttributeType {
  bool parse(Tokenizer* input);
  void write(LineBuffer* out) const;
  bool isEqual(const Extension& other) const;
  const std::vector<std::string>& reportNames() const { return databaseNames; }

  std::vector<std::string> databaseNames;
  std::string access = "normal";
  std::string length = "0";
  bool hasEquality = false;
  bool hasOrdering = false;
  bool hasSubstr = false;
  bool hasApprox = false;
  bool isReverse = false;
};

}  // namespace minimal

#endif  // LIBSCHEMA_BENCH_FLOOR_DEFINITIONS_H
