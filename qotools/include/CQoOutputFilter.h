// CQoOutputFilter: the target every conversion writes to.
//
// An output filter writes rows of text fields: the text outputs into a file,
// the dBase output into a dBase file, the database outputs into a table. Its
// columns are set up first (count and names, plus what a derived filter
// needs), then each row is built and written:
//
//     out.NumCols(3);  out.ColumnName(0, "Name");  ...
//     out.UseFile(&file, false);  out.Init();  out.WriteHeader();
//     for each record: out.InitRow(); out.Value(c, text) per column; out.WriteRow();
//     out.ReleaseFile();
//
// `WriteHeader` and `WriteRow` given a string leave the exact text that would
// go to the file in it and write nothing (configuration pages preview so).
//
// Per-column settings are kept in arrays of NumCols() entries; reading or
// setting one outside 0 .. NumCols()-1 raises CQoException (code 19).
#pragma once

#include "QoToolsApi.h"

#include "CQoString.h"

#include <vector>

class CQoConfigFile;
class CQoFile;

class QOTOOLS_API CQoOutputFilter {
public:
    CQoOutputFilter();
    CQoOutputFilter(CQoOutputFilter const &) = delete;
    CQoOutputFilter &operator=(CQoOutputFilter const &) = delete;

    // --- virtual operations (the order is part of the contract) -------------
    // Prepares writing (after the columns are set and a file or database is
    // in use); false when the filter cannot write.
    virtual bool Init() = 0;
    // Writes the header (column names), if the format has one. With `text`
    // given, the header's text is put there instead (empty: no header). The
    // base writes none.
    virtual bool WriteHeader(CQoString *text = nullptr);
    virtual void ColumnName(int col, CQoString const &name);
    virtual void GetColumnName(int col, CQoString &name);
    // Writes the current row (or, with `text` given, puts its text there).
    virtual bool WriteRow(CQoString *text = nullptr) = 0;
    // Sets a field of the current row.
    virtual void Value(int col, CQoString const &value);
    // Starts a new row: every field empty.
    virtual void InitRow();
    // Sets the column count; new columns get empty names (and the derived
    // filters' defaults), surplus ones are dropped.
    virtual void NumCols(int cols);
    virtual int NumCols() const;
    virtual ~CQoOutputFilter();
    // Writes into `file` from now on (it must be open for writing). With
    // `closeOnRelease` ReleaseFile closes the file as well; the caller keeps
    // the object in any case.
    virtual void UseFile(CQoFile *file, bool closeOnRelease);
    // Hands the buffered text to the file and stops using it (closing it
    // when UseFile was told so).
    virtual void ReleaseFile();
    // Character set of text written: CQoFile::ansi or ascii (or ansimix).
    virtual int FileCharSet() const;
    virtual void FileCharSet(int charSet);
    // Settings as keys of `section`; a missing key keeps the current value.
    virtual void WriteConfig(CQoConfigFile &cfg, CQoString const &section);
    virtual void ReadConfig(CQoConfigFile &cfg, CQoString const &section);
    // Bytes written to the file since UseFile.
    virtual long long wroteBytes() const;

protected:
    // Raises the index error unless 0 <= col < NumCols().
    void CheckColumn(int col) const;
    // Writes text to the file in use and counts it; raises CQoException
    // (notOpen) without a file.
    void WriteToFile(char const *data, std::size_t length);

    std::vector<CQoString> m_columnNames;
    std::vector<CQoString> m_values;    // the current row
    CQoFile *m_pFile = nullptr;          // not owned
    bool m_bCloseOnRelease = false;      // ReleaseFile closes m_pFile
    int m_nFileCharSet;                  // CQoFile::ansi at construction
    long long m_llWroteBytes = 0;
};
