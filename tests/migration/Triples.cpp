#include "Triples.h"

#include <algorithm>
#include <map>

namespace triples {

namespace {

using migration::Kind;

void replace(std::vector<std::string>* values, const std::string& from, const std::string& to) {
  std::replace(values->begin(), values->end(), from, to);
}

void erase(std::vector<std::string>* values, std::size_t index) {
  values->erase(values->begin() + static_cast<std::ptrdiff_t>(index));
}

std::string joined(const std::vector<std::string>& values, const char* separator,
                   const char* quote) {
  std::string text;
  for (const std::string& value : values) {
    text.append(text.empty() ? "" : separator).append(quote).append(value).append(quote);
  }
  return text;
}

}  // namespace

Triple Generator::triple(bool isHard) {
  m_isHard = isHard;
  const Definitions shipped = base();
  Definitions site = variant(shipped, "s");
  Definitions release = variant(shipped, "r");
  return {written(shipped), written(site), written(release)};
}

std::string Generator::someFile(Kind kind) {
  static const char* const kFiles[] = {"V3.system.at", "V3.system.oc", "V3.orv.at",
                                       "V3.orv.oc",    "V3.user.at",   "V3.user.oc"};
  const int chance = pick(m_isHard ? 20 : 40);
  if (chance == 0) {
    return "V3.modifiedschema";
  }
  if (chance == 1) {
    return kind == Kind::kObjectClass ? "V3.config.oc" : "V3.config.at";
  }
  if (chance < 5) {
    return kFiles[pick(6)];
  }
  return kind == Kind::kObjectClass ? "V3.system.oc" : isOneOf(3) ? "V3.user.at" : "V3.system.at";
}

std::string Generator::nameOfSome(const Definitions& all, Kind kind) {
  std::vector<std::string> names;
  for (const Definition& definition : all) {
    if (definition.kind == kind && !definition.names.empty()) {
      names.push_back(
          definition
              .names[static_cast<std::size_t>(pick(static_cast<int>(definition.names.size())))]);
    }
  }
  return names.empty() ? "none"
                       : names[static_cast<std::size_t>(pick(static_cast<int>(names.size())))];
}

std::string Generator::freshOid(const std::string& who) {
  return m_isHard && isOneOf(3) ? "1." + std::to_string(pick(12))
                                : (who == "s" ? "8." : "7.") + std::to_string(++m_fresh);
}

Generator::Definitions Generator::base() {
  Definitions all;
  const int types = 2 + pick(5);
  for (int number = 0; number < types; ++number) {
    Definition type;
    type.oid = "1." + std::to_string(number);
    type.names = {"a" + std::to_string(number)};
    if (isOneOf(4)) {
      type.names.push_back("alias" + std::to_string(number));
    }
    type.usage = "u";
    type.file = someFile(type.kind);
    if (number > 0 && isOneOf(3)) {
      type.sup = {nameOfSome(all, Kind::kAttributeType)};
    }
    all.push_back(type);
    if (isOneOf(2)) {
      Definition extension;
      extension.kind = Kind::kVendorExtension;
      extension.oid = type.oid;
      extension.dbNames = {"d" + std::to_string(number)};
      extension.accessClass = "normal";
      extension.file = isOneOf(8) ? someFile(extension.kind) : type.file;
      all.push_back(extension);
    }
  }
  const int classes = 1 + pick(4);
  for (int number = 0; number < classes; ++number) {
    Definition type;
    type.kind = Kind::kObjectClass;
    type.oid = "2." + std::to_string(number);
    type.names = {"c" + std::to_string(number)};
    type.flags = "STRUCTURAL ";
    type.file = someFile(type.kind);
    if (number > 0 && isOneOf(2)) {
      type.sup = {nameOfSome(all, Kind::kObjectClass)};
    }
    for (int member = pick(3); member > 0; --member) {
      (isOneOf(2) ? type.must : type.may).push_back(nameOfSome(all, Kind::kAttributeType));
    }
    all.push_back(type);
  }
  return all;
}

void Generator::change(const std::string& who, Definition* definition) {
  if (definition->kind == Kind::kVendorExtension) {
    switch (pick(4)) {
      case 0:
        definition->accessClass = "by" + who;
        break;
      case 1:
        definition->length = 1 + pick(9);
        break;
      case 2:
        definition->dbNames.push_back(m_isHard ? "d" + std::to_string(pick(7)) : "d" + who);
        break;
      default:
        definition->flags = "REVERSE ";
    }
    return;
  }
  switch (pick(6)) {
    case 0:
      definition->desc = "by " + who;
      break;
    case 1:
      definition->names.push_back(m_isHard && isOneOf(2) ? "a" + std::to_string(pick(8))
                                                         : "n" + who + std::to_string(++m_fresh));
      break;
    case 2:
      if (definition->kind == Kind::kAttributeType) {
        definition->flags = "SINGLE-VALUE ";
      } else {
        definition->flags = isOneOf(2) ? "AUXILIARY " : "ABSTRACT ";
      }
      break;
    case 3:
      if (definition->kind == Kind::kAttributeType) {
        definition->equality = "e" + who;
      } else if (!definition->may.empty()) {
        std::swap(definition->must, definition->may);
      }
      break;
    case 4:
      if (definition->names.size() > 1) {
        erase(&definition->names, static_cast<std::size_t>(pick(2)));
      }
      break;
    default:
      definition->usage = definition->kind == Kind::kAttributeType ? "by" + who : "";
  }
}

// References to it follow, now and then.
void Generator::rename(const std::string& who, Definitions* all, std::size_t which) {
  Definition& renamed = (*all)[which];
  if (renamed.names.empty()) {
    return;
  }
  const std::string from = renamed.names.front();
  const std::string to = m_isHard && isOneOf(3) ? "a" + std::to_string(pick(8)) : "x" + who + from;
  renamed.names.front() = to;
  if (isOneOf(3)) {
    renamed.names.push_back(from);
  }
  const bool isFollowed = !isOneOf(3);
  for (Definition& definition : *all) {
    if (!isFollowed) {
      continue;
    }
    if (definition.kind == renamed.kind) {
      replace(&definition.sup, from, to);
    }
    if (renamed.kind == Kind::kAttributeType) {
      replace(&definition.must, from, to);
      replace(&definition.may, from, to);
    }
  }
}

void Generator::renumber(Definitions* all, std::size_t which) {
  const std::string from = (*all)[which].oid;
  const std::string to = freshOid(isOneOf(2) ? "s" : "r");
  for (Definition& definition : *all) {
    const bool isIts =
        definition.kind == (*all)[which].kind || (*all)[which].kind == Kind::kAttributeType;
    if (definition.oid == from && isIts && definition.kind != Kind::kObjectClass) {
      definition.oid = to;
    }
  }
  (*all)[which].oid = to;
}

void Generator::addOwn(const std::string& who, Definitions* all) {
  Definition own;
  own.oid = freshOid(who);
  own.kind = isOneOf(2) ? Kind::kObjectClass : Kind::kAttributeType;
  own.names = {m_isHard && isOneOf(3) ? "a" + std::to_string(pick(8))
                                      : "own" + who + std::to_string(++m_fresh)};
  own.file = someFile(own.kind);
  if (own.kind == Kind::kObjectClass) {
    own.flags = "AUXILIARY ";
    own.must = {nameOfSome(*all, Kind::kAttributeType)};
    own.may = {nameOfSome(*all, Kind::kAttributeType)};
    own.sup = {nameOfSome(*all, Kind::kObjectClass)};
  } else {
    own.usage = "u";
    if (isOneOf(3)) {
      own.sup = {nameOfSome(*all, Kind::kAttributeType)};
    }
  }
  all->push_back(own);
  if (own.kind == Kind::kAttributeType && isOneOf(2)) {
    Definition extension;
    extension.kind = Kind::kVendorExtension;
    extension.oid = own.oid;
    extension.dbNames = {m_isHard ? "d" + std::to_string(pick(7)) : own.names.front()};
    extension.accessClass = "normal";
    extension.file = own.file;
    all->push_back(extension);
  }
}

Generator::Definitions Generator::variant(const Definitions& from, const std::string& who) {
  Definitions all = from;
  for (std::size_t number = all.size(); number > 0; --number) {
    const std::size_t which = number - 1;
    switch (pick(12)) {
      case 0: {
        const std::string oid = all[which].oid;
        const bool isType = all[which].kind == Kind::kAttributeType;
        all.erase(all.begin() + static_cast<std::ptrdiff_t>(which));
        if (isType && !isOneOf(4)) {
          all.erase(std::remove_if(all.begin(), all.end(),
                                   [&](const Definition& definition) {
                                     return definition.oid == oid &&
                                            definition.kind == Kind::kVendorExtension;
                                   }),
                    all.end());
        }
        number = std::min(number, all.size() + 1);
        break;
      }
      case 1:
        rename(who, &all, which);
        break;
      case 2:
        if (isOneOf(2) && all[which].kind != Kind::kVendorExtension) {
          renumber(&all, which);
        }
        break;
      case 3:
      case 4:
        change(who, &all[which]);
        break;
      case 5:
        if (isOneOf(3)) {
          all[which].file = someFile(all[which].kind);
        }
        break;
      case 6:
        if (all[which].kind == Kind::kObjectClass) {
          (isOneOf(2) ? all[which].must : all[which].may)
              .push_back(nameOfSome(all, Kind::kAttributeType));
        }
        break;
      case 7:
        if (!all[which].sup.empty()) {
          all[which].sup = {nameOfSome(all, all[which].kind)};
        }
        break;
      case 8:
        if (m_isHard && isOneOf(3)) {
          Definition again = all[which];
          if (isOneOf(2)) {
            change(who, &again);
          }
          again.file = someFile(again.kind);
          all.push_back(again);
        }
        break;
      default:
        break;
    }
  }
  for (int own = pick(3); own > 0; --own) {
    addOwn(who, &all);
  }
  return all;
}

std::string Generator::textOf(const Definition& definition) {
  const auto list = [&](const char* keyword, const std::vector<std::string>& values,
                        const char* separator, const char* quote) {
    return values.empty() ? std::string()
                          : std::string(keyword) + " ( " + joined(values, separator, quote) + " ) ";
  };
  std::string text = "( " + definition.oid + " " + list("NAME", definition.names, " ", "'");
  text += definition.desc.empty() ? "" : "DESC '" + definition.desc + "' ";
  if (definition.kind == Kind::kObjectClass) {
    text += list("SUP", definition.sup, " $ ", "") + definition.flags +
            list("MUST", definition.must, " $ ", "") + list("MAY", definition.may, " $ ", "");
  } else if (definition.kind == Kind::kAttributeType) {
    text += definition.sup.empty() ? "" : "SUP " + definition.sup.front() + " ";
    text += definition.equality.empty() ? "" : "EQUALITY " + definition.equality + " ";
    text += definition.flags + "USAGE " + definition.usage + " ";
  } else {
    text += list("DBNAME", definition.dbNames, " ", "'") + "ACCESS-CLASS " +
            definition.accessClass + " ";
    text += definition.length == 0 ? "" : "LENGTH " + std::to_string(definition.length) + " ";
    text += definition.flags;
  }
  if (m_isHard && definition.kind != Kind::kVendorExtension && isOneOf(12)) {
    // The value of a clause that the reader does not know becomes the OID.
    const bool isOther = definition.kind == Kind::kObjectClass && isOneOf(3);
    text +=
        "X-ORIGIN '" +
        (isOther ? "RFC" + definition.oid.substr(definition.oid.find('.') + 1) : definition.oid) +
        "' ";
  } else if (isOneOf(12)) {
    text += "# X-ORIGIN 'RFC'\n";
  }
  return text + ")";
}

Texts Generator::written(const Definitions& all) {
  static const char* const kKeywords[] = {"attributetypes", "objectclasses", "ORVAttributetypes"};
  std::map<std::string, std::string> files;
  const std::string end = isOneOf(8) ? "\r\n" : "\n";
  for (const Definition& definition : all) {
    std::string& text = files[definition.file];
    if (text.empty() && isOneOf(4)) {
      text = "# a file" + end;
    }
    if (isOneOf(6)) {
      text += "# about " + definition.oid + end;
    }
    const std::string keyword = kKeywords[static_cast<std::size_t>(definition.kind)];
    if (isOneOf(6)) {
      text += keyword + " {" + end + "  " + textOf(definition) + end + "}" + end;
    } else {
      text += keyword + (isOneOf(6) ? " = " : "=") + textOf(definition) + end;
    }
  }
  Texts texts;
  for (const char* const name : migration::kSchemaFiles) {
    const auto found = files.find(name);
    if (found != files.end()) {
      texts.push_back({name, found->second});
    }
  }
  return texts;
}

}  // namespace triples
