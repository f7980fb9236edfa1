// CQoInputFilterTextVar: delimited text ("CSV") as an input filter.
//
// Fields are separated by the delimiter (default ';', tab allowed) and may be
// enclosed by the encloser (default '"'); an enclosed field may hold
// delimiters and line breaks, and an encloser inside it is written twice. The
// escape character (default none) takes the next character literally, inside
// and outside enclosers. Records end with CR LF, LF or CR. The rules are those
// of Python's csv module (non-strict): an encloser counts only at the start
// of a field, text after a closing encloser is appended to the field, and an
// empty line is a row whose fields are all empty.
//
//     CQoInputFilterTextVar in;
//     in.Delimiter(',');  in.SetFirstRowHasNames(true);
//     in.Init("adressen.csv");
//
// The column count is the number of names, or without names the greatest
// number of fields among the first 100 rows. A row with fewer fields has
// empty values; a row with more fields, or an encloser left open at the end
// of the file, is defective (see CQoInputFilterText).
#pragma once

#include "CQoInputFilterText.h"

class QOTOOLS_API CQoInputFilterTextVar : public CQoInputFilterText {
public:
    CQoInputFilterTextVar();

    bool StartDescription(CQoString &line) override;
    void CopyFrom(CQoInputFilter const &other) override;
    void WriteConfig(CQoConfigFile &cfg, CQoString const &section) override;
    void ReadConfig(CQoConfigFile &cfg, CQoString const &section) override;

    // The characters; 0 means none (no encloser, no escape). A delimiter of
    // 0, CR or LF is refused (CQoException, invalidArgument): it could not
    // separate anything. Changing one takes effect with the next Init.
    char Delimiter() const { return m_cDelimiter; }
    void Delimiter(char delimiter);
    char Encloser() const { return m_cEncloser; }
    void Encloser(char encloser);
    char Escape() const { return m_cEscape; }
    void Escape(char escape);

protected:
    int ParseRecord(char const *begin, char const *end, bool eof, std::size_t &used) override;
    CQoString CheckRecord() override;

private:
    int SlowField(char const *&p, char const *end, bool eof, bool quoted);
    void BuildTables();

    char m_cDelimiter = ';';
    char m_cEncloser = '"';
    char m_cEscape = 0;
    // Bytes that end a run of plain characters outside and inside enclosers.
    bool m_stopPlain[256];
    bool m_stopQuoted[256];
};
