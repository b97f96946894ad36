#include "HtmlCounts.h"

#include <array>
#include <cstdint>
#include <cstdio>
#include <map>

namespace html {

namespace {

std::size_t numberOf(const Json& counts, const char* word) {
  const auto found = counts.find(word);
  return found == counts.end() ? 0 : found->get<std::size_t>();
}

// A part of the whole in percent, as SVG takes it in any locale.
std::string percent(std::size_t part, std::size_t whole) {
  const std::uint64_t thousandths = std::uint64_t{part} * 100000 / whole;
  std::array<char, 32> text{};
  std::snprintf(text.data(), text.size(), "%u.%03u", static_cast<unsigned>(thousandths / 1000),
                static_cast<unsigned>(thousandths % 1000));
  return text.data();
}

void addBar(const CountTable& table, const std::vector<Word>& words, const Json& counts,
            Dictionary* section) {
  std::size_t whole = 0;
  std::string label;
  for (const Word& word : words) {
    const std::size_t number = table.leftOut == word.word ? 0 : numberOf(counts, word.word);
    whole += number;
    if (number != 0) {
      label += (label.empty() ? "" : ", ") + std::to_string(number) + " " + word.said;
    }
  }
  if (whole == 0) {
    return;
  }
  Dictionary* const bar = section->AddSectionDictionary("BAR");
  setText(bar, "LABEL", label);
  std::size_t before = 0;
  for (const Word& word : words) {
    const std::size_t number = table.leftOut == word.word ? 0 : numberOf(counts, word.word);
    if (number == 0) {
      continue;
    }
    Dictionary* const piece = bar->AddSectionDictionary("PIECE");
    piece->SetValue("STYLE_CLASS", word.style);
    piece->SetValue("WORD", word.said);
    setNumber(piece, "NUMBER", number);
    piece->SetValue("X", percent(before, whole));
    piece->SetValue("WIDTH", percent(number, whole));
    if (number * 100 >= whole * 6) {
      Dictionary* const sign = piece->AddSectionDictionary("SIGNED");
      sign->SetValue("SIGN", word.sign);
      sign->SetValue("MIDDLE", percent(before * 2 + number, whole * 2));
    }
    before += number;
  }
}

}  // namespace

void addCounts(const CountTable& table, const std::vector<Word>& words, const Json& counts,
               Dictionary* page) {
  Dictionary* const section = page->AddSectionDictionary("COUNTS");
  section->SetValue("WHAT", table.id);
  section->SetValue("HEADING", table.heading);
  section->SetValue("COLUMN", table.column);
  addBar(table, words, counts, section);
  for (const Word& word : words) {
    const std::size_t number = numberOf(counts, word.word);
    if (number != 0) {
      Dictionary* const row = section->AddSectionDictionary("COUNT");
      row->SetValue("STYLE_CLASS", word.style);
      row->SetValue("SIGN", word.sign);
      row->SetValue("WORD", word.said);
      setNumber(row, "NUMBER", number);
    }
  }
}

void addFacet(const char* name, const char* heading, const std::vector<Word>& words,
              const Json& items, Dictionary* page) {
  std::map<std::string, std::size_t> counts;
  for (const Json& item : items) {
    ++counts[item.at(name).get_ref<const std::string&>()];
  }
  Dictionary* const facet = page->AddSectionDictionary("FACET");
  facet->SetValue("FACET_NAME", name);
  facet->SetValue("HEADING", heading);
  const auto add = [&](const std::string& value, std::string_view said, std::size_t number) {
    Dictionary* const choice = facet->AddSectionDictionary("CHOICE");
    setText(choice, "VALUE", value);
    setText(choice, "WORD", said);
    setNumber(choice, "NUMBER", number);
  };
  for (const Word& word : words) {
    const auto found = counts.find(word.word);
    if (found != counts.end()) {
      add(found->first, word.said, found->second);
      counts.erase(found);
    }
  }
  for (const auto& [value, number] : counts) {
    add(value, value, number);
  }
}

}  // namespace html
