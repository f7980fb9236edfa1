// CConversion - one conversion job of the sample program: read the records
// of a text file in one character set and write them in another, or move the
// records of a delimited text file (names in the first line, ';' between
// fields) into a table of an ODBC data source, or a table or query of one
// into such a text file or another table.
//
// The job's settings live in the project's configuration file (section
// "Eingabe" and "Ausgabe"), so that a project converts the same way
// interactively and from the command line:
//
//     [Eingabe]                 [Ausgabe]
//     Datei=kunden.txt          ODBC=Driver=SQLite3;Database=kunden.db
//     Zeichensatz=0             Tabelle=Kunden
//
// An input reads from ODBC when "ODBC" holds a connect string, or from a file
// database when "Datenbank" names one (an Access-type database, an .mdb file,
// an .xlsx workbook whose sheets are tables named "Tabelle1$"); "Tabelle"
// names its table, or "SQL" gives a statement instead. An output writes into
// a table of an ODBC source ("ODBC") or of an Access-type database file
// ("Datenbank"), both with "Tabelle".
//
// Text files read and written through the filters keep the filters' own
// settings, as their configuration pages leave them, in two sections of the
// project:
//
//     [Eingabefilter]           the delimited input (delimiter, encloser,
//                               escape, skip, character set, names in line 1)
//     [Ausgabe]
//     Format=1                  0 delimited text, 1 fixed-length text
//     [Ausgabefilter]           the output filter's settings (lengths, ...)
//
// The output columns (which input columns, combined how, chosen and ordered
// how) live in the sections of CColumnMapping. A project with neither filter
// section nor Format nor those sections copies the lines of the input from one
// character set into the other.
#pragma once

#include <CQoConfigFile.h>
#include <CQoFile.h>
#include <CQoString.h>

#include <string>

#include "CColumnMapping.h"

class CQoInputFilter;
class CQoInputFilterTextVar;
class CQoOutputFilter;
class CQoOutputSource;

// Told after every record a conversion has written, with the byte offset of
// the input's current record (-1 for inputs that are no file). Answering
// false stops the run: Run then raises CConversionCancelled and the previous
// output stays as it was.
class CConversionProgress
{
public:
    virtual ~CConversionProgress() = default;
    virtual bool Advance(long records, long long position) = 0;
};

// Raised by CConversion::Run when its progress listener stopped the run.
struct CConversionCancelled
{
};

class CConversion
{
public:
    // The character sets as the pages offer them: Windows Ansi, DOS Ascii, Ansi/Ascii.
    enum { charsetAnsi = 0, charsetAscii = 1, charsetMixed = 2 };
    // The text outputs.
    enum { formatDelimited = 0, formatFixed = 1 };

    CConversion();

    // Raises CQoException for a character set or format the program does
    // not know.
    void ReadConfig(CQoConfigFile& config);
    void WriteConfig(CQoConfigFile& config) const;

    // The text filters as the project configures them (defaults for a
    // project without their sections: ';', names in the first line, the
    // character sets of "Zeichensatz"). The file is not opened.
    void ConfigureInput(CQoInputFilterTextVar& filter) const;
    // A new output filter of m_outputFormat, configured; the caller owns it.
    CQoOutputFilter* NewTextOutput() const;
    // Keeps the filters' settings for WriteConfig (what their pages set).
    void TakeFilterSettings(CQoInputFilter& input, CQoOutputFilter& output);

    // Converts every record; returns the number of records written. Raises
    // CQoException when a file cannot be opened, read or written, or when
    // the output is the input. The target is replaced only by a complete
    // output.
    //
    // Defective records of a delimited input go to the record-repair hook
    // (CQoInterActive) and each leaves a line in the log with the answer.
    // Without a hook a defective record stops the run, unless
    // m_bSkipDefective is set: then it is skipped (and logged) as the hook's
    // "skip" would. SkippedRecords() counts the records left out.
    long Run();
    long SkippedRecords() const { return m_lSkipped; }
    // Listener between records (not owned; may be null).
    void SetProgress(CConversionProgress* progress) { m_pProgress = progress; }
    bool m_bSkipDefective;

    CQoString m_inputFile;
    int m_inputCharset;
    CQoString m_outputFile;
    int m_outputCharset;
    // ODBC connect strings (empty: the side is a file), table, statement.
    CQoString m_inputConnect;
    CQoString m_inputTable;
    CQoString m_inputSql;
    CQoString m_outputConnect;
    CQoString m_outputTable;
    // File databases (empty: none).
    CQoString m_inputDatabase;
    CQoString m_outputDatabase;
    int m_outputFormat;

    bool UsesTextFilters() const { return m_bTextFilters; }
    // The output columns; the window builds them over its preview's records,
    // a run over the records it converts.
    CColumnMapping& Columns() { return m_columns; }

    // A file name of a project, relative to its folder unless absolute.
    static CQoString InFolder(const CQoString& folder, const CQoString& file);
    // Makes every file named by the project (files, database files, the
    // database file of a connect string) absolute against its folder.
    void PlaceInFolder(const CQoString& folder);

    bool InputIsDatabase() const { return !m_inputConnect.IsEmpty() || !m_inputDatabase.IsEmpty(); }
    bool OutputIsDatabase() const { return !m_outputConnect.IsEmpty() || !m_outputDatabase.IsEmpty(); }

private:
    CQoInputFilter* NewInput() const;
    CQoOutputFilter* NewOutput(CQoOutputSource& source, CQoFile& file, std::string& temp);
    long RunLines();
    long RunRecords();
    // Opens a new file beside the output (refusing an output that is the
    // input) and answers its name; PutOutputInPlace makes it the output.
    std::string OpenOutputBeside(CQoFile& file, int mode);
    void PutOutputInPlace(const std::string& temp);
    static int FileMode(int charset);
    static void ReadCharset(CQoConfigFile& config, const char* section, int& charset);

    // The two filter sections, as read or as the pages left them.
    CQoConfigFile m_filterSettings;
    bool m_bTextFilters;
    CConversionProgress* m_pProgress;
    long m_lSkipped;
    CColumnMapping m_columns;

    friend class CConversionInput;
};
