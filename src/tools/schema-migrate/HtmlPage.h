// What the HTML pages have in common: texts made visible, and a template filled in. Every text goes
// through the template's automatic escaping; nothing but the program's own style and script is
// exempt from it.

#ifndef SCHEMA_MIGRATE_HTML_PAGE_H
#define SCHEMA_MIGRATE_HTML_PAGE_H

#include <ctemplate/template.h>

#include <cstddef>
#include <string>
#include <string_view>

#include "Json.h"

namespace html {

using Dictionary = ctemplate::TemplateDictionary;

// The text with whatever nobody sees, or what turns the direction of writing, as \u001b: control
// characters, line separators, and the marks that let a text read otherwise than it stands.
std::string visible(std::string_view text);

// Sets a value of the template to the text made visible.
void setText(Dictionary* dictionary, const char* name, std::string_view text);
void setNumber(Dictionary* dictionary, const char* name, std::size_t number);

// A section of the template with one value in it.
void addText(Dictionary* dictionary, const char* section, const char* name, std::string_view text);

// "V3.user.at:12", with the last part of the path only; "not there" for null.
std::string shortPlace(const Json& place);

// Sets what every page has: the program that made the document.
void setProgram(const Json& document, Dictionary* page);

// The page: style and script inline, and a policy that lets the browser run these two alone.
std::string expand(const char* templateText, Dictionary* page);

}  // namespace html

#endif  // SCHEMA_MIGRATE_HTML_PAGE_H
