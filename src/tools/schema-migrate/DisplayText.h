// Texts as a terminal shows them: what may be shown, how wide it is, and where lines break.

#ifndef SCHEMA_MIGRATE_DISPLAY_TEXT_H
#define SCHEMA_MIGRATE_DISPLAY_TEXT_H

#include <cstddef>
#include <string>
#include <string_view>

// Printable ASCII as it is, and characters of UTF-8 that have a width of their own, if those are
// wanted; any other byte as \xNN: what a terminal could take for a command, and what would not be
// seen or would turn the direction of writing. What is longer than `limit` is cut short.
std::string asShown(std::string_view text, bool isWithUtf8,
                    std::size_t limit = std::string_view::npos);

// How many columns it takes. Colours take none.
std::size_t displayWidth(std::string_view text);

// `text` with blanks behind it up to `width` columns.
std::string padded(std::string text, std::size_t width);

// The words of `text` in lines of at most `width` columns, where words allow it; `first` before the
// first line, and as many blanks before the others. With a line end.
std::string wrapped(const std::string& first, std::string_view text, std::size_t width);

// A text of whole lines with those broken that are wider than `width`, between words. What follows
// stands below the value of a line "  label   value", else four columns further in.
std::string fitted(std::string_view text, std::size_t width);

#endif  // SCHEMA_MIGRATE_DISPLAY_TEXT_H
