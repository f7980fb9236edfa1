// COutputFilterConfigTextFixClrListCtrl - the column list of the fixed-length
// text output page: one row per output column with its name, its offset in the
// record (grey: computed, not edited) and its length.
//
// The list holds no rows of its own; it asks its page for each cell. A row
// that the page does not (or no longer) have is painted as empty cells, so a
// list whose item count runs ahead of the page's columns never fails a paint.
// Every change of an item's state is passed to the page (ListItemChanged),
// which follows the selection.
#pragma once

#include "CColoredListCtrl.h"

class COutputFilterConfigTextFix;

class COutputFilterConfigTextFixClrListCtrl : public CColoredListCtrl
{
public:
    // Text colours of the cells.
    enum : DWORD { clrText = 0x000000, clrSelectedText = 0xFFFFFF, clrComputed = 0x7F7F7F };

    explicit COutputFilterConfigTextFixClrListCtrl(COutputFilterConfigTextFix* pPage);
    ~COutputFilterConfigTextFixClrListCtrl() override;

    int GetColoredItem(int row, int col, CString& text, DWORD& clrTextOut, DWORD& clrSelectedTextOut,
                       bool& bold) override;
    void ItemChanged() override;

private:
    COutputFilterConfigTextFix* m_pPage;  // not owned; null: every cell answers 1 and nothing else
};
