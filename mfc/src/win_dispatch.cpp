// CWnd's calls of the dispatch members of the control behind a window.
#include "afxdisp.h"
#include "afxwin.h"

#include <cstdarg>
#include <cstring>
#include <vector>

namespace {

const int kMaxArguments = 32;  // more than any control member takes

UINT ControlUnknownMessage()
{
    static const UINT msg = ::RegisterWindowMessageA(AFX_CONTROL_UNKNOWN_MESSAGE);
    return msg;
}

BSTR WideOf(LPCSTR text)
{
    if (text == NULL) return ::SysAllocString(L"");
    const int n = ::MultiByteToWideChar(CP_ACP, 0, text, -1, NULL, 0);
    std::vector<WCHAR> wide(n > 0 ? n : 1, L'\0');
    if (n > 0) ::MultiByteToWideChar(CP_ACP, 0, text, -1, wide.data(), n);
    return ::SysAllocString(wide.data());
}

CString TextOf(BSTR text)
{
    if (text == NULL) return CString();
    const int n = ::WideCharToMultiByte(CP_ACP, 0, text, -1, NULL, 0, NULL, NULL);
    if (n <= 1) return CString();
    std::vector<char> narrow(n, '\0');
    ::WideCharToMultiByte(CP_ACP, 0, text, -1, narrow.data(), n, NULL, NULL);
    return CString(narrow.data());
}

// Takes the next argument of type vt from the list into the variant.
bool TakeArgument(VARTYPE vt, va_list& args, VARIANT& var)
{
    ::VariantInit(&var);
    switch (vt) {
    case VT_I2: V_VT(&var) = VT_I2; V_I2(&var) = static_cast<short>(va_arg(args, int)); return true;
    case VT_I4: V_VT(&var) = VT_I4; V_I4(&var) = va_arg(args, long); return true;
    case VT_R8: V_VT(&var) = VT_R8; V_R8(&var) = va_arg(args, double); return true;
    case VT_BOOL:
        V_VT(&var) = VT_BOOL;
        V_BOOL(&var) = va_arg(args, BOOL) ? VARIANT_TRUE : VARIANT_FALSE;
        return true;
    case VT_BSTR: V_VT(&var) = VT_BSTR; V_BSTR(&var) = WideOf(va_arg(args, LPCSTR)); return true;
    case VT_DISPATCH: {
        LPDISPATCH p = va_arg(args, LPDISPATCH);
        if (p != NULL) p->AddRef();
        V_VT(&var) = VT_DISPATCH;
        V_DISPATCH(&var) = p;
        return true;
    }
    case VT_VARIANT: {
        const VARIANT* p = va_arg(args, const VARIANT*);
        return p != NULL && SUCCEEDED(::VariantCopy(&var, const_cast<VARIANT*>(p)));
    }
    default: return false;
    }
}

// Stores the result, converted to vtRet, where pvRet points.
bool StoreResult(VARIANT& result, VARTYPE vtRet, void* pvRet)
{
    if (vtRet == VT_VARIANT) {
        ::VariantInit(static_cast<VARIANT*>(pvRet));
        return SUCCEEDED(::VariantCopy(static_cast<VARIANT*>(pvRet), &result));
    }
    if (V_VT(&result) != vtRet && FAILED(::VariantChangeType(&result, &result, 0, vtRet))) return false;
    switch (vtRet) {
    case VT_I2: *static_cast<short*>(pvRet) = V_I2(&result); return true;
    case VT_I4: *static_cast<long*>(pvRet) = V_I4(&result); return true;
    case VT_R8: *static_cast<double*>(pvRet) = V_R8(&result); return true;
    case VT_BOOL: *static_cast<BOOL*>(pvRet) = V_BOOL(&result) != VARIANT_FALSE; return true;
    case VT_BSTR: *static_cast<CString*>(pvRet) = TextOf(V_BSTR(&result)); return true;
    case VT_DISPATCH:
        *static_cast<LPDISPATCH*>(pvRet) = V_DISPATCH(&result);
        if (V_DISPATCH(&result) != NULL) V_DISPATCH(&result)->AddRef();
        return true;
    default: return false;
    }
}

void InvokeV(CWnd* pWnd, DISPID dwDispID, WORD wFlags, VARTYPE vtRet, void* pvRet, const BYTE* pbParamInfo,
             va_list args)
{
    LPUNKNOWN pUnknown = pWnd->GetControlUnknown();
    LPDISPATCH pDispatch = NULL;
    if (pUnknown == NULL || FAILED(pUnknown->QueryInterface(IID_IDispatch, reinterpret_cast<void**>(&pDispatch))) ||
        pDispatch == NULL)
        AfxThrowNotSupportedException();

    const size_t count = pbParamInfo != NULL ? strlen(reinterpret_cast<const char*>(pbParamInfo)) : 0;
    VARIANT arguments[kMaxArguments];
    size_t taken = 0;
    bool ok = count <= kMaxArguments;
    // The arguments go in from the last to the first.
    for (; ok && taken < count; ++taken) ok = TakeArgument(pbParamInfo[taken], args, arguments[count - 1 - taken]);

    HRESULT hr = E_INVALIDARG;
    VARIANT result;
    ::VariantInit(&result);
    if (ok) {
        DISPPARAMS params = {arguments, NULL, static_cast<UINT>(count), 0};
        DISPID named = DISPID_PROPERTYPUT;
        if (wFlags & (DISPATCH_PROPERTYPUT | DISPATCH_PROPERTYPUTREF)) {
            params.rgdispidNamedArgs = &named;
            params.cNamedArgs = 1;
        }
        EXCEPINFO excep;
        memset(&excep, 0, sizeof(excep));
        UINT argErr = 0;
        hr = pDispatch->Invoke(dwDispID, IID_NULL, LOCALE_USER_DEFAULT, wFlags, &params,
                               vtRet != VT_EMPTY ? &result : NULL, &excep, &argErr);
        ::SysFreeString(excep.bstrSource);
        ::SysFreeString(excep.bstrDescription);
        ::SysFreeString(excep.bstrHelpFile);
    }
    const size_t filled = ok ? count : (taken > 0 ? taken - 1 : 0);
    for (size_t i = 0; i < filled; ++i) ::VariantClear(&arguments[count - 1 - i]);
    pDispatch->Release();

    if (SUCCEEDED(hr) && vtRet != VT_EMPTY && pvRet != NULL && !StoreResult(result, vtRet, pvRet)) hr = E_INVALIDARG;
    ::VariantClear(&result);
    if (FAILED(hr)) AfxThrowInvalidArgException();
}

}  // namespace

LPUNKNOWN CWnd::GetControlUnknown()
{
    if (!::IsWindow(m_hWnd)) return NULL;
    return reinterpret_cast<LPUNKNOWN>(::SendMessageA(m_hWnd, ControlUnknownMessage(), 0, 0));
}

void AFX_CDECL CWnd::InvokeHelper(DISPID dwDispID, WORD wFlags, VARTYPE vtRet, void* pvRet,
                                  const BYTE* pbParamInfo, ...)
{
    va_list args;
    va_start(args, pbParamInfo);
    try {
        InvokeV(this, dwDispID, wFlags, vtRet, pvRet, pbParamInfo, args);
    } catch (...) {
        va_end(args);
        throw;
    }
    va_end(args);
}

void CWnd::GetProperty(DISPID dwDispID, VARTYPE vtProp, void* pvProp) const
{
    const_cast<CWnd*>(this)->InvokeHelper(dwDispID, DISPATCH_PROPERTYGET, vtProp, pvProp, NULL);
}

void AFX_CDECL CWnd::SetProperty(DISPID dwDispID, VARTYPE vtProp, ...)
{
    const BYTE params[2] = {static_cast<BYTE>(vtProp), 0};
    va_list args;
    va_start(args, vtProp);
    try {
        InvokeV(this, dwDispID, DISPATCH_PROPERTYPUT, VT_EMPTY, NULL, params, args);
    } catch (...) {
        va_end(args);
        throw;
    }
    va_end(args);
}
