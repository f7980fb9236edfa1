#include "QoPreviewCheck.h"

#include <exception>

#include "CColoredInputFilterListCtrl.h"
#include "CQoInputFilter.h"
#include "resource.h"

bool QoPreviewReadable(CQoInputFilter& filter, long maxRows, CString& error)
{
    try {
        int n = filter.NumCols();
        if (n <= 0) return true;  // nothing opened yet: an empty preview
        if (n > CColoredInputFilterListCtrl::kMaxColumns) n = CColoredInputFilterListCtrl::kMaxColumns;
        CQoString value;
        for (int i = 0; i < n; ++i) filter.ColName(i, value);
        if (!filter.FirstRow()) return true;
        for (long rows = 1;; ++rows) {
            for (int i = 0; i < n; ++i) filter.Value(i, value);
            if (maxRows != 0 && rows >= maxRows) break;
            if (!filter.NextRow()) break;
        }
        return true;
    } catch (const std::exception& e) {
        const char* file = filter.FileName();
        CString strFormat;
        strFormat.LoadString(IDS_PREVIEW_UNREADABLE);
        error.Format(strFormat, file != NULL ? file : "", e.what());
        return false;
    }
}
