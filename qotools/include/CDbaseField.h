// CDbaseField: the description of one field of a dBase III/IV file.
//
// A field has a name (at most 10 characters in the file), a type letter, a
// length in bytes and, for numbers, the count of decimals. The dBase input
// filter describes the fields of the file it reads with it; the dBase output
// filter is told with an array of them which fields to create.
//
// Type letters the filters know: 'C' text (1-255 bytes), 'N' and 'F' numbers
// (1-20 bytes, right-aligned), 'D' date (8 bytes, YYYYMMDD), 'L' logical
// (1 byte). The reader also passes 'M' (memo block number) through as text.
#pragma once

#include "QoToolsApi.h"
#include "CQoString.h"

class QOTOOLS_API CDbaseField {
public:
    enum { maxNameLength = 10, maxTextLength = 255, maxNumberLength = 20 };

    CDbaseField() = default;
    CDbaseField(char const *name, char type, int length, int decimals = 0);

    CQoString const &Name() const { return m_name; }
    void Name(char const *name) { m_name = name; }
    char Type() const { return m_type; }
    void Type(char type) { m_type = type; }
    int Length() const { return m_length; }
    void Length(int length) { m_length = length; }
    int Decimals() const { return m_decimals; }
    void Decimals(int decimals) { m_decimals = decimals; }

    bool IsNumeric() const { return m_type == 'N' || m_type == 'F'; }

    // Null when the description can be written to a file; otherwise a German
    // text saying what is wrong with it (unknown type, length out of range ...).
    char const *Problem() const;

    bool operator==(CDbaseField const &other) const
    {
        return m_name == other.m_name && m_type == other.m_type && m_length == other.m_length &&
               m_decimals == other.m_decimals;
    }
    bool operator!=(CDbaseField const &other) const { return !(*this == other); }

private:
    CQoString m_name;
    char m_type = 'C';
    int m_length = 0;
    int m_decimals = 0;
};
