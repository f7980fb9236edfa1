// CQoOutputFilterTextFix: writes records of fixed-length fields.
//
// Each column has a length; a record is the columns' values one after another,
// each left-aligned and filled with blanks to its length, optionally followed
// by CR LF. A value longer than its column is cut to the column's length (the
// format has no room for it); `TruncatedValues()` counts how often that
// happened since Init, so that a host can warn. With line breaks on, CR and
// LF inside a value become blanks, or the record would break in two.
//
//     CQoOutputFilterTextFix out;
//     out.NumCols(2); out.SetLength(0, 10); out.SetLength(1, 20);
//     out.UseFile(&file, false); out.Init();
//     out.InitRow(); out.Value(0, "M\xFCller"); out.WriteRow();
//
// The format has no header: WriteHeader writes nothing.
#pragma once

#include "CQoOutputFilter.h"

#include <string>
#include <vector>

class QOTOOLS_API CQoOutputFilterTextFix : public CQoOutputFilter {
public:
    // The length new columns get.
    enum { defaultLength = 30 };

    CQoOutputFilterTextFix();
    ~CQoOutputFilterTextFix() override;

    // --- CQoOutputFilter ---------------------------------------------------------
    bool Init() override;
    bool WriteRow(CQoString *text = nullptr) override;
    void NumCols(int cols) override;
    int NumCols() const override;
    void WriteConfig(CQoConfigFile &cfg, CQoString const &section) override;
    void ReadConfig(CQoConfigFile &cfg, CQoString const &section) override;

    // --- fixed-length settings ----------------------------------------------------
    // Length of a column; an index outside the columns raises code 19. A
    // negative length is kept but written as 0. Lengths adding up to more
    // than qolimits::maxRecordLength raise CQoException naming the column.
    virtual void SetLength(int col, int length);
    virtual int GetLength(int col);
    // CR LF after each record (default on).
    virtual void CrLf(bool on);
    virtual bool GetCrLf() const;

    // The sum of the column lengths, without the line break.
    int RecordLength() const;
    // Values cut to their column's length since Init.
    long long TruncatedValues() const { return m_llTruncated; }

private:
    void BuildRecord(std::string &record);
    int Width(int col) const;      // the length as written

    std::vector<int> m_lengths;
    bool m_bCrLf = true;
    long long m_llTruncated = 0;
    std::string m_record;
};
