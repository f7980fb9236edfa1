// CQoTextFormatCtrl - the text-format control of the fixed-length text page: a
// text view that shows lines in a fixed-pitch font under a ruler, with column
// marks drawn as vertical lines between characters.
//
// The user sets a mark with a click between two characters, deletes one with a
// double click on it and moves one by dragging it. Programs work the control
// through its dispatch members (see CQoTextFormat, which wraps them); the window
// answers AFX_CONTROL_UNKNOWN_MESSAGE with its IUnknown, so that CWnd::InvokeHelper
// reaches it as it reaches any control.
//
// The window class "QoTextFormat" is registered by Register() (done by
// CQoTextFormat and the page before any template that holds the control is used).
// ClearLines removes the marks as well: the view then shows only the marks that
// are set again with the new lines.
#pragma once

#include <afxwin.h>

class CQoTextFormatCtrl
{
public:
    static const char* const ClassName;  // "QoTextFormat"
    // Registers the window class (once per process); false if that failed.
    static bool Register();

    // Dispatch ids
    enum {
        dispidEnabled = 1,
        dispidFlag = 2,
        dispidClearLines = 3,
        dispidAddLine = 4,
        dispidSetColumnMark = 5,
        dispidRemoveColumnMark = 6,
        dispidIsColumnMark = 7,
    };
    // Marks are positions 0 .. MaxMarkPosition; others are ignored (and never set).
    enum { MaxMarkPosition = 16 << 20 };
};
