// CColoredListCtrl - an owner-drawn report list whose cells a subclass answers one
// at a time: text, text colour, text colour when the row is selected, and weight.
//
// It keeps no rows: the lists that use it are virtual (LVS_OWNERDATA, the count set
// with SetItemCountEx), and every paint asks GetColoredItem for the visible cells
// only, so it costs the same on a list of ten rows as on one of ten million. A row
// for which GetColoredItem answers 0 is painted as a thin line across the row.
//
//     // dialog template: SysListView32 with LVS_REPORT | LVS_OWNERDRAWFIXED | LVS_OWNERDATA
//     class CMyList : public CColoredListCtrl {
//         int GetColoredItem(int row, int col, CString& text, DWORD& clr,
//                            DWORD& clrSelected, bool& bold) override;
//     };
//     DDX_Control(pDX, IDC_LIST, m_list);   // then, in OnInitDialog:
//     m_list.Init();                        // the header's divider double click
//     m_list.SetHeaderLines(1);             // row 0 is a caption on the button face
//     m_list.AddListener(this);             // told when the user reorders the columns
//
// The first n "header lines" are painted on the button-face colour whatever their
// selection. A change of the column order is noticed at the next row painted and
// told to every listener once.
#pragma once

#include <afxcmn.h>

#include <set>
#include <vector>

#include "CColoredListCtrlListener.h"
#include "CQoHeaderCtrl.h"
#include "QoMfcExtApi.h"

class QOMFCEXT_API CColoredListCtrl : public CListCtrl
{
public:
    CColoredListCtrl();
    ~CColoredListCtrl() override;
    CColoredListCtrl(const CColoredListCtrl&) = delete;
    CColoredListCtrl& operator=(const CColoredListCtrl&) = delete;

    // Virtual functions a subclass overrides
    void DrawItem(LPDRAWITEMSTRUCT lpDrawItemStruct) override;
    // Nonzero if the row holds data. `col` is a column index, not a display position.
    virtual int GetColoredItem(int row, int col, CString& text, DWORD& clrText, DWORD& clrSelectedText,
                               bool& bold) = 0;
    // Asked before any item's state changes (selection, focus); false forbids the change.
    virtual bool ItemChanging();
    virtual void ItemChanged();
    // Call once the window exists (OnInitDialog): until then the header is a plain one.
    virtual void Init();

    // Not intended to be overridden. The setters do not repaint.
    void SetDontShowSelected(bool bDontShow);
    void SetHeaderLines(int nLines);
    void AddListener(CColoredListCtrlListener* pListener);
    void RemoveListener(CColoredListCtrlListener* pListener);
    // Width that fits the widest text among the column's first 300 rows; at least 50.
    int GetMaxColumnWidth(int column);
    // The column (index, not display position) whose header spans the x of a
    // point in screen coordinates that lies on the list; -1 for a point beside
    // the list or right of the last column. For context menus of the columns.
    int ColumnAtScreenPoint(CPoint point);

protected:
    afx_msg void OnItemchanged(NMHDR* pNMHDR, LRESULT* pResult);
    afx_msg void OnItemchanging(NMHDR* pNMHDR, LRESULT* pResult);
    DECLARE_MESSAGE_MAP()

private:
    void PrepareBoldFont(CDC* pDC);
    void NoticeOrderChange(const std::vector<int>& order);
    int FirstCellLeft(int item, const std::vector<int>& order, CRect& rcLabel);
    void PaintCells(CDC* pDC, int item, bool selected, const std::vector<int>& order, int x,
                    const CRect& rcLabel);

    bool m_bFontPrepared;
    CFont* m_pBoldFont;
    bool m_bDontShowSelected;
    int m_nHeaderLines;
    std::vector<int> m_lastOrder;
    std::set<CColoredListCtrlListener*> m_listeners;
    CQoHeaderCtrl m_header;
};
