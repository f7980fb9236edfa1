// CQoHeaderCtrl - the header of a CColoredListCtrl: a double click near a divider
// sizes a column to the widest text the list would paint in it.
//
// The list owns it and subclasses its own header window into it (CColoredListCtrl::
// Init). Near a divider means within 10 pixels of an item's left or right edge. A
// click just right of a divider sizes the item to the left of it (by index), except
// in the first and in the last item, where it sizes the clicked item itself.
#pragma once

#include <afxcmn.h>

#include "QoMfcExtApi.h"

class CColoredListCtrl;

class QOMFCEXT_API CQoHeaderCtrl : public CHeaderCtrl
{
public:
    explicit CQoHeaderCtrl(CColoredListCtrl* pOwner);
    CQoHeaderCtrl(const CQoHeaderCtrl&) = delete;
    CQoHeaderCtrl& operator=(const CQoHeaderCtrl&) = delete;

protected:
    afx_msg void OnLButtonDblClk(UINT nFlags, CPoint point);
    DECLARE_MESSAGE_MAP()

private:
    CColoredListCtrl* m_pOwner;
};
