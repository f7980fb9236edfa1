// CWnd's calls of a control's dispatch members through a CWnd that subclassed
// the control's window: arguments in order, results converted, property puts
// named as such, failures raised.
#include <gtest/gtest.h>

#include <afxdisp.h>
#include <afxwin.h>

#include <functional>
#include <string>

namespace {

// A control with one long property (id 1) and a method joining its string and
// long arguments into a string result (id 2).
class TestControl : public IDispatch
{
public:
    long m_lValue = 0;

    STDMETHODIMP QueryInterface(REFIID riid, void** ppv) override
    {
        if (riid != IID_IUnknown && riid != IID_IDispatch) return *ppv = NULL, E_NOINTERFACE;
        *ppv = static_cast<IDispatch*>(this);
        return S_OK;
    }
    STDMETHODIMP_(ULONG) AddRef() override { return 2; }
    STDMETHODIMP_(ULONG) Release() override { return 1; }
    STDMETHODIMP GetTypeInfoCount(UINT* n) override { return *n = 0, S_OK; }
    STDMETHODIMP GetTypeInfo(UINT, LCID, ITypeInfo**) override { return E_NOTIMPL; }
    STDMETHODIMP GetIDsOfNames(REFIID, LPOLESTR*, UINT, LCID, DISPID*) override { return E_NOTIMPL; }
    STDMETHODIMP Invoke(DISPID id, REFIID, LCID, WORD flags, DISPPARAMS* p, VARIANT* result, EXCEPINFO*,
                        UINT*) override
    {
        if (id == 1 && flags == DISPATCH_PROPERTYPUT) {
            if (p->cArgs != 1 || p->cNamedArgs != 1 || p->rgdispidNamedArgs[0] != DISPID_PROPERTYPUT)
                return DISP_E_PARAMNOTOPTIONAL;
            m_lValue = V_I4(&p->rgvarg[0]);
            return S_OK;
        }
        if (id == 1 && flags == DISPATCH_PROPERTYGET) {
            V_VT(result) = VT_I4;
            V_I4(result) = m_lValue;
            return S_OK;
        }
        if (id == 2 && p->cArgs == 2 && V_VT(&p->rgvarg[1]) == VT_BSTR && V_VT(&p->rgvarg[0]) == VT_I4) {
            std::wstring s = V_BSTR(&p->rgvarg[1]);
            s += L":" + std::to_wstring(V_I4(&p->rgvarg[0]));
            V_VT(result) = VT_BSTR;
            V_BSTR(result) = ::SysAllocString(s.c_str());
            return S_OK;
        }
        return DISP_E_MEMBERNOTFOUND;
    }
};

TestControl g_control;

LRESULT CALLBACK ControlProc(HWND hwnd, UINT msg, WPARAM wp, LPARAM lp)
{
    if (msg == ::RegisterWindowMessageA(AFX_CONTROL_UNKNOWN_MESSAGE))
        return reinterpret_cast<LRESULT>(static_cast<IUnknown*>(&g_control));
    return ::DefWindowProcA(hwnd, msg, wp, lp);
}

class DispatchTest : public ::testing::Test {
protected:
    void SetUp() override
    {
        WNDCLASSA wc = {};
        wc.lpfnWndProc = ControlProc;
        wc.hInstance = ::GetModuleHandleA(NULL);
        wc.lpszClassName = "DispatchTestControl";
        ::RegisterClassA(&wc);
        ASSERT_TRUE(m_control.SubclassWindow(::CreateWindowExA(0, "DispatchTestControl", "", WS_POPUP, 0, 0, 10, 10,
                                                               NULL, NULL, ::GetModuleHandleA(NULL), NULL)));
        ASSERT_TRUE(m_plain.CreateEx(0, "STATIC", "", WS_POPUP, 0, 0, 10, 10, NULL, NULL));
        g_control = TestControl();
    }
    void TearDown() override
    {
        m_control.DestroyWindow();
        m_plain.DestroyWindow();
    }
    CWnd m_control, m_plain;
};

// Whether the call raised an exception of the given kind.
template <class E>
bool Raises(const std::function<void()>& call)
{
    try {
        call();
    } catch (E* e) {
        e->Delete();
        return true;
    }
    return false;
}

TEST_F(DispatchTest, PropertiesAndMethodsReachTheControlAndFailuresAreRaised)
{
    // The control refuses a put not named as one; a value comes back as the type asked for.
    for (long set : {0L, 42L}) {
        m_control.SetProperty(1, VT_I4, set);
        long value = -1;
        BOOL flag = set == 0;  // the opposite of the answer
        m_control.GetProperty(1, VT_I4, &value);
        m_control.GetProperty(1, VT_BOOL, &flag);
        EXPECT_EQ(set, value);
        EXPECT_EQ(set != 0, flag != FALSE) << set;
    }

    static const BYTE joinParms[] = VTS_BSTR VTS_I4;
    CString joined;
    m_control.InvokeHelper(2, DISPATCH_METHOD, VT_BSTR, &joined, joinParms, "Satzl\xE4nge", 17L);
    EXPECT_STREQ("Satzl\xE4nge:17", joined);

    // Failures are raised.
    EXPECT_EQ(NULL, m_plain.GetControlUnknown());
    EXPECT_TRUE(Raises<CNotSupportedException>([&] { m_plain.InvokeHelper(1, DISPATCH_METHOD, VT_EMPTY, NULL, NULL); }));
    EXPECT_TRUE(Raises<CInvalidArgException>([&] { m_control.InvokeHelper(99, DISPATCH_METHOD, VT_EMPTY, NULL, NULL); }));
}

}  // namespace
