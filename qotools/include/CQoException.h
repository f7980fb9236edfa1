// CQoException: the one error type of the base library and of the filters
// built on it.
//
// Failures of the world (a file that cannot be opened, a read that fails, a
// record that does not fit its format) are raised with `CQoException::Throw`,
// by value; catch them by const reference and show `Message()`. An exception
// carries a numeric code and a text: the coded form takes its German text from
// the library's own table, the free-text form carries the caller's text (code 0).
//
//     try { file.ReadString(line); }
//     catch (CQoException const &e) { log(e.Message()); }
#pragma once

#include "QoToolsApi.h"

#include <exception>
#include <string>

class QOTOOLS_API CQoException : public std::exception {
public:
    // The library's error codes. Their texts are listed in CQoException.cpp;
    // codes outside the table read "Fehler <code>".
    enum code {
        textError = 0,       // free text given by the thrower
        fileNotFound = 1,
        cannotOpen = 2,
        readError = 3,
        writeError = 4,
        formatError = 5,
        notOpen = 6,
        outOfMemory = 7,
        invalidArgument = 8,
        seekError = 9,
        replaceError = 10,   // a finished file could not take the place of the old one
        indexError = 19      // an index outside the valid range
    };

    CQoException(int code, char const *text, char const *where);

    // Raise the coded error; `where` (may be null) names the object concerned,
    // usually the file name, and is appended to the message.
    [[noreturn]] static void Throw(int code, char const *where);
    // Raise a free text (code 0), for example a database's own error text.
    [[noreturn]] static void Throw(char const *text, char const *where);

    // The full message: the text, followed by " (where)" when a non-empty
    // `where` was given.
    char const *Message() const { return m_message.c_str(); }
    // The text alone and the place alone.
    char const *Text() const { return m_text.c_str(); }
    char const *Where() const { return m_where.c_str(); }
    int Code() const { return m_code; }

    char const *what() const noexcept override { return m_message.c_str(); }

    // The table text of a code, or null for a code outside the table.
    static char const *CodeText(int code);

private:
    int m_code;
    std::string m_text;
    std::string m_where;
    std::string m_message;
};
