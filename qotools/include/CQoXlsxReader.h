// CQoXlsxReader: reads the worksheets of an Excel workbook (.xlsx), read only.
//
// There is no Excel engine on this platform, so the file-database engine and
// the conversion tools read workbooks through this class: Open the file, pick
// a sheet by index or by name (FindSheet accepts "Tabelle1$" as DAO names a
// sheet), OpenSheet, then NextRow until it answers false. Each row comes back
// as cells typed as the workbook stores them: numbers, text converted to
// Windows-1252 ('?' for characters it lacks), booleans, dates as Excel serial
// numbers (1900 system; a 1904 workbook's dates are moved onto it) and error
// values such as "#DIV/0!". A formula cell gives the result Excel stored
// with it (none: empty); characters Excel writes as _xHHHH_ come back as
// themselves.
//
// The table of a sheet is its used range: from the first to the last row and
// from the first to the last column that hold a value. Rows come back densely
// (a row missing in between is a row of empty cells), each exactly
// ColumnCount cells wide. Cells that carry only formatting are empty and do
// not widen the range.
//
// Memory: the shared strings of the workbook (in Windows-1252) and the
// inflated XML of the open sheet are held, nothing else of the file. Bounds,
// each checked before it sizes anything: zip archives without ZIP64 (at most
// 4 GiB and 65,534 members; the reader takes at most 100,000); a member
// inflates to at most 1 GiB and to at most 200 times its compressed size
// plus 1 MiB (real sheets compress 10 to 15 times; more is a zip bomb);
// at most 16,777,216 shared strings and 65,536 cell or number formats;
// rows 1..1,048,576 and columns A..XFD as in Excel. OpenSheet reads the sheet
// once to find its range, so ColumnCount and RowCount are known before the
// first row. A row holds ColumnCount cells: a sheet with values in A1 and
// XFD1048576 is a table of a million rows of 16,384 cells, read one at a time.
//
// Failures of the file (missing, not a workbook, an old .xls, password
// protection, damaged zip or XML, sizes beyond the bounds) raise CQoException
// with a German text naming the file; a failed Open leaves the reader closed.
#pragma once

#include "CQoString.h"
#include "QoToolsApi.h"

#include <memory>
#include <vector>

class QOTOOLS_API CQoXlsxReader {
public:
    struct Cell {
        // The kinds carry a prefix: `number` and `text` name the values.
        enum Type { typeEmpty = 0, typeNumber = 1, typeText = 2, typeBoolean = 3, typeDate = 4, typeError = 5 };
        int type = typeEmpty;
        double number = 0;     // number, boolean (0/1), date (Excel serial, 1900 system)
        CQoString text;        // text (Windows-1252), error ("#DIV/0!")
    };

    CQoXlsxReader();
    ~CQoXlsxReader();
    CQoXlsxReader(CQoXlsxReader const &) = delete;
    CQoXlsxReader &operator=(CQoXlsxReader const &) = delete;

    // --- the workbook --------------------------------------------------------
    // Opens a workbook, closing the one open before. Raises CQoException.
    void Open(char const *path);
    void Close();
    bool IsOpen() const;
    // Worksheets only (no chart sheets), in the order of the workbook.
    int SheetCount() const;
    // The name as the workbook gives it, in Windows-1252.
    CQoString SheetName(int index) const;
    // By name, ignoring case and one trailing '$'; -1 when there is none.
    int FindSheet(char const *name) const;
    // True when the workbook counts its dates from 1904 (they are converted).
    bool Date1904() const;

    // --- the rows of one sheet -----------------------------------------------
    // Reads the sheet's range and places the reading before its first row.
    // Raises CQoException for a damaged sheet.
    void OpenSheet(int index);
    // The next row, ColumnCount cells; false after the last row.
    // Raises CQoException for a damaged cell (the message names it).
    bool NextRow(std::vector<Cell> &row);
    // Places the reading before the first row again.
    void RewindSheet();
    // Columns and rows of the open sheet's range (0 and 0 for an empty sheet).
    // Neither moves the reading position.
    int ColumnCount() const;
    long RowCount();
    // Row and column numbers (1-based, as Excel counts) of the range's top
    // left cell, for messages that point the user at a cell.
    long FirstRowNumber() const;
    int FirstColumnNumber() const;

private:
    struct Impl;
    std::unique_ptr<Impl> m_impl;
};
