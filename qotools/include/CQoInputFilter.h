// CQoInputFilter: the record source every conversion reads from.
//
// An input filter delivers a table: a number of columns with names and a
// sequence of rows whose fields are text. The text, dBase and database filters
// derive from it, and so do filters that read other objects (an output source,
// the multi-column handler). Use it so:
//
//     filter.Init("in.csv");                  // open the file (or database)
//     for (int c = 0; c < filter.NumCols(); ++c) filter.ColName(c, name);
//     for (bool ok = filter.FirstRow(); ok; ok = filter.NextRow())
//         filter.Value(0, value);             // fields of the current row
//
// Rows are numbered from 0; a row that holds the column names (see
// SetFirstRowHasNames) is not a row. `AbsoluteRow(n)` positions on row n and is
// cheap after one pass through the file. `NumRows()` may have to read the whole
// file once; `SetNumRows(0)` drops a known count.
//
// Errors of the world (a file that vanishes, a record that does not fit the
// format and cannot be repaired) raise CQoException. Moving beyond the rows
// answers false; reading a column outside 0 .. NumCols()-1 gives empty text.
//
// Filters are created by the application and released with `Delete()`, which
// deletes the object inside the library that made it.
#pragma once

#include "QoToolsApi.h"

#include "CQoString.h"

#include <vector>

class CQoConfigFile;

class QOTOOLS_API CQoInputFilter {
public:
    // The codes of InputFilterType(); configuration pages are chosen by them,
    // and they are stored in configuration files, so they never change.
    enum filterType {
        filterUnknown = 0,
        filterDbase3 = 1,   // dBase III file
        filterDbase4 = 2,   // dBase IV file
        filterTextFix = 3,  // fixed-length records without line breaks
        filterTextVar = 4,  // delimited text
        filterExcel = 5,    // an Excel workbook (same value as CQoFile::typeExcel)
        filterAccess = 6,   // an Access database (same value as CQoFile::typeAccess)
        filterTextVF = 7    // lines cut into fixed-width columns
    };

    CQoInputFilter();
    CQoInputFilter(CQoInputFilter const &other);
    CQoInputFilter &operator=(CQoInputFilter const &other);

    // --- virtual operations (the order is part of the contract) -------------
    // The file (or database) the filter reads.
    virtual char const *FileName() const;
    // Name of a column; empty text for a column outside the table. The base
    // answers the names set with SetColName, else "Feld <n>" counted from 1.
    virtual void ColName(int col, CQoString &name);
    // Renames a column (ignored outside 0 .. NumCols()-1).
    virtual void SetColName(int col, CQoString const &name);
    virtual int NumCols();
    // The number of rows. The base asks CalculateRecordCount, which counts
    // once and keeps the count until SetNumRows(0) or a new Init.
    virtual long NumRows();
    // Move to the first / next row; false when there is none.
    virtual bool FirstRow();
    virtual bool NextRow();
    // Move to the 0-based row; false when there is no such row. The base walks
    // from the first row (derived filters seek).
    virtual bool AbsoluteRow(long row);
    // A field of the current row; empty text for a column outside the table or
    // when there is no current row.
    virtual void Value(int col, CQoString &value);
    // True when every field of the current row is empty (or there is no row).
    virtual bool EmptyRow();
    // Opens the named file (or data source) with the current settings.
    // Raises CQoException when it cannot be opened.
    virtual void Init(CQoString const &name);
    virtual ~CQoInputFilter();
    // Deletes the filter (inside the module that created it).
    virtual void Delete();
    // One of filterType; the base answers the file type set by the filter.
    virtual int InputFilterType() const;
    // Human-readable settings of the filter, one line per call: Start gives
    // the first line, Next the following ones; false when there is no more.
    virtual bool StartDescription(CQoString &line);
    virtual bool NextDescription(CQoString &line);
    // Takes over the settings (not the open file) of another filter. The
    // base copies the common settings; derived filters copy theirs when the
    // other filter is of their kind.
    virtual void CopyFrom(CQoInputFilter const &other);
    // Settings as keys of `section`; a missing key keeps the current value.
    virtual void WriteConfig(CQoConfigFile &cfg, CQoString const &section);
    virtual void ReadConfig(CQoConfigFile &cfg, CQoString const &section);
    virtual bool GetFirstRowHasNames() const;
    // Reads the column names (from the first row when it holds names).
    virtual void LoadColumnNames();
    // Reads the whole input once and builds the row index, so that
    // AbsoluteRow is a seek afterwards. True when an index exists; the base
    // has none (false).
    virtual bool CreateIndexFile();
    // A record that does not fit the format. `data` holds the defective record
    // followed by the data after it, `nextPos` the offset in `data` at which the
    // next record presumably starts. The base counts the record, keeps a
    // message for LastWrongInput() and asks the record-repair hook
    // (CQoInterActive::RepairRecord); it answers one of
    // CQoInterActive::repairResult and, as the hook does, leaves the corrected
    // record in `data` and the start of the next record in `nextPos`.
    virtual int ReportWrongInput(CQoString &data, int &nextPos);
    // With `noCache` set the filter keeps no row index (every AbsoluteRow reads
    // from the start); for inputs that change while they are read.
    virtual void NoCache(bool noCache);
    // Puts the file `newFile` in place of the filter's file (the old one is
    // replaced in one step) and reads it from then on. Raises CQoException
    // (replaceError) when that fails; the old file is then unchanged.
    virtual void replaceFile(char const *newFile);
    // Byte offset in the file of the current record (for progress displays);
    // -1 when the filter reads no file or stands on no record.
    virtual long long getActPosInFile();

    // --- plain operations ----------------------------------------------------
    // Character set of text files: CQoFile::ansi, ascii or ansimix.
    int CharSet() const { return m_nCharSet; }
    void CharSet(int charSet);
    void SetFirstRowHasNames(bool hasNames);
    // Set whenever a setting changes; the host clears it after saving.
    void SetModified(bool modified) { m_bModified = modified; }
    bool IsModified() const { return m_bModified; }
    // A known row count; 0 drops it, so that the next NumRows counts anew.
    void SetNumRows(long rows);
    // Records that did not fit the format since Init, and the message of the
    // last one (empty when there was none).
    long WrongInputCount() const { return m_lWrongInputs; }
    CQoString const &LastWrongInput() const { return m_strLastWrongInput; }

protected:
    // Counts the rows (the base walks FirstRow/NextRow) unless the count is
    // known, marks it known and answers it.
    virtual long CalculateRecordCount();
    // Closes the file the filter reads; the base closes nothing. True when
    // the file is closed now.
    virtual bool CloseFile();
    // Opens the filter's file again (after CloseFile or replaceFile) and
    // stands before the first row. The base calls Init(FileName()).
    virtual bool ReopenFile();

    // Description building for StartDescription overrides: BeginDescription
    // starts anew with the common lines (file, columns, character set),
    // AddDescription appends a line; then answer NextDescription(line).
    void BeginDescription();
    void AddDescription(CQoString const &line);
    // Sets the column count and keeps as many names (new ones empty).
    void SetNumColsInternal(int cols);
    // The set name of a column, or "Feld <n>".
    CQoString DefaultColName(int col) const;

    // --- state shared by every filter --------------------------------------
    int m_fileType = filterUnknown;   // answered by InputFilterType()
    CQoString m_strFileName;          // the file or data source read
    int m_nNumCols = 0;
    long m_lNumRows = 0;
    bool m_bNumRowsKnown = false;
    long m_lCurrentRow = -1;          // -1: no current row
    bool m_bFirstRowHasNames = false;
    int m_nCharSet;                   // CQoFile::ansi at construction
    bool m_bModified = false;
    bool m_bNoCache = false;
    std::vector<CQoString> m_colNames; // names set by SetColName / the file
    long m_lWrongInputs = 0;
    CQoString m_strLastWrongInput;

private:
    std::vector<CQoString> m_description;
    std::size_t m_nextDescription = 0;
};
