// What the server shows of its own symbol table.

#ifndef SERVER_SYMBOLS_H
#define SERVER_SYMBOLS_H

#include <string>

// Uses the server's own CSymbolTable and Clex_analyzer, and tells what they hold and how often any
// of their functions was called since the last time.
std::string useSymbols();

#endif  // SERVER_SYMBOLS_H
