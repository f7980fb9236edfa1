// CConversion - one conversion job of the sample program: read the records
// of a delimited or fixed-length text file, a file of fixed-column lines, a
// dBase file, a table or query of a file database or an ODBC source, and
// write them as delimited or fixed-length text, a dBase file or a table of a
// file database or an ODBC source.
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
// The filters keep their own settings, as their configuration pages leave
// them, in two sections of the project; the kind of file is given by "Format":
//
//     [Eingabe]                 [Ausgabe]
//     Format=1                  Format=2
//       0 delimited text          0 delimited text
//       1 fixed-length records    1 fixed-length text
//       2 fixed-column lines      2 dBase file
//       3 dBase file
//     [Eingabefilter]           [Ausgabefilter]
//     the input filter's own    the output filter's own settings (lengths,
//     settings                  field types, a table's name and columns)
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

#include "../columns/CColumnMapping.h"

class CQoInputFilter;
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
    // The file inputs ([Eingabe] Format).
    enum { inputDelimited = 0, inputFixed = 1, inputColumns = 2, inputDbase = 3 };
    // The file outputs ([Ausgabe] Format).
    enum { formatDelimited = 0, formatFixed = 1, formatDbase = 2 };
    // What the window offers: the file kinds above, then a file database
    // (Access-type, .mdb, .xlsx) and an ODBC source.
    enum { inputDatabase = 4, inputOdbc = 5 };
    enum { outputDatabase = 3, outputOdbc = 4 };

    CConversion();

    // Raises CQoException for a character set or format the program does
    // not know. Settings the project does not name are the defaults.
    void ReadConfig(CQoConfigFile& config);
    void WriteConfig(CQoConfigFile& config) const;

    // The kind of input or output as the window offers it, and where it is:
    // a file, a database file or an ODBC connect string. Another kind
    // forgets the settings of the previous kind's filter.
    int InputKind() const;
    int OutputKind() const;
    const CQoString& InputLocation() const;
    const CQoString& OutputLocation() const;
    void SetInput(int kind, const CQoString& location);
    void SetOutput(int kind, const CQoString& location);

    // A new input filter of the project's kind with the project's settings
    // (defaults for a project without its section: ';' and names in the
    // first line, the character set of "Zeichensatz"); the caller owns it.
    CQoInputFilter* NewInputFilter() const;
    // Opens it on the project's file, database or source; relative names
    // are taken from `folder` (none: as they stand). `numbered`: its rows
    // are reached by number (an ODBC source's rows are counted for it).
    void OpenInputFilter(CQoInputFilter& filter, const CQoString& folder = CQoString(), bool numbered = false) const;
    // A new output filter of the project's kind with the project's settings,
    // not bound to its file or database; the caller owns it.
    CQoOutputFilter* NewOutputFilter() const;
    // Gives the output filter the source's columns: the settings of the
    // columns it knows stay, a new column of a table is text wide enough for
    // any value read.
    void FitOutputColumns(CQoOutputFilter& output, CQoOutputSource& source) const;
    // Keeps the filters' settings for WriteConfig (what their pages set),
    // with the table a page picked or named.
    void TakeInputSettings(CQoInputFilter& input);
    void TakeOutputSettings(CQoOutputFilter& output);

    // Converts every record; returns the number of records written. Raises
    // CQoException when a file cannot be opened, read or written, or when
    // the output is the input. The target (a file, or a table) is replaced
    // only by a complete output: a cancelled or failed run leaves it as it
    // was.
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
    int m_inputFormat;
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
    // Passwords of file databases ("Passwort" in [Eingabe] and [Ausgabe];
    // kept in the project as written: the project file is the user's).
    CQoString m_inputPassword;
    CQoString m_outputPassword;
    int m_outputFormat;

    // The output columns; the window builds them over its preview's records,
    // a run over the records it converts.
    CColumnMapping& Columns() { return m_columns; }

    // A file name of a project, relative to its folder unless absolute (or
    // no folder is given).
    static CQoString InFolder(const CQoString& folder, const CQoString& file);
    // Makes every file named by the project (files, database files, the
    // database file of a connect string) absolute against its folder.
    void PlaceInFolder(const CQoString& folder);

    bool InputIsDatabase() const { return !m_inputConnect.IsEmpty() || !m_inputDatabase.IsEmpty(); }
    bool OutputIsDatabase() const { return !m_outputConnect.IsEmpty() || !m_outputDatabase.IsEmpty(); }

private:
    void Clear();
    CQoInputFilter* MakeInputFilter(bool run) const;
    CQoInputFilter* NewInput();
    CQoOutputFilter* NewOutput(CQoOutputSource& source, CQoFile& file, std::string& temp);
    long RunLines();
    long RunRecords();
    // Opens a new file beside the output (refusing an output that is the
    // input) and answers its name; PutOutputInPlace makes it the output.
    std::string OpenOutputBeside(CQoFile& file, int mode);
    void PutOutputInPlace(const std::string& temp);
    // Input and output in one database: refused, or arranged so that the
    // input's reading does not keep the output from storing.
    void CheckSameDatabase();
    CQoString InputSqliteFile() const;
    CQoString OutputSqliteFile() const;
    static int FileMode(int charset);
    static void ReadCharset(CQoConfigFile& config, const char* section, int& charset);
    static void ReadFormat(CQoConfigFile& config, const char* section, int last, const char* allowed, int& format);

    // The two filter sections, as read or as the pages left them.
    CQoConfigFile m_filterSettings;
    // The project configures its filters (else a plain copy of the lines).
    bool m_bFilters;
    CConversionProgress* m_pProgress;
    long m_lSkipped;
    // The run reads an SQLite input whole at once (it shares its file with the output).
    bool m_bInputFromMemory;
    CColumnMapping m_columns;

    friend class CConversionInput;
};
