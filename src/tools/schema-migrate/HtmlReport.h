// The HTML pages for `--html`: one file each, which asks for nothing over the network. A page is
// made from the JSON document of the same run, as `--format json` prints it, and from nothing else.

#ifndef SCHEMA_MIGRATE_HTML_REPORT_H
#define SCHEMA_MIGRATE_HTML_REPORT_H

#include <string>

// How each of them begins.
constexpr char kHtmlBeginning[] =
    R"(<!DOCTYPE html><html lang="en"><head><meta charset="utf-8"><meta name="generator" content="schema-migrate )";

// Of `diff`, `plan` and `migrate`: what renderPlanJson() gives.
std::string renderPlanHtml(const std::string& document);

// Of `check`: what renderJson() gives.
std::string renderCheckHtml(const std::string& document);

// Of `fleet`: what renderJson() gives.
std::string renderFleetHtml(const std::string& document);

#endif  // SCHEMA_MIGRATE_HTML_REPORT_H
