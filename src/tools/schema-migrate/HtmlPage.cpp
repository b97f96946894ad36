#include "HtmlPage.h"

#include <libschema-migration/Digest.h>

#include <array>
#include <cstdint>
#include <cstdio>
#include <memory>

#include "HtmlFiles.h"

namespace html {

namespace {

// The character of UTF-8 that begins at `at`, and its length; documents hold nothing but UTF-8.
std::uint32_t characterAt(std::string_view text, std::size_t at, std::size_t* length) {
  const auto byte = [&](std::size_t i) {
    return static_cast<std::uint32_t>(static_cast<unsigned char>(text[at + i]));
  };
  const std::uint32_t first = byte(0);
  *length = first < 0x80U ? 1 : first < 0xe0U ? 2 : first < 0xf0U ? 3 : 4;
  if (*length == 1 || at + *length > text.size()) {
    *length = 1;
    return first;
  }
  std::uint32_t character = first & (0xffU >> (*length + 1));
  for (std::size_t i = 1; i < *length; ++i) {
    character = (character << 6U) | (byte(i) & 0x3fU);
  }
  return character;
}

bool isUnseen(std::uint32_t character) {
  struct Range {
    std::uint32_t first;
    std::uint32_t last;
  };
  // Controls, the soft hyphen, Arabic and Mongolian marks, zero widths and directions, separators,
  // isolates, variation selectors, the byte order mark, annotations, tags.
  constexpr std::array<Range, 12> kUnseen = {{{0x00, 0x1f},
                                              {0x7f, 0x9f},
                                              {0xad, 0xad},
                                              {0x61c, 0x61c},
                                              {0x180e, 0x180e},
                                              {0x200b, 0x200f},
                                              {0x2028, 0x202e},
                                              {0x2060, 0x206f},
                                              {0xfe00, 0xfe0f},
                                              {0xfeff, 0xfeff},
                                              {0xfff9, 0xfffb},
                                              {0xe0000, 0xe0fff}}};
  for (const Range& range : kUnseen) {
    if (character >= range.first && character <= range.last) {
      return true;
    }
  }
  return false;
}

std::string base64(const std::string& bytes) {
  constexpr std::string_view kDigits =
      "ABCDEFGHIJKLMNOPQRSTUVWXYZabcdefghijklmnopqrstuvwxyz0123456789+/";
  std::string text;
  for (std::size_t at = 0; at < bytes.size(); at += 3) {
    std::uint32_t bits = 0;
    for (std::size_t i = 0; i < 3; ++i) {
      const auto byte = at + i < bytes.size() ? static_cast<unsigned char>(bytes[at + i]) : 0U;
      bits = (bits << 8U) | byte;
    }
    for (std::size_t i = 0; i < 4; ++i) {
      text += at + i > bytes.size() ? '=' : kDigits[(bits >> (18U - 6U * i)) & 63U];
    }
  }
  return text;
}

// The SHA-256 of a text as a policy names it.
std::string policyHash(std::string_view text) {
  const std::string digits = migration::sha256Of(text);
  std::string bytes;
  for (std::size_t at = 0; at < digits.size(); at += 2) {
    bytes += static_cast<char>(std::stoi(digits.substr(at, 2), nullptr, 16));
  }
  return base64(bytes);
}

}  // namespace

std::string visible(std::string_view text) {
  std::string result;
  result.reserve(text.size());
  std::size_t length = 0;
  for (std::size_t at = 0; at < text.size(); at += length) {
    const std::uint32_t character = characterAt(text, at, &length);
    if (!isUnseen(character)) {
      result.append(text.substr(at, length));
      continue;
    }
    std::array<char, 16> escape{};
    std::snprintf(escape.data(), escape.size(), "\\u%04x", static_cast<unsigned>(character));
    result += escape.data();
  }
  return result;
}

void setText(Dictionary* dictionary, const char* name, std::string_view text) {
  dictionary->SetValue(name, visible(text));
}

void setNumber(Dictionary* dictionary, const char* name, std::size_t number) {
  dictionary->SetValue(name, std::to_string(number));
}

void addText(Dictionary* dictionary, const char* section, const char* name, std::string_view text) {
  setText(dictionary->AddSectionDictionary(section), name, text);
}

std::string shortPlace(const Json& place) {
  if (place.is_null()) {
    return "not there";
  }
  const std::string& path = place.at("file").get_ref<const std::string&>();
  return path.substr(path.rfind('/') + 1) + ":" +
         std::to_string(place.at("line").get<std::uint64_t>());
}

void setProgram(const Json& document, Dictionary* page) {
  const Json& program = document.at("program");
  setText(page, "PROGRAM",
          program.at("name").get<std::string>() + " " + program.at("version").get<std::string>());
  setText(page, "COMMAND", document.at("command").get<std::string>());
}

std::string expand(const char* templateText, Dictionary* page) {
  page->SetValue("STYLE", kStyle);
  page->SetValue("STYLE_HASH", policyHash(kStyle));
  page->SetValue("SCRIPT", kScript);
  page->SetValue("SCRIPT_HASH", policyHash(kScript));
  const std::unique_ptr<ctemplate::Template> parsed(
      ctemplate::Template::StringToTemplate(templateText, ctemplate::STRIP_WHITESPACE));
  std::string text;
  parsed->Expand(&text, page);
  return text;
}

}  // namespace html
