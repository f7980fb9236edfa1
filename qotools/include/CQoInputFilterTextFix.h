// CQoInputFilterTextFix: a file of fixed-length records without line breaks.
//
// Record n starts at byte n * RecordLen() (after the names record, when the
// first record holds the names), so any row is reached by arithmetic and no
// row index is needed. Column i covers ColLen(i) bytes after the columns
// before it; values lose their trailing blanks. Columns reaching beyond the
// record length are cut at its end.
//
// A last record shorter than RecordLen() is defective (see
// CQoInputFilterText for the repair hook): taken over, the corrected text is
// its record (cut or padded with blanks to the record length); skipped, the
// file ends before it; without hook CQoException is raised. Line ends, blanks
// and a DOS end-of-file mark (0x1A) after the last record are ignored.
#pragma once

#include "CQoInputFilter.h"

#include <map>
#include <memory>
#include "CQoColumnWidths.h"

#include <vector>

class QoTextReader;

class QOTOOLS_API CQoInputFilterTextFix : public CQoInputFilter {
public:
    CQoInputFilterTextFix();
    CQoInputFilterTextFix(CQoInputFilterTextFix const &other);
    CQoInputFilterTextFix &operator=(CQoInputFilterTextFix const &other);
    ~CQoInputFilterTextFix() override;

    bool FirstRow() override;
    bool NextRow() override;
    bool AbsoluteRow(long row) override;
    void Value(int col, CQoString &value) override;
    // Opens the file; raises CQoException when it cannot be opened.
    void Init(CQoString const &name) override;
    bool StartDescription(CQoString &line) override;
    void CopyFrom(CQoInputFilter const &other) override;
    void WriteConfig(CQoConfigFile &cfg, CQoString const &section) override;
    void ReadConfig(CQoConfigFile &cfg, CQoString const &section) override;
    void LoadColumnNames() override;
    // Records are found by arithmetic: the "index" always exists.
    bool CreateIndexFile() override;
    long long getActPosInFile() override;

    // Record length in bytes, 1 .. qolimits::maxRecordLength (below 1
    // becomes 1, above raises CQoException).
    int RecordLen() const { return m_nRecordLen; }
    void RecordLen(int length);
    // The column count; new columns have length 1. Bounds as CQoColumnWidths.
    void SetNumCols(int cols);
    // Column lengths; outside 0 .. NumCols()-1 the getter answers 0 and the
    // setter does nothing; a length below 1 becomes 1; lengths adding up to
    // more than qolimits::maxRecordLength raise CQoException.
    int ColLen(int col) const;
    void ColLen(int col, int length);

protected:
    long CalculateRecordCount() override;
    bool CloseFile() override;

private:
    long long RowOffset(long row) const;
    bool ReadRecord(long row);
    bool HandleShortRecord(long row, long long offset, std::size_t have);

    std::unique_ptr<QoTextReader> m_reader;
    int m_nRecordLen = 1;
    CQoColumnWidths m_widths;
    CQoString m_record;          // the current record
    long long m_fileLength = 0;
    long long m_dataStart = 0;   // after a UTF-8 byte-order mark
    // Decisions about the short last record: row -> corrected record, or
    // no entry with m_shortSkipped.
    std::map<long, CQoString> m_corrections;
    bool m_shortSkipped = false;
    long m_shortRow = -1;
};
