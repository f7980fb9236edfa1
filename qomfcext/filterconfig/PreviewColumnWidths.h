// The previews' column widths, the same for the coloured and the plain list:
// each column as wide as the average pixel width of its texts in the rows
// read (50 when none was read) plus 30, and the list window's spare width
// (after 16 for the border and the scroll bar) shared equally.
#pragma once

#include <afxcmn.h>

#include <vector>

class CQoString;

// Text widths in a list's font, measured with one device context for all of
// them: the list's own GetStringWidth takes a device context per text, and a
// preview measures a thousand rows (under Wine that alone took 25 ms). A
// text's width is the sum of its characters' advance widths, as the list
// draws it without kerning.
class CPreviewTextMeter
{
public:
    explicit CPreviewTextMeter(CListCtrl& list);
    int Width(const CQoString& text) const;

private:
    CListCtrl& m_list;
    int m_widths[256];
    bool m_bKnown;   // false: the widths could not be read; the list measures
};

// `sums` holds one text-width sum per column, `rows` the number of rows read.
void SetPreviewColumnWidths(CListCtrl& list, const std::vector<long long>& sums, int rows);
