// The terminal that a person reads on: whether there is one, how wide it is, and what it can show.

#ifndef SCHEMA_MIGRATE_TERMINAL_H
#define SCHEMA_MIGRATE_TERMINAL_H

#include <cstddef>
#include <string>

// Whether a person reads standard output on a terminal.
bool isOnTerminal();

// What --color asks for: "always", "never" or "auto".
void wishForColour(const std::string& when);

// Whether colours are to be used on standard output. Unless --color decides it: on a terminal that
// has them, unless NO_COLOR is set and not empty.
bool isColourWanted();

// Columns of the terminal: COLUMNS when that is a number, else what the terminal says, else 80;
// never less than 20.
std::size_t terminalWidth();

// How long a line of a text for people may be: as wide as the terminal is, and as long as it likes
// where there is none.
std::size_t longestLine();

// Notes what the environment says of characters, before the program gives itself another locale.
void noteLocale();

// Whether both standard output and standard error are on a terminal that takes UTF-8.
bool isUtf8Terminal();

#endif  // SCHEMA_MIGRATE_TERMINAL_H
