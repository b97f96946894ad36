#include "Generator.h"

#include <fstream>
#include <optional>
#include <string_view>

namespace bench {

namespace {

// A sequence of its own for each definition, so that both installations can tell it alike.
class Random {
 public:
  Random(std::uint64_t seed, std::uint64_t stream) : m_state(seed * 0x9e3779b97f4a7c15 + stream) {
    next();
  }

  std::uint64_t next() {
    m_state += 0x9e3779b97f4a7c15;
    std::uint64_t z = m_state;
    z = (z ^ (z >> 30)) * 0xbf58476d1ce4e5b9;
    z = (z ^ (z >> 27)) * 0x94d049bb133111eb;
    return z ^ (z >> 31);
  }

  std::size_t below(std::size_t limit) { return static_cast<std::size_t>(next() % limit); }
  bool percent(std::size_t chance) { return below(100) < chance; }

 private:
  std::uint64_t m_state;
};

constexpr std::string_view kWords[128] = {
    "access",   "account", "address", "admin",   "agent",    "alias",    "archive",  "asset",
    "audit",    "auth",    "auto",    "backup",  "badge",    "base",     "batch",    "billing",
    "boot",     "branch",  "budget",  "build",   "cache",    "calendar", "call",     "card",
    "cert",     "channel", "city",    "class",   "client",   "cluster",  "code",     "config",
    "contact",  "cost",    "country", "cred",    "customer", "data",     "default",  "delivery",
    "depart",   "device",  "dial",    "display", "dns",      "domain",   "drive",    "employee",
    "entry",    "event",   "expire",  "export",  "fax",      "feature",  "filter",   "floor",
    "folder",   "forward", "gateway", "given",   "group",    "guide",    "home",     "host",
    "image",    "index",   "info",    "job",     "key",      "label",    "language", "last",
    "level",    "licence", "limit",   "list",    "local",    "location", "lock",     "login",
    "mail",     "manager", "map",     "member",  "message",  "mobile",   "mode",     "module",
    "name",     "network", "node",    "number",  "object",   "office",   "owner",    "page",
    "password", "path",    "person",  "phone",   "policy",   "port",     "postal",   "printer",
    "priority", "profile", "project", "proxy",   "queue",    "quota",    "range",    "realm",
    "region",   "replica", "role",    "room",    "rule",     "schedule", "server",   "service",
    "session",  "share",   "state",   "status",  "supplier", "ticket",   "user",     "zone",
};

constexpr std::string_view kVendors[64] = {
    "acme", "aero",  "agra",  "alto",  "apex",  "argo",  "axis",  "baro", "bell",  "birk", "bora",
    "calo", "cern",  "cobo",  "cora",  "dato",  "delta", "dorn",  "eben", "eco",   "edge", "elan",
    "ergo", "fjord", "flux",  "fox",   "gala",  "gamma", "gero",  "halo", "hub",   "ibex", "inno",
    "iris", "jade",  "jura",  "kilo",  "kite",  "lago",  "lima",  "loft", "luna",  "mira", "mono",
    "nava", "neo",   "nord",  "nova",  "ocean", "omni",  "orbit", "pico", "polar", "quad", "rado",
    "rho",  "sigma", "solar", "tango", "terra", "umbra", "vega",  "wave", "zeta",
};

constexpr std::size_t kGroup = 200;  // definitions of one vendor, one after the other in a file

std::string capitalised(std::string_view word) {
  std::string text(word);
  text[0] = static_cast<char>(text[0] - 'a' + 'A');
  return text;
}

// A different name for each index below 2^20, scattered over the alphabet.
std::string typeName(std::size_t index) {
  const std::size_t mixed = (index * 0x9e375 + 0x1b873) % (std::size_t{1} << 20);
  std::string name(kVendors[mixed % 64]);
  name += capitalised(kWords[mixed / 64 % 128]);
  return name += capitalised(kWords[mixed / 64 / 128]);
}

std::string className(std::size_t index) { return typeName(index * 7 + 3) + "Object"; }

std::string oidOf(std::size_t index, int arc) {
  const std::size_t group = index / kGroup;
  return "1.3.6.1.4.1." + std::to_string(1000 + group * 7919 % 59999) + ".2." +
         std::to_string(arc) + "." + std::to_string(index % kGroup + 1);
}

std::string sentence(Random* random) {
  std::string text = capitalised(kWords[random->below(128)]);
  const std::size_t words = 3 + random->below(7);
  for (std::size_t i = 0; i < words; ++i) {
    text += ' ';
    text += kWords[random->below(128)];
    if (random->percent(8)) {
      text += ',';
    }
  }
  return text;
}

// How a definition stands in the two installations.
enum class Relation { kEqual, kChanged, kOnlyOld, kOnlyNew };

Relation relationOf(std::uint64_t seed, std::uint64_t stream) {
  const std::size_t share = Random(seed, stream ^ 0x5bd1e995).below(100);
  return share < 72   ? Relation::kEqual
         : share < 82 ? Relation::kChanged
         : share < 95 ? Relation::kOnlyOld
                      : Relation::kOnlyNew;
}

bool isInSystemFile(std::size_t index, Relation relation) {
  return relation != Relation::kOnlyOld && index / 10 % 20 < 13;
}

std::string quotedNames(const std::string& keyword, const std::string& first,
                        const std::string& second) {
  return second.empty() ? keyword + "'" + first + "' "
                        : keyword + "( '" + first + "' '" + second + "' ) ";
}

// The clauses of an attribute type, from "(" to ")".
std::string attributeType(Random random, std::size_t index, bool isChanged) {
  static constexpr std::string_view kRules[] = {"caseIgnore", "caseExact", "caseIgnoreIA5",
                                                "numericString"};
  static constexpr std::string_view kOthers[] = {"7", "12", "27", "24"};
  static constexpr std::string_view kOtherRules[] = {"boolean", "distinguishedName", "integer",
                                                     "generalizedTime"};
  const std::string name = typeName(index);
  std::string text = "( " + oidOf(index, 1) + " ";
  text += quotedNames("NAME ", name, random.percent(15) ? name.substr(0, 3) + name.substr(5) : "");
  if (random.percent(85)) {
    text += "DESC '" + sentence(&random) + (isChanged ? ", changed by the site' " : "' ");
  }
  if (random.percent(1)) {
    text += "OBSOLETE ";
  }
  if (random.percent(15)) {
    text += "SUP " + typeName(index / 2) + " ";
  } else if (random.percent(60)) {
    const std::string rule(kRules[random.below(4)]);
    text += "EQUALITY " + rule + "Match ";
    text += random.percent(60) ? "SUBSTR " + rule + "SubstringsMatch " : "";
    text += "SYNTAX 1.3.6.1.4.1.1466.115.121.1." + std::to_string(15 + random.below(30));
    text += random.percent(50) ? "{" + std::to_string(8U << random.below(12)) + "} " : " ";
  } else {
    const std::size_t kind = random.below(4);
    text += "EQUALITY " + std::string(kOtherRules[kind]) + "Match ";
    text +=
        random.percent(20) ? "ORDERING " + std::string(kOtherRules[kind]) + "OrderingMatch " : "";
    text += "SYNTAX 1.3.6.1.4.1.1466.115.121.1." + std::string(kOthers[kind]) + " ";
  }
  if (random.percent(35) != isChanged) {
    text += "SINGLE-VALUE ";
  }
  text += random.percent(4) ? "NO-USER-MODIFICATION " : "";
  text += random.percent(5) ? "USAGE directoryOperation " : "";
  return text += ")";
}

std::string attributeList(Random* random, const std::string& keyword, std::size_t count,
                          std::size_t types) {
  std::string text;
  for (std::size_t i = 0; i < count; ++i) {
    text += (i == 0 ? keyword + "( " : " $ ") + typeName(random->below(types));
  }
  return count == 0 ? text : text + " ) ";
}

std::string objectClass(Random random, std::size_t index, bool isChanged) {
  std::string text = "( " + oidOf(index, 2) + " ";
  text += quotedNames("NAME ", className(index), random.percent(5) ? className(index) + "2" : "");
  if (random.percent(85) || isChanged) {
    text += "DESC '" + sentence(&random) + (isChanged ? ", changed by the site' " : "' ");
  }
  text += "SUP " + (random.percent(70) ? std::string("top") : className(index / 2)) + " ";
  text += random.percent(60) ? "STRUCTURAL " : random.percent(90) ? "AUXILIARY " : "ABSTRACT ";
  const std::size_t types = index * 6 + 10;
  text += attributeList(&random, "MUST ", random.below(4), types);
  const std::size_t optional = random.percent(10) ? random.below(40) : random.below(14);
  text += attributeList(&random, "MAY ", optional, types);
  return text += ")";
}

std::string extension(Random random, std::size_t index, bool isChanged) {
  static constexpr std::string_view kAccess[] = {"normal", "sensitive", "critical", "system"};
  static constexpr std::string_view kFlags[] = {"EQUALITY ", "ORDERING ", "SUBSTR ", "APPROX ",
                                                "REVERSE "};
  static constexpr std::size_t kChances[] = {75, 10, 25, 5, 3};
  const std::string column = typeName(index).substr(0, 16);
  std::string text = "( " + oidOf(index, 1) + " DBNAME ( '" + column + "' '" + column + "' ) ";
  text += "ACCESS-CLASS " + std::string(kAccess[random.below(4)]) + " ";
  text += "LENGTH " + std::to_string((8U << random.below(12)) + (isChanged ? 1 : 0)) + " ";
  for (std::size_t i = 0; i < 5; ++i) {
    text += random.percent(kChances[i]) ? kFlags[i] : "";
  }
  return text += ")";
}

// One file under construction, in the single form or as a block.
class Output {
 public:
  Output(const std::string& path, std::string_view keyword, bool isBlock)
      : m_out(path, std::ios::binary), m_keyword(keyword), m_isBlock(isBlock) {
    m_text = "# generated for the benchmark\n";
    m_text += isBlock ? m_keyword + " {\n" : "";
  }

  void add(const std::string& definition) {
    m_text += m_isBlock ? "  " + definition : m_keyword + "=" + definition;
    m_text += '\n';
    if (m_text.size() > (std::size_t{1} << 20)) {
      m_out << m_text;
      m_text.clear();
    }
  }

  void comment(std::size_t number) { m_text += "# --- Part " + std::to_string(number) + " ---\n"; }

  bool finish() {
    m_out << m_text << (m_isBlock ? "}\n" : "");
    m_out.close();
    return m_out.good();
  }

 private:
  std::ofstream m_out;
  std::string m_keyword;
  bool m_isBlock;
  std::string m_text;
};

struct Installation {
  Installation(const std::string& directory, bool isBlock)
      : systemTypes(directory + "/V3.system.at", "attributetypes", false),
        systemClasses(directory + "/V3.system.oc", "objectclasses", false),
        extensions(directory + "/V3.orv.at", "ORVAttributetypes", false),
        userTypes(directory + "/V3.user.at", "attributetypes", isBlock),
        userClasses(directory + "/V3.user.oc", "objectclasses", isBlock) {}

  bool finish() {
    const bool results[] = {systemTypes.finish(), systemClasses.finish(), extensions.finish(),
                            userTypes.finish(), userClasses.finish()};
    return results[0] && results[1] && results[2] && results[3] && results[4];
  }

  Output systemTypes;
  Output systemClasses;
  Output extensions;
  Output userTypes;
  Output userClasses;
};

// What differs is in the base as the older one has it, as the newer one has it, or not at all, in
// turn: so that the release or the site changed, added or removed it, or both did.
template <typename Add>
void addToBase(std::size_t index, Relation relation, Installation* base, Add add) {
  const std::size_t way = index % 3;
  const bool isAsOld = way == 0 && relation != Relation::kOnlyNew;
  const bool isAsNew = way == 1 && relation != Relation::kOnlyOld;
  if (relation == Relation::kEqual || isAsOld || isAsNew) {
    add(base, index, relation, isAsOld && relation == Relation::kChanged);
  }
}

// Adds definitions, from index 0 on, until the older installation has `count` of them. `add` gets
// the installation, the index, the relation, and whether the definition is the changed form.
// `base` may be null.
template <typename Add>
void generate(std::size_t count, std::uint64_t seed, std::uint64_t stream, Installation* older,
              Installation* newer, Installation* base, Add add) {
  std::size_t inOld = 0;
  for (std::size_t index = 0; inOld < count; ++index) {
    const Relation relation = relationOf(seed, stream + index);
    if (relation != Relation::kOnlyNew) {
      add(older, index, relation, relation == Relation::kChanged);
      ++inOld;
    }
    if (relation != Relation::kOnlyOld) {
      add(newer, index, relation, false);
    }
    if (base != nullptr) {
      addToBase(index, relation, base, add);
    }
  }
}

}  // namespace

bool generateSchemas(std::size_t count, std::uint64_t seed, const std::string& oldDirectory,
                     const std::string& newDirectory, const std::string& baseDirectory) {
  constexpr std::uint64_t kTypes = 0;
  constexpr std::uint64_t kClasses = std::uint64_t{1} << 32;
  const std::size_t classes = count * 8 / 100;
  const std::size_t types = (count - classes) / 2;
  Installation older(oldDirectory, true);
  Installation newer(newDirectory, false);
  std::optional<Installation> shipped;
  if (!baseDirectory.empty()) {
    shipped.emplace(baseDirectory, false);
  }
  Installation* const base = shipped ? &*shipped : nullptr;
  generate(types, seed, kTypes, &older, &newer, base,
           [&](Installation* out, std::size_t index, Relation relation, bool isChanged) {
             Output& file = isInSystemFile(index, relation) ? out->systemTypes : out->userTypes;
             if (index % kGroup == 0) {
               file.comment(index / kGroup);
             }
             file.add(attributeType(Random(seed, kTypes + index), index, isChanged));
             out->extensions.add(extension(Random(seed + 1, index), index, isChanged));
           });
  generate(classes, seed, kClasses, &older, &newer, base,
           [&](Installation* out, std::size_t index, Relation relation, bool isChanged) {
             Output& file = isInSystemFile(index, relation) ? out->systemClasses : out->userClasses;
             file.add(objectClass(Random(seed, kClasses + index), index, isChanged));
           });
  return older.finish() && newer.finish() && (base == nullptr || base->finish());
}

}  // namespace bench
