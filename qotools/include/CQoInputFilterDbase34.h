// CQoInputFilterDbase34: reads dBase III and dBase IV files.
//
// A dBase file describes itself: the header names the fields with their types
// and lengths, the record count and the code page. `Init(path)` reads the
// header; the fields become the filter's columns, the records its rows:
//
//     CQoInputFilterDbase34 dbf;
//     dbf.Init("kunden.dbf");
//     for (bool ok = dbf.FirstRow(); ok; ok = dbf.NextRow()) dbf.Value(0, name);
//
// Values are text: text fields lose their trailing blanks, numbers, dates
// (YYYYMMDD) and logicals their surrounding blanks. Records marked deleted are
// skipped unless `SkipDeleted(false)`; then `IsDeleted()` tells them apart.
// The records are read in the file's code page when the header names one
// (DOS 437/850 or Windows 1252), otherwise in the filter's `CharSet()`, which
// starts as DOS (CQoFile::ascii) as dBase files are meant to be.
//
// `AbsoluteRow(n)` is a seek. Without deleted records it needs no index; with
// them the first count (NumRows, CreateIndexFile) keeps the numbers of the
// deleted records, 4 bytes each. Only the current record is held in memory.
//
// A header that is not dBase III/IV, truncated or inconsistent raises
// CQoException at Init; a file that ends before its declared records (or
// vanishes while it is read) raises CQoException when the missing record is
// reached.
#pragma once

#include "CQoInputFilter.h"
#include "CDbaseField.h"
#include "CQoFile.h"

#include <cstdint>
#include <string>
#include <vector>

class QOTOOLS_API CQoInputFilterDbase34 : public CQoInputFilter {
public:
    CQoInputFilterDbase34();
    ~CQoInputFilterDbase34() override;

    // --- CQoInputFilter --------------------------------------------------------
    bool FirstRow() override;
    bool NextRow() override;
    bool AbsoluteRow(long row) override;
    void Value(int col, CQoString &value) override;
    void Init(CQoString const &name) override;
    bool StartDescription(CQoString &line) override;
    bool NextDescription(CQoString &line) override;
    void CopyFrom(CQoInputFilter const &other) override;
    void WriteConfig(CQoConfigFile &cfg, CQoString const &section) override;
    void ReadConfig(CQoConfigFile &cfg, CQoString const &section) override;
    bool CreateIndexFile() override;
    long long getActPosInFile() override;

    // --- dBase settings and facts ------------------------------------------------
    // Skip records marked deleted (default true). Changing it drops the
    // current row (row numbers change their meaning).
    bool SkipDeleted() const { return m_bSkipDeleted; }
    void SkipDeleted(bool skip);
    // Whether the current record carries the deleted mark.
    bool IsDeleted() const;

    int NumFields() const { return static_cast<int>(m_header.fields.size()); }
    // The description of a field; false (and `field` unchanged) outside the fields.
    bool GetFieldDesc(int col, CDbaseField &field) const;
    // The character set the records are read in (see above).
    int RecordCharSet() const { return m_nRecordCharSet; }
    // Header facts of the open file.
    unsigned char Version() const { return m_header.version; }
    unsigned char LanguageDriver() const { return m_header.languageDriver; }
    // The record count the header declares, and the records counted as rows:
    // those the file holds, a cut last one, and at most one missing record
    // beyond, so that a short file raises at its gap instead of claiming the
    // declared count.
    long long DeclaredRecords() const { return m_header.declaredCount; }

protected:
    long CalculateRecordCount() override;
    bool CloseFile() override;

private:

    // Reads physical record `record` into m_record; false beyond the
    // declared records or at the end mark. Raises for a file that ends early.
    bool ReadRecord(std::uint32_t record);
    // Moves to the next live record at or after `record`.
    bool ReadLiveFrom(std::uint32_t record, long row);
    void ScanDeleted();
    void RequireOpen() const;
    std::int64_t RecordOffset(std::uint32_t record) const;

    CQoFile m_file;
    struct HeaderData {
        unsigned char version = 0;
        std::uint32_t recordCount = 0;     // records taken as rows (see DeclaredRecords)
        std::uint32_t declaredCount = 0;   // as the header says
        int headerLength = 0;
        int recordLength = 0;
        unsigned char languageDriver = 0;
        std::vector<CDbaseField> fields;
        std::vector<int> offsets;
    } m_header;
    bool m_bSkipDeleted = true;
    int m_nRecordCharSet;
    std::string m_record;                 // the current record (converted)
    std::int64_t m_physical = -1;         // physical number of the current record
    std::int64_t m_nextRead = -1;         // record at the file position, -1 unknown
    bool m_bDeletedKnown = false;
    std::vector<std::uint32_t> m_deleted; // physical numbers of deleted records, ascending
    std::vector<CQoString> m_describe;
    std::size_t m_nextDescribe = 0;
};
