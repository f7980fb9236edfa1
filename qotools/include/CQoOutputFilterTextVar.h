// CQoOutputFilterTextVar: writes delimited text (CSV and its relatives).
//
// A record is the columns' values separated by the delimiter and ended by
// CR LF; optionally the first line holds the column names. A value that holds
// the delimiter or a line break is put between enclosers (always, with
// ForceEncloser). An encloser inside a value is written twice, or, when an
// escape character is set, preceded by it (the escape character itself is
// then escaped as well) - the dialects that Python's csv module and the
// delimited input filter read:
//
//     delimiter ';', encloser '"', no escape:   a;"b;c";"say ""hi"""
//     delimiter ';', encloser '"', escape '\':  a;"b;c";say \"hi\"
//
// Without an encloser, the escape character protects delimiters and line
// breaks; with neither, a value holding one cannot be written and WriteRow
// raises CQoException rather than write a file that reads back wrong.
// A record of a single empty column is written as "" so that it does not
// read back as an empty line.
#pragma once

#include "CQoOutputFilter.h"

#include <string>
#include <vector>

class QOTOOLS_API CQoOutputFilterTextVar : public CQoOutputFilter {
public:
    CQoOutputFilterTextVar();
    ~CQoOutputFilterTextVar() override;

    // --- CQoOutputFilter ---------------------------------------------------------
    // False without a file; raises CQoException for settings that cannot
    // make a readable file (no delimiter, delimiter equal to encloser ...).
    bool Init() override;
    bool WriteHeader(CQoString *text = nullptr) override;
    bool WriteRow(CQoString *text = nullptr) override;
    void WriteConfig(CQoConfigFile &cfg, CQoString const &section) override;
    void ReadConfig(CQoConfigFile &cfg, CQoString const &section) override;

    // --- delimited settings ---------------------------------------------------------
    // 0 stands for "none" (for the delimiter: not usable, Init refuses it).
    virtual char Delimiter() const;
    virtual void Delimiter(char ch);
    virtual char Encloser() const;
    virtual void Encloser(char ch);
    virtual char Escape() const;
    virtual void Escape(char ch);
    // Enclose every value, not only those that need it.
    virtual bool ForceEncloser() const;
    virtual void ForceEncloser(bool on);
    // Write the column names as the first line.
    virtual bool WriteHeaderFlag() const;
    virtual void WriteHeaderFlag(bool on);

    // Null when the settings can be written; else a German text saying why not.
    char const *SettingsProblem() const;

private:
    void AppendField(std::string &out, std::string_view value) const;
    void AppendLine(std::string &out, std::vector<CQoString> const &values) const;
    void Emit(std::string const &line, CQoString *text);
    // True when the value holds no stop byte: it is written as it is.
    bool IsPlain(char const *data, std::size_t size) const;

    char m_chDelimiter = ';';
    char m_chEncloser = '"';
    char m_chEscape = 0;
    bool m_bForceEncloser = false;
    bool m_bWriteHeader = false;
    std::string m_line;
};
