// CWnd's calls of a control's dispatch members on real windows: a control window
// that hands out its IUnknown, reached through InvokeHelper, GetProperty and
// SetProperty (arguments in order and converted, results converted, property
// puts named as such, failures raised), also through a CWnd that subclassed it.
#include <gtest/gtest.h>

#include <afxdisp.h>
#include <afxwin.h>

#include <string>
#include <vector>

namespace {

// A control with one long property (id 1), a method joining its string and long
// arguments into a string result (id 2) and a method answering whether its
// argument is even (id 3).
class TestControl : public IDispatch
{
public:
    long m_lValue = 0;
    std::vector<WORD> m_flags;  // the flags of every call

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
        m_flags.push_back(flags);
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
        if (id == 3 && p->cArgs == 1) {
            V_VT(result) = VT_I4;  // the caller asks for VT_BOOL: converted
            V_I4(result) = V_I4(&p->rgvarg[0]) % 2 == 0;
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
        ASSERT_TRUE(m_control.Attach(RawControl()));
        ASSERT_TRUE(m_plain.CreateEx(0, "STATIC", "", WS_POPUP, 0, 0, 10, 10, NULL, NULL));
        g_control = TestControl();
    }
    static HWND RawControl()
    {
        return ::CreateWindowExA(0, "DispatchTestControl", "", WS_POPUP, 0, 0, 10, 10, NULL, NULL,
                                 ::GetModuleHandleA(NULL), NULL);
    }
    void TearDown() override
    {
        m_control.DestroyWindow();
        m_plain.DestroyWindow();
    }
    CWnd m_control, m_plain;
};

TEST_F(DispatchTest, PropertiesArePutAsNamedArgumentAndRead)
{
    m_control.SetProperty(1, VT_I4, 42L);
    long value = 0;
    m_control.GetProperty(1, VT_I4, &value);
    EXPECT_EQ(42, value);
    EXPECT_EQ((std::vector<WORD>{DISPATCH_PROPERTYPUT, DISPATCH_PROPERTYGET}), g_control.m_flags);
}

TEST_F(DispatchTest, MethodsTakeArgumentsInOrderAndConvertTheirResult)
{
    static const BYTE joinParms[] = VTS_BSTR VTS_I4;
    CString joined;
    m_control.InvokeHelper(2, DISPATCH_METHOD, VT_BSTR, &joined, joinParms, "Satzlänge", 17L);
    EXPECT_STREQ("Satzlänge:17", joined);

    static const BYTE evenParms[] = VTS_I4;
    BOOL even = FALSE;
    m_control.InvokeHelper(3, DISPATCH_METHOD, VT_BOOL, &even, evenParms, 4L);
    EXPECT_TRUE(even);
    m_control.InvokeHelper(3, DISPATCH_METHOD, VT_BOOL, &even, evenParms, 5L);
    EXPECT_FALSE(even);
}

TEST_F(DispatchTest, ASubclassingWrapperReachesTheControl)
{
    CWnd wrapper;
    ASSERT_TRUE(wrapper.SubclassWindow(RawControl()));
    wrapper.SetProperty(1, VT_I4, 7L);
    EXPECT_EQ(7, g_control.m_lValue);
    wrapper.DestroyWindow();
}

TEST_F(DispatchTest, FailuresAreRaised)
{
    bool notSupported = false, refused = false;
    try {
        m_plain.InvokeHelper(1, DISPATCH_METHOD, VT_EMPTY, NULL, NULL);
    } catch (CNotSupportedException* e) {
        notSupported = true;
        e->Delete();
    }
    try {
        m_control.InvokeHelper(99, DISPATCH_METHOD, VT_EMPTY, NULL, NULL);
    } catch (CInvalidArgException* e) {
        refused = true;
        e->Delete();
    }
    EXPECT_TRUE(notSupported);
    EXPECT_TRUE(refused);
    EXPECT_EQ(NULL, m_plain.GetControlUnknown());
}

}  // namespace
