#include "PlannedFolder.h"

#include <gtest/gtest.h>

std::string at(const std::string& rest) { return "attributetypes=( " + rest + " )\n"; }
std::string oc(const std::string& rest) { return "objectclasses=( " + rest + " )\n"; }
std::string orv(const std::string& rest) { return "ORVAttributetypes=( " + rest + " )\n"; }

PlannedFolder::PlannedFolder() {
  const std::string extension = orv("1.2 DBNAME ( 'b' 'b' ) ACCESS-CLASS normal LENGTH 8");
  install("base",
          {{"V3.system.at", at("1.1 NAME 'a' DESC 'd' USAGE userApplications") +
                                at("1.2 NAME 'b' DESC 'd' USAGE userApplications") + extension},
           {"V3.system.oc", oc("2.1 NAME 'c' STRUCTURAL MAY ( a )")}});
  install("old",
          {{"V3.system.at", at("1.1 NAME 'a' DESC 'd' SINGLE-VALUE USAGE userApplications") +
                                at("1.2 NAME 'b' DESC 'd' USAGE userApplications") + extension},
           {"V3.system.oc", oc("2.1 NAME 'c' STRUCTURAL MAY ( a $ s )")},
           {"V3.user.at", at("9.1 NAME 's' USAGE userApplications")},
           {"V3.user.oc", "# Guards.\n" + oc("9.2 NAME 'guard' SUP c STRUCTURAL MAY ( s )")}});
  install("new", {{"V3.system.at",
                   "# The release.\n" + at("1.1 NAME 'a' DESC 'd' USAGE userApplications") +
                       at("1.2 NAME 'b' DESC 'better' USAGE userApplications") + extension},
                  {"V3.system.oc", oc("2.1 NAME 'c' STRUCTURAL MAY ( b $ a )")},
                  {"V3.config.at", at("3.1 NAME 'limit' USAGE userApplications")}});
}

ToolResult PlannedFolder::runPlanned(const std::string& command,
                                     const std::vector<std::string>& more,
                                     const std::function<void()>& prepare) const {
  std::vector<std::string> arguments = {command, "--base", "@/base", "--from",
                                        "@/old", "--to",   "@/new"};
  arguments.insert(arguments.end(), more.begin(), more.end());
  return run(arguments, prepare);
}

std::string replaced(std::string text, const std::string& from, const std::string& to) {
  const std::size_t found = text.find(from);
  EXPECT_NE(std::string::npos, found) << from << " is not in\n" << text;
  return found == std::string::npos ? text : text.replace(found, from.size(), to);
}
