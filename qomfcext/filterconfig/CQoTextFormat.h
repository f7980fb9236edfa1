// CQoTextFormat - the wrapper of the text-format control (CQoTextFormatCtrl):
// every member is a call of the control's dispatch member of the same name.
//
//     CQoTextFormat view;                // or DDX_Control with a template's control
//     view.Create(NULL, WS_CHILD | WS_VISIBLE | WS_BORDER, rect, pParent, 4012);
//     view.ClearLines();
//     view.AddLine("Meier     Hans  ");
//     view.SetColumnMark(10);
//     if (view.IsColumnMark(10)) ...
#pragma once

#include <afxdisp.h>
#include <afxwin.h>
#include <olectl.h>

class CQoTextFormat : public CWnd
{
    DECLARE_DYNCREATE(CQoTextFormat)

public:
    CQoTextFormat() {}

    // Creates the control (its window class registered first).
    virtual BOOL Create(LPCTSTR lpszWindowName, DWORD dwStyle, const RECT& rect, CWnd* pParentWnd, UINT nID);
    using CWnd::Create;
    // Registers the control's window class, so that templates can hold the control.
    static BOOL RegisterControlClass();

    // Properties
    BOOL GetEnabled();
    void SetEnabled(BOOL bEnabled);
    BOOL GetFlag();
    void SetFlag(BOOL bFlag);
    OLE_COLOR GetBackColor();
    void SetBackColor(OLE_COLOR color);

    // Methods
    void ClearLines();
    void AddLine(LPCTSTR lpszLine);
    void SetColumnMark(long lPos);
    void RemoveColumnMark(long lPos);
    BOOL IsColumnMark(long lPos);
    void AboutBox();
};
