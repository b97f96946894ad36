// Every token code of the schema-file language, once.

#ifndef LIBSCHEMA_SCHEMA_TOKENS_H
#define LIBSCHEMA_SCHEMA_TOKENS_H

// The keywords. They are numbered in the order of the table, REVERSE excepted.
constexpr int KEY_OBJECTCLASSES = 1002;
constexpr int KEY_NAME = 1003;
constexpr int KEY_DESC = 1004;
constexpr int KEY_SUP = 1005;
constexpr int KEY_AUXILIARY = 1006;
constexpr int KEY_MUST = 1007;
constexpr int KEY_MAY = 1008;
constexpr int KEY_STRUCTURAL = 1009;
constexpr int KEY_ATTRIBUTETYPES = 1010;
constexpr int KEY_EQUALITY = 1011;
constexpr int KEY_SYNTAX = 1012;
constexpr int KEY_SINGLE_VALUE = 1013;
constexpr int KEY_USAGE = 1014;
constexpr int KEY_NO_USER_MODIFICATION = 1015;
constexpr int KEY_ORVATTRIBUTETYPES = 1016;
constexpr int KEY_ACCESS_CLASS = 1017;
constexpr int KEY_DBNAME = 1018;
constexpr int KEY_SUBSTR = 1019;
constexpr int KEY_ORDERING = 1020;
constexpr int KEY_COLLECTIVE = 1021;
constexpr int KEY_OBSOLETE = 1022;
constexpr int KEY_ABSTRACT = 1023;
constexpr int KEY_LENGTH = 1024;
constexpr int KEY_APPROX = 1025;
constexpr int KEY_REVERSE = 1026;

// What the lexical analyser makes. Any other single character is its own (signed) value.
constexpr int TOKEN_NAME = 259;                // a word or a quoted string that is no keyword
constexpr int TOKEN_END = 260;                 // end of input
constexpr int TOKEN_NUMBER = 2024;             // digits and dots, such as a numeric OID
constexpr int TOKEN_NUMBER_LENGTH = 2025;      // a number with a length in braces: 1.2{64}
constexpr int TOKEN_NUMBER_BAD_LENGTH = 2026;  // a number with an opening brace and no such length

#endif  // LIBSCHEMA_SCHEMA_TOKENS_H
