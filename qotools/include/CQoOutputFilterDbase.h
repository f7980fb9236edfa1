// CQoOutputFilterDbase: writes a dBase III file.
//
// The fields of the file are given as an array of CDbaseField (type letter,
// length, decimals, name) with `SetFieldDescs`, which copies it; column i of
// the filter is field i. Columns without a description are text fields of
// 255 bytes. The file written is a plain dBase III table (no memo file) with
// the code page byte of the filter's character set: DOS 850 (CQoFile::ascii,
// the default, as dBase files are meant to be) or Windows 1252.
//
//     CQoArray<CDbaseField> fields;
//     fields.Add(CDbaseField("NAME", 'C', 30));
//     fields.Add(CDbaseField("BETRAG", 'N', 10, 2));
//     out.SetFieldDescs(&fields);
//     out.UseFile(&file, true);  out.Init();
//     out.InitRow(); out.Value(0, "M\xFCller"); out.Value(1, "12,5"); out.WriteRow();
//     out.ReleaseFile();          // writes the record count into the header
//
// Values: text is cut to its field's length (counted in TruncatedValues());
// numbers accept a sign, digits and one decimal point or comma and are written
// right-aligned with the field's decimals (rounded half away from zero when
// the value has more); dates accept YYYYMMDD, DD.MM.YYYY and YYYY-MM-DD;
// logicals T/F, J/N, Y/N, 1/0, wahr/falsch, true/false. A value that is not
// of its field's kind, or a number too long for its field, raises
// CQoException naming the field and the record, instead of writing a file
// that no dBase reader can read. Empty values are written as blanks.
//
// Field names in the file are made valid for dBase: umlauts spelled out,
// upper case, other characters '_', at most 10 characters, unique.
//
// Init truncates the file given to UseFile and writes it in binary mode; the
// record count and the end mark are written by ReleaseFile (and by the
// destructor of a filter still in use).
#pragma once

#include "CQoOutputFilter.h"
#include "CDbaseField.h"
#include "CQoArray.h"
#include "CQoFile.h"

#include <memory>
#include <string>
#include <vector>

class QOTOOLS_API CQoOutputFilterDbase : public CQoOutputFilter {
public:
    CQoOutputFilterDbase();
    ~CQoOutputFilterDbase() override;

    // --- CQoOutputFilter ---------------------------------------------------------
    // False without a file; raises CQoException for a field description that
    // cannot be written (see CDbaseField::Problem) or a file that cannot be
    // rewritten.
    bool Init() override;
    void ColumnName(int col, CQoString const &name) override;
    bool WriteRow(CQoString *text = nullptr) override;
    void NumCols(int cols) override;
    int NumCols() const override;
    void ReleaseFile() override;
    void WriteConfig(CQoConfigFile &cfg, CQoString const &section) override;
    void ReadConfig(CQoConfigFile &cfg, CQoString const &section) override;

    // --- dBase -------------------------------------------------------------------
    // Copies the descriptions; the column count becomes their number, and a
    // description's non-empty name becomes its column's name. Null clears them.
    virtual void SetFieldDescs(CQoArray<CDbaseField> const *fields);
    // The description of column `col`; false (field unchanged) outside the columns.
    bool GetFieldDesc(int col, CDbaseField &field) const;
    // The field names as written into the file (valid after Init).
    CQoString FileFieldName(int col) const;

    // Opens (creates or truncates) `path` and writes into it; the filter owns
    // that file and closes it on ReleaseFile.
    void UseFile(char const *path);
    using CQoOutputFilter::UseFile;

    long RowsWritten() const { return m_lRows; }
    long long TruncatedValues() const { return m_llTruncated; }

private:
    void Finish();
    void BuildRecord(std::string &record);
    void FormatValue(int col, std::string_view value, char *out);
    [[noreturn]] void BadValue(int col, std::string_view value, char const *why) const;

    std::vector<CDbaseField> m_fields;
    std::vector<CDbaseField> m_fileFields; // as written (names made valid)
    std::vector<int> m_offsets;
    int m_nRecordLength = 0;
    long m_lRows = 0;
    bool m_bWriting = false;                 // Init done, Finish pending
    long long m_llTruncated = 0;
    std::unique_ptr<CQoFile> m_ownFile;
    std::string m_record;
};
