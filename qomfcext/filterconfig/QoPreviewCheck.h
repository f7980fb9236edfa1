// QoPreviewReadable - reads the rows a preview would show, before the preview
// throws away what it shows now.
//
// The plain preview empties itself and then reads; a filter whose file vanished
// or was cut short would leave it half filled. Reading the same rows first (the
// first `maxRows`, 0: all, every column) tells whether the preview can be
// rebuilt; when it cannot, `error` holds a German message naming the file and
// the filter's own words.
//
//     CString error;
//     if (!QoPreviewReadable(filter, 1000, error)) ShowError(error);
//     else preview.Update();
#pragma once

#include <afx.h>

class CQoInputFilter;

bool QoPreviewReadable(CQoInputFilter& filter, long maxRows, CString& error);
