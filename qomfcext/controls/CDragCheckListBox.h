// CDragCheckListBox - a check list box whose items the user reorders by
// dragging them with the left mouse button.
//
// While an item is dragged a bar between two items shows where it will land;
// on release over an item it moves there with its text, item data, check and
// enabled state, and is selected. Every release of the left button and every
// key press is announced to the modification listeners, whether or not it
// changed anything: a listener compares for itself (the output source page
// does). The horizontal scroll range grows with the widest text ever added.
//
//     CDragCheckListBox m_list(ID_COLUMNS, false);     // notifier id, no-drag off
//     DDX_Control(pDX, IDC_COLUMNS, m_list);           // LBS_OWNERDRAWFIXED | LBS_HASSTRINGS
//     m_list.AddModifiedListener(this);
//     m_list.AddString("Name", nColumn, TRUE);         // text, item data, ticked
#pragma once

#include <afxwin.h>

#include "CModifiedNotifier.h"
#include "QoMfcExtApi.h"

class QOMFCEXT_API CDragCheckListBox : public CCheckListBox, public CModifiedNotifier
{
    DECLARE_DYNAMIC(CDragCheckListBox)

public:
    CDragCheckListBox(int nNotifierId, bool bNoDrag);
    virtual ~CDragCheckListBox();

    // Widens the scroll range if needed, then adds; the new item's index.
    virtual int AddString(const char* lpszItem);
    // The same, then the item's data and check (ticked when nCheck is nonzero).
    virtual int AddString(const char* lpszItem, long lData, int nCheck);

    // With no-drag set a press only does what a check list box does.
    void SetNoDrag(bool bNoDrag) { m_bNoDrag = bNoDrag; }

protected:
    afx_msg void OnLButtonDown(UINT nFlags, CPoint point);
    afx_msg void OnLButtonUp(UINT nFlags, CPoint point);
    afx_msg void OnMouseMove(UINT nFlags, CPoint point);
    afx_msg void OnKeyDown(UINT nChar, UINT nRepCnt, UINT nFlags);
    afx_msg LRESULT OnCaptureChanged(WPARAM wParam, LPARAM lParam);
    DECLARE_MESSAGE_MAP()

private:
    // The item whose rectangle holds the point, or -1.
    int ItemAt(CPoint point);
    // Inverts the bar off its old place and onto y (-1: nowhere).
    void DrawMarker(int y);
    void MoveItem(int nFrom, int nBefore);

    int m_nDragSource;
    int m_nDropTarget;
    int m_nMarkerPos;
    BOOL m_bDragging;
    int m_nWidest;
    bool m_bNoDrag;
};
