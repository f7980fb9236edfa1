// CColoredInputFilterListCtrl - the preview of an input filter's records in a
// coloured virtual list: one list column per filter column, titled with the
// filter's column names, and at most 1000 data rows.
//
// It copies no rows. Update() sets the columns, an item count and the column
// widths (judged from the first 50 rows); every paint then reads only the rows on
// screen through AbsoluteRow. So the list costs the same on a file of ten rows as
// on one of ten million: Update() never reads past row 1000, however long the
// file, and a jump to the last item reads that one row (a seek once it has been
// passed).
//
//     m_preview.SetInputFilter(&filter);       // not owned; must outlive the list
//     DDX_Control(pDX, IDC_PREVIEW, m_preview);  // LVS_REPORT|LVS_OWNERDRAWFIXED|LVS_OWNERDATA
//     m_preview.Init();                         // in OnInitDialog
//     m_preview.SetSpecialFirstRow(true, RGB(0, 0, 128), RGB(255, 255, 255));
//     m_preview.Update();                       // after every change of the filter
//     m_preview.SetSpecialText(0, "Name");      // captions: after each Update()
//
// With the special first row on, item 0 is a caption row on the button face (its
// texts set per column with SetSpecialText) and item 1 shows data row 0.
//
// Errors: Update() lets the filter's CQoException travel to its caller. A row that
// cannot be read while the list paints (the file changed, a defective record)
// shows as empty cells: an exception may not leave a window procedure.
#pragma once

#include <afxtempl.h>

#include "CColoredListCtrl.h"
#include "QoMfcExtApi.h"

class CQoInputFilter;

class QOMFCEXT_API CColoredInputFilterListCtrl : public CColoredListCtrl
{
public:
    // Rows shown at most, rows sampled for the column widths, columns shown at most.
    enum { kMaxRows = 1000, kSampleRows = 50, kMaxColumns = 10000 };

    explicit CColoredInputFilterListCtrl(bool useHeader = true);
    ~CColoredInputFilterListCtrl() override;

    void SetInputFilter(CQoInputFilter* pFilter);
    CQoInputFilter* GetInputFilter() const { return m_pFilter; }
    // Stored only: the column titles are always the filter's names.
    void UseHeader(bool useHeader);
    bool GetUseHeader() const { return m_bUseHeader; }
    // A caption row before the data, painted in these colours on the button face.
    void SetSpecialFirstRow(bool on, DWORD clrText, DWORD clrSelectedText);
    // Caption of a column; ignored for a column outside the current columns.
    void SetSpecialText(int column, const CString& text);

    // Rebuilds columns, item count and column widths from the filter.
    void Update();
    // Repaints one item (LVM_UPDATE); answers the message's result.
    int Update(int item);

    int GetColoredItem(int row, int col, CString& text, DWORD& clrText, DWORD& clrSelectedText,
                       bool& bold) override;

private:
    void SyncColumnCount(int n);
    long CountRowsUpToLimit();

    CQoInputFilter* m_pFilter;
    bool m_bUseHeader;
    DWORD m_clrText;
    DWORD m_clrSelectedText;
    bool m_bSpecialFirstRow;
    DWORD m_clrSpecialText;
    DWORD m_clrSpecialSelectedText;
    CArray<CString, CString&> m_arrSpecialTexts;
};
