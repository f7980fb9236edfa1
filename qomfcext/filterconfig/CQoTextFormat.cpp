#include "CQoTextFormat.h"

#include <olectl.h>

#include "CQoTextFormatCtrl.h"

IMPLEMENT_DYNCREATE(CQoTextFormat, CWnd)

BOOL CQoTextFormat::RegisterControlClass()
{
    return CQoTextFormatCtrl::Register() ? TRUE : FALSE;
}

BOOL CQoTextFormat::Create(LPCTSTR lpszWindowName, DWORD dwStyle, const RECT& rect, CWnd* pParentWnd, UINT nID)
{
    if (!RegisterControlClass()) return FALSE;
    return CWnd::Create(CQoTextFormatCtrl::ClassName, lpszWindowName, dwStyle | WS_HSCROLL | WS_VSCROLL, rect,
                        pParentWnd, nID);
}

BOOL CQoTextFormat::GetEnabled()
{
    BOOL result = FALSE;
    GetProperty(CQoTextFormatCtrl::dispidEnabled, VT_BOOL, &result);
    return result;
}

void CQoTextFormat::SetEnabled(BOOL bEnabled)
{
    SetProperty(CQoTextFormatCtrl::dispidEnabled, VT_BOOL, bEnabled);
}

BOOL CQoTextFormat::GetFlag()
{
    BOOL result = FALSE;
    GetProperty(CQoTextFormatCtrl::dispidFlag, VT_BOOL, &result);
    return result;
}

void CQoTextFormat::SetFlag(BOOL bFlag)
{
    SetProperty(CQoTextFormatCtrl::dispidFlag, VT_BOOL, bFlag);
}

OLE_COLOR CQoTextFormat::GetBackColor()
{
    long result = 0;
    GetProperty(DISPID_BACKCOLOR, VT_I4, &result);
    return static_cast<OLE_COLOR>(result);
}

void CQoTextFormat::SetBackColor(OLE_COLOR color)
{
    SetProperty(DISPID_BACKCOLOR, VT_I4, static_cast<long>(color));
}

void CQoTextFormat::ClearLines()
{
    InvokeHelper(CQoTextFormatCtrl::dispidClearLines, DISPATCH_METHOD, VT_EMPTY, NULL, NULL);
}

void CQoTextFormat::AddLine(LPCTSTR lpszLine)
{
    static const BYTE parms[] = VTS_BSTR;
    InvokeHelper(CQoTextFormatCtrl::dispidAddLine, DISPATCH_METHOD, VT_EMPTY, NULL, parms, lpszLine);
}

void CQoTextFormat::SetColumnMark(long lPos)
{
    static const BYTE parms[] = VTS_I4;
    InvokeHelper(CQoTextFormatCtrl::dispidSetColumnMark, DISPATCH_METHOD, VT_EMPTY, NULL, parms, lPos);
}

void CQoTextFormat::RemoveColumnMark(long lPos)
{
    static const BYTE parms[] = VTS_I4;
    InvokeHelper(CQoTextFormatCtrl::dispidRemoveColumnMark, DISPATCH_METHOD, VT_EMPTY, NULL, parms, lPos);
}

BOOL CQoTextFormat::IsColumnMark(long lPos)
{
    static const BYTE parms[] = VTS_I4;
    BOOL result = FALSE;
    InvokeHelper(CQoTextFormatCtrl::dispidIsColumnMark, DISPATCH_METHOD, VT_BOOL, &result, parms, lPos);
    return result;
}

void CQoTextFormat::AboutBox()
{
    InvokeHelper(DISPID_ABOUTBOX, DISPATCH_METHOD, VT_EMPTY, NULL, NULL);
}
