// The previews' column widths, the same for the coloured and the plain list:
// each column as wide as the average pixel width of its texts in the rows
// read (50 when none was read) plus 30, and the list window's spare width
// (after 16 for the border and the scroll bar) shared equally.
#pragma once

#include <afxcmn.h>

#include <vector>

// `sums` holds one text-width sum per column, `rows` the number of rows read.
void SetPreviewColumnWidths(CListCtrl& list, const std::vector<long long>& sums, int rows);
