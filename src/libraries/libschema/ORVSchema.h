// The base of every schema definition. Definitions are owned by the schema manager's tables, which
// delete them through this class.

#ifndef LIBSCHEMA_ORV_SCHEMA_H
#define LIBSCHEMA_ORV_SCHEMA_H

#include <fstream>
#include <string>
#include <vector>

class ORVSchema {
 public:
  ORVSchema();
  virtual ~ORVSchema();

  // Prints the definition to standard output, for debugging.
  virtual void dump() = 0;

  // Writes the definition as one line of a schema file and flushes the stream.
  virtual void dump(std::ofstream& out) = 0;

  // Copies of the members.
  virtual std::string getOid() = 0;
  virtual std::string getDescription() = 0;
  virtual std::vector<std::string> getSuperior() = 0;

  // The first name as read, and in lower case; empty when there is no name.
  virtual std::string getFirstName() = 0;
  virtual std::vector<std::string> getNames() = 0;
  virtual std::string getFirstNameLower() = 0;

  // The members in place: valid as long as the definition is there and unchanged.
  const std::string& oidInPlace() const { return OID; }
  const std::vector<std::string>& namesInPlace() const { return names; }
  const std::string& descriptionInPlace() const { return description; }
  const std::vector<std::string>& superiorsInPlace() const { return superiors; }

  // The first name with every character passed through tolower; empty when there is no name.
  std::string firstNameLower() const;

 protected:
  ORVSchema(const ORVSchema&) = default;
  ORVSchema& operator=(const ORVSchema&) = default;

  std::vector<std::string> names;  // in the order first met, without quotes
  std::string OID;                 // as read; it may carry a length suffix
  std::string description;
  std::vector<std::string> superiors;  // in the order met
};

#endif  // LIBSCHEMA_ORV_SCHEMA_H
