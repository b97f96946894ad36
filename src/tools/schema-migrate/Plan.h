// What a migration will write and what will get lost in it, worked out before it is made. The
// library drops some definitions without a word: here each one is named.

#ifndef SCHEMA_MIGRATE_PLAN_H
#define SCHEMA_MIGRATE_PLAN_H

#include <array>
#include <cstddef>
#include <cstdint>
#include <string>
#include <vector>

#include "Definition.h"
#include "Inventory.h"
#include "Rehearsal.h"
#include "SchemaFiles.h"

// How many of OLD's definitions came to which end.
struct Balance {
  std::uint64_t added = 0;
  std::uint64_t replacing = 0;
  std::uint64_t same = 0;
  std::uint64_t excluded = 0;
  std::uint64_t withdrawn = 0;
  std::uint64_t repeated = 0;    // defined twice alike, or superseded by V3.modifiedschema
  std::uint64_t notCarried = 0;  // a warning names each
};

class Plan {
 public:
  // The inventories need their objects, and must stay in place as long as the plan.
  Plan(const Inventory& oldOne, const Inventory& newOne, const OidLists& lists);
  Plan(const Plan&) = delete;
  Plan& operator=(const Plan&) = delete;

  // A line for each reason why the migration must not be made; empty when it may.
  const std::string& refusals() const { return m_refusals; }
  std::uint64_t refusalCount() const { return m_refusalCount; }

  // A line for each definition that gets lost.
  const std::string& warnings() const { return m_warnings; }

  // The definitions that the written file `file` will hold, in order.
  const std::vector<const Definition*>& contents(std::size_t file) const {
    return m_contents[file];
  }

  // True when not even an OID belongs to the file, which then is written without its header.
  bool isWrittenEmpty(std::size_t file) const { return m_isWrittenEmpty[file]; }

  Fate fateOf(const Definition& definition) { return m_rehearsal.fateOf(definition); }
  const Balance& balance() const { return m_balance; }

 private:
  using Marks = PerDefinition<char>;

  Marks markWritten(const Inventory& oldOne, const Inventory& newOne) const;
  void judgeOld(const Definition& definition, Marks* written);
  void judgeMoved(const Definition& definition);
  void judgeUnread(const Definition& definition);
  void judgeNew(const Definition& definition, bool wasWritten);
  std::string whyNotWritten(const Definition& definition, const Definition** culprit) const;
  bool isWithdrawnWithItsAttribute(const Definition& extension);
  void fillContents();

  void refuse(const Definition& definition, const std::string& reason);
  void warn(const Definition& definition, const std::string& reason);
  void lose(const Definition& definition, const std::string& reason);

  Rehearsal m_rehearsal;
  Balance m_balance;
  std::string m_refusals;
  std::uint64_t m_refusalCount = 0;
  std::string m_warnings;
  std::array<std::vector<const Definition*>, kWrittenFiles> m_contents;
  std::array<bool, kWrittenFiles> m_isWrittenEmpty{};
};

#endif  // SCHEMA_MIGRATE_PLAN_H
