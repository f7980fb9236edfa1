// CQoInputFilterTextVF: a text file of lines cut into fixed-width columns.
//
// Each line (ending in CR LF, LF or CR; the last may have none) is one
// record; column i covers ColLen(i) characters after the columns before it.
// Values lose their trailing blanks. A line shorter than the columns gives
// empty values for what is missing; a line with text beyond the last column
// is defective (see CQoInputFilterText), since that text would be lost.
//
//     CQoInputFilterTextVF in;
//     in.SetNumCols(3); in.ColLen(0, 10); in.ColLen(1, 5); in.ColLen(2, 20);
//     in.Init("liste.txt");
#pragma once

#include "CQoInputFilterText.h"

#include "CQoColumnWidths.h"

class QOTOOLS_API CQoInputFilterTextVF : public CQoInputFilterText {
public:
    CQoInputFilterTextVF();

    bool StartDescription(CQoString &line) override;
    void CopyFrom(CQoInputFilter const &other) override;
    void WriteConfig(CQoConfigFile &cfg, CQoString const &section) override;
    void ReadConfig(CQoConfigFile &cfg, CQoString const &section) override;

    // The column count; new columns have length 1.
    void SetNumCols(int cols);
    // Column lengths; outside 0 .. NumCols()-1 the getter answers 0 and the
    // setter does nothing; a length below 1 becomes 1.
    virtual int ColLen(int col) const;
    virtual void ColLen(int col, int length);
    // The sum of the column lengths.
    int RecordWidth() const;

protected:
    int ParseRecord(char const *begin, char const *end, bool eof, std::size_t &used) override;
    CQoString CheckRecord() override;
    void DetermineColumns() override;

private:
    CQoColumnWidths m_widths;
    std::size_t m_beyond = 0;   // non-blank characters after the last column
};
