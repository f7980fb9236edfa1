#include "CQoTextFormatCtrl.h"

#include <olectl.h>

#include <algorithm>
#include <set>
#include <string>
#include <vector>

const char* const CQoTextFormatCtrl::ClassName = "QoTextFormat";

namespace {

const int kMargin = 4;                    // pixels left of the first character
const COLORREF kMarkColour = RGB(0, 0, 255);
const COLORREF kRulerText = RGB(96, 96, 96);
const int kMaxLines = 1 << 20;            // lines kept at most; more are dropped

class TextFormat;
TextFormat* Of(HWND hwnd)
{
    return reinterpret_cast<TextFormat*>(::GetWindowLongPtrA(hwnd, GWLP_USERDATA));
}

std::string Narrow(BSTR text)
{
    if (text == NULL) return std::string();
    const int n = ::WideCharToMultiByte(CP_ACP, 0, text, static_cast<int>(::SysStringLen(text)), NULL, 0, NULL, NULL);
    std::string s(n > 0 ? n : 0, '\0');
    if (n > 0)
        ::WideCharToMultiByte(CP_ACP, 0, text, static_cast<int>(::SysStringLen(text)), &s[0], n, NULL, NULL);
    return s;
}

// One control: its lines, marks, properties and the dispatch interface.
class TextFormat : public IDispatch
{
public:
    explicit TextFormat(HWND hwnd) : m_hwnd(hwnd), m_clrBack(::GetSysColor(COLOR_WINDOW))
    {
        m_font = ::CreateFontA(-13, 0, 0, 0, FW_NORMAL, 0, 0, 0, ANSI_CHARSET, OUT_DEFAULT_PRECIS,
                               CLIP_DEFAULT_PRECIS, DEFAULT_QUALITY, FIXED_PITCH | FF_MODERN, "Courier New");
        HDC hdc = ::GetDC(hwnd);
        HGDIOBJ old = ::SelectObject(hdc, m_font);
        TEXTMETRICA tm;
        ::GetTextMetricsA(hdc, &tm);
        ::SelectObject(hdc, old);
        ::ReleaseDC(hwnd, hdc);
        m_cxChar = std::max<int>(1, tm.tmAveCharWidth);
        m_cyChar = std::max<int>(1, tm.tmHeight);
    }
    virtual ~TextFormat() { ::DeleteObject(m_font); }

    // IUnknown
    STDMETHODIMP QueryInterface(REFIID riid, void** ppv) override
    {
        if (ppv == NULL) return E_POINTER;
        if (riid == IID_IUnknown || riid == IID_IDispatch) {
            *ppv = static_cast<IDispatch*>(this);
            AddRef();
            return S_OK;
        }
        *ppv = NULL;
        return E_NOINTERFACE;
    }
    STDMETHODIMP_(ULONG) AddRef() override { return ++m_refs; }
    STDMETHODIMP_(ULONG) Release() override
    {
        const ULONG n = --m_refs;
        if (n == 0) delete this;
        return n;
    }
    // IDispatch: no type information; members by id only.
    STDMETHODIMP GetTypeInfoCount(UINT* pctinfo) override
    {
        if (pctinfo) *pctinfo = 0;
        return S_OK;
    }
    STDMETHODIMP GetTypeInfo(UINT, LCID, ITypeInfo**) override { return E_NOTIMPL; }
    STDMETHODIMP GetIDsOfNames(REFIID, LPOLESTR*, UINT, LCID, DISPID*) override { return E_NOTIMPL; }
    STDMETHODIMP Invoke(DISPID id, REFIID, LCID, WORD flags, DISPPARAMS* params, VARIANT* result, EXCEPINFO*,
                        UINT* argErr) override;

    // The window's messages
    LRESULT Handle(UINT msg, WPARAM wp, LPARAM lp);
    void Detach() { m_hwnd = NULL; }

private:
    HRESULT Arg(DISPPARAMS* params, UINT index, VARTYPE vt, VARIANT& out, UINT* argErr) const;

    void SetMark(long pos)
    {
        if (pos < 0 || pos > CQoTextFormatCtrl::MaxMarkPosition) return;
        if (m_marks.insert(pos).second) Invalidate();
    }
    void RemoveMark(long pos)
    {
        if (m_marks.erase(pos)) Invalidate();
    }
    bool IsMark(long pos) const { return m_marks.count(pos) != 0; }
    void Invalidate()
    {
        if (m_hwnd) ::InvalidateRect(m_hwnd, NULL, FALSE);
    }
    int RulerHeight() const { return m_cyChar + 6; }
    // The character boundary nearest to the client x coordinate.
    long PosAt(int x) const
    {
        const long pos = m_firstCol + (x - kMargin + m_cxChar / 2) / m_cxChar;
        return std::max(0L, pos);
    }
    int XOf(long pos) const { return kMargin + static_cast<int>(pos - m_firstCol) * m_cxChar; }
    void UpdateScrollBars();
    void Scroll(int bar, int code);
    void Paint(HDC hdc);

    ULONG m_refs = 1;
    HWND m_hwnd;
    HFONT m_font;
    int m_cxChar = 8, m_cyChar = 13;
    std::vector<std::string> m_lines;
    size_t m_longest = 0;
    std::set<long> m_marks;
    BOOL m_bEnabled = TRUE;
    BOOL m_bFlag = FALSE;
    COLORREF m_clrBack;
    long m_firstLine = 0, m_firstCol = 0;
    long m_dragging = -1;  // the mark being dragged, or -1
};

HRESULT TextFormat::Arg(DISPPARAMS* params, UINT index, VARTYPE vt, VARIANT& out, UINT* argErr) const
{
    ::VariantInit(&out);
    if (params == NULL || index >= params->cArgs) return DISP_E_BADPARAMCOUNT;
    const UINT at = params->cArgs - 1 - index;
    if (FAILED(::VariantChangeType(&out, &params->rgvarg[at], 0, vt))) {
        if (argErr) *argErr = at;
        return DISP_E_TYPEMISMATCH;
    }
    return S_OK;
}

STDMETHODIMP TextFormat::Invoke(DISPID id, REFIID, LCID, WORD flags, DISPPARAMS* params, VARIANT* result,
                                EXCEPINFO*, UINT* argErr)
{
    const bool get = (flags & DISPATCH_PROPERTYGET) != 0 && (flags & DISPATCH_PROPERTYPUT) == 0;
    const bool put = (flags & DISPATCH_PROPERTYPUT) != 0;
    const bool method = (flags & DISPATCH_METHOD) != 0;
    VARIANT v;
    HRESULT hr;
    switch (id) {
    case CQoTextFormatCtrl::dispidEnabled:
    case CQoTextFormatCtrl::dispidFlag: {
        BOOL& value = id == CQoTextFormatCtrl::dispidEnabled ? m_bEnabled : m_bFlag;
        if (put) {
            if (FAILED(hr = Arg(params, 0, VT_BOOL, v, argErr))) return hr;
            value = V_BOOL(&v) != VARIANT_FALSE;
            if (id == CQoTextFormatCtrl::dispidEnabled && m_hwnd) {
                ::EnableWindow(m_hwnd, value);
                Invalidate();
            }
            return S_OK;
        }
        if (!get) return DISP_E_MEMBERNOTFOUND;
        if (result) {
            ::VariantInit(result);
            V_VT(result) = VT_BOOL;
            V_BOOL(result) = value ? VARIANT_TRUE : VARIANT_FALSE;
        }
        return S_OK;
    }
    case DISPID_BACKCOLOR:
        if (put) {
            if (FAILED(hr = Arg(params, 0, VT_I4, v, argErr))) return hr;
            m_clrBack = static_cast<COLORREF>(V_I4(&v));
            Invalidate();
            return S_OK;
        }
        if (!get) return DISP_E_MEMBERNOTFOUND;
        if (result) {
            ::VariantInit(result);
            V_VT(result) = VT_I4;
            V_I4(result) = static_cast<LONG>(m_clrBack);
        }
        return S_OK;
    case CQoTextFormatCtrl::dispidClearLines:
        if (!method) return DISP_E_MEMBERNOTFOUND;
        m_lines.clear();
        m_marks.clear();
        m_longest = 0;
        m_firstLine = m_firstCol = 0;
        m_dragging = -1;
        UpdateScrollBars();
        Invalidate();
        return S_OK;
    case CQoTextFormatCtrl::dispidAddLine:
        if (!method) return DISP_E_MEMBERNOTFOUND;
        if (FAILED(hr = Arg(params, 0, VT_BSTR, v, argErr))) return hr;
        if (m_lines.size() < static_cast<size_t>(kMaxLines)) {
            m_lines.push_back(Narrow(V_BSTR(&v)));
            m_longest = std::max(m_longest, m_lines.back().size());
        }
        ::VariantClear(&v);
        UpdateScrollBars();
        Invalidate();
        return S_OK;
    case CQoTextFormatCtrl::dispidSetColumnMark:
    case CQoTextFormatCtrl::dispidRemoveColumnMark:
    case CQoTextFormatCtrl::dispidIsColumnMark:
        if (!method) return DISP_E_MEMBERNOTFOUND;
        if (FAILED(hr = Arg(params, 0, VT_I4, v, argErr))) return hr;
        if (id == CQoTextFormatCtrl::dispidSetColumnMark) {
            SetMark(V_I4(&v));
            UpdateScrollBars();
        } else if (id == CQoTextFormatCtrl::dispidRemoveColumnMark) {
            RemoveMark(V_I4(&v));
        } else if (result) {
            const bool mark = IsMark(V_I4(&v));
            ::VariantInit(result);
            V_VT(result) = VT_BOOL;
            V_BOOL(result) = mark ? VARIANT_TRUE : VARIANT_FALSE;
        }
        return S_OK;
    case DISPID_ABOUTBOX:
        if (!method) return DISP_E_MEMBERNOTFOUND;
        ::MessageBoxA(m_hwnd, "Textformat-Steuerelement: Spalten fester Breite über einer Textansicht.",
                      "Info", MB_OK | MB_ICONINFORMATION);
        return S_OK;
    default:
        return DISP_E_MEMBERNOTFOUND;
    }
}

void TextFormat::UpdateScrollBars()
{
    if (m_hwnd == NULL) return;
    RECT rc;
    ::GetClientRect(m_hwnd, &rc);
    const long lastMark = m_marks.empty() ? 0 : *m_marks.rbegin();
    const long cols = static_cast<long>(std::max<size_t>(m_longest, static_cast<size_t>(lastMark))) + 2;
    SCROLLINFO si = {sizeof(si), SIF_RANGE | SIF_PAGE | SIF_POS, 0, 0, 0, 0, 0};
    si.nMax = static_cast<int>(std::min<size_t>(m_lines.size(), kMaxLines));
    si.nPage = std::max<int>(1, static_cast<int>(rc.bottom - RulerHeight()) / m_cyChar);
    m_firstLine = std::max(0L, std::min(m_firstLine, static_cast<long>(si.nMax) - static_cast<long>(si.nPage) + 1));
    si.nPos = static_cast<int>(m_firstLine);
    ::SetScrollInfo(m_hwnd, SB_VERT, &si, TRUE);
    si.nMax = static_cast<int>(std::min(cols, static_cast<long>(CQoTextFormatCtrl::MaxMarkPosition)));
    si.nPage = std::max<int>(1, static_cast<int>(rc.right - kMargin) / m_cxChar);
    m_firstCol = std::max(0L, std::min(m_firstCol, static_cast<long>(si.nMax) - static_cast<long>(si.nPage) + 1));
    si.nPos = static_cast<int>(m_firstCol);
    ::SetScrollInfo(m_hwnd, SB_HORZ, &si, TRUE);
}

void TextFormat::Scroll(int bar, int code)
{
    SCROLLINFO si = {sizeof(si), SIF_ALL, 0, 0, 0, 0, 0};
    ::GetScrollInfo(m_hwnd, bar, &si);
    long pos = si.nPos;
    switch (code) {
    case SB_LINEUP: pos -= 1; break;
    case SB_LINEDOWN: pos += 1; break;
    case SB_PAGEUP: pos -= static_cast<long>(si.nPage); break;
    case SB_PAGEDOWN: pos += static_cast<long>(si.nPage); break;
    case SB_THUMBTRACK:
    case SB_THUMBPOSITION: pos = si.nTrackPos; break;
    case SB_TOP: pos = 0; break;
    case SB_BOTTOM: pos = si.nMax; break;
    default: return;
    }
    (bar == SB_VERT ? m_firstLine : m_firstCol) = std::max(0L, pos);
    UpdateScrollBars();
    Invalidate();
}

void TextFormat::Paint(HDC hdc)
{
    RECT rc;
    ::GetClientRect(m_hwnd, &rc);
    HBRUSH back = ::CreateSolidBrush(m_clrBack);
    ::FillRect(hdc, &rc, back);
    ::DeleteObject(back);
    HGDIOBJ oldFont = ::SelectObject(hdc, m_font);
    ::SetBkMode(hdc, TRANSPARENT);

    // The ruler: a tick at every character, a number at every tenth.
    const int ruler = RulerHeight();
    RECT rr = {0, 0, rc.right, ruler};
    ::FillRect(hdc, &rr, ::GetSysColorBrush(COLOR_BTNFACE));
    HPEN tickPen = ::CreatePen(PS_SOLID, 1, kRulerText);
    HGDIOBJ oldPen = ::SelectObject(hdc, tickPen);
    ::SetTextColor(hdc, kRulerText);
    for (long pos = m_firstCol; XOf(pos) < rc.right; ++pos) {
        const int x = XOf(pos);
        const int len = pos % 10 == 0 ? 6 : (pos % 5 == 0 ? 4 : 2);
        ::MoveToEx(hdc, x, ruler - len, NULL);
        ::LineTo(hdc, x, ruler);
        if (pos % 10 == 0 && pos > 0) {
            char num[16];
            const int n = wsprintfA(num, "%ld", pos);
            ::TextOutA(hdc, x + 2, 0, num, n);
        }
    }
    ::SelectObject(hdc, oldPen);
    ::DeleteObject(tickPen);

    // The lines
    const bool enabled = ::IsWindowEnabled(m_hwnd) && m_bEnabled;
    ::SetTextColor(hdc, ::GetSysColor(enabled ? COLOR_WINDOWTEXT : COLOR_GRAYTEXT));
    RECT textRect = {kMargin, ruler, rc.right, rc.bottom};
    ::IntersectClipRect(hdc, 0, ruler, rc.right, rc.bottom);
    for (long i = m_firstLine, y = ruler; i < static_cast<long>(m_lines.size()) && y < rc.bottom; ++i, y += m_cyChar) {
        const std::string& line = m_lines[i];
        if (static_cast<size_t>(m_firstCol) >= line.size()) continue;
        const size_t n = std::min(line.size() - m_firstCol, static_cast<size_t>(rc.right / m_cxChar + 2));
        ::TextOutA(hdc, kMargin, y, line.data() + m_firstCol, static_cast<int>(n));
    }
    (void)textRect;
    ::SelectClipRgn(hdc, NULL);

    // The column marks, through ruler and text
    HPEN markPen = ::CreatePen(PS_SOLID, 1, enabled ? kMarkColour : ::GetSysColor(COLOR_GRAYTEXT));
    oldPen = ::SelectObject(hdc, markPen);
    for (long pos : m_marks) {
        if (pos < m_firstCol) continue;
        const int x = XOf(pos);
        if (x >= rc.right) break;
        ::MoveToEx(hdc, x, 0, NULL);
        ::LineTo(hdc, x, rc.bottom);
    }
    ::SelectObject(hdc, oldPen);
    ::DeleteObject(markPen);
    ::SelectObject(hdc, oldFont);
}

LRESULT TextFormat::Handle(UINT msg, WPARAM wp, LPARAM lp)
{
    switch (msg) {
    case WM_PAINT: {
        PAINTSTRUCT ps;
        HDC hdc = ::BeginPaint(m_hwnd, &ps);
        RECT rc;
        ::GetClientRect(m_hwnd, &rc);
        // Drawn off screen first, so that a drag does not flicker.
        HDC mem = ::CreateCompatibleDC(hdc);
        HBITMAP bmp = ::CreateCompatibleBitmap(hdc, std::max<int>(1, rc.right), std::max<int>(1, rc.bottom));
        HGDIOBJ oldBmp = ::SelectObject(mem, bmp);
        Paint(mem);
        ::BitBlt(hdc, 0, 0, rc.right, rc.bottom, mem, 0, 0, SRCCOPY);
        ::SelectObject(mem, oldBmp);
        ::DeleteObject(bmp);
        ::DeleteDC(mem);
        ::EndPaint(m_hwnd, &ps);
        return 0;
    }
    case WM_ERASEBKGND: return 1;
    case WM_SIZE: UpdateScrollBars(); return 0;
    case WM_VSCROLL: Scroll(SB_VERT, LOWORD(wp)); return 0;
    case WM_HSCROLL: Scroll(SB_HORZ, LOWORD(wp)); return 0;
    case WM_MOUSEWHEEL:
        Scroll(SB_VERT, static_cast<short>(HIWORD(wp)) > 0 ? SB_LINEUP : SB_LINEDOWN);
        return 0;
    case WM_GETDLGCODE: return DLGC_WANTARROWS;
    case WM_KEYDOWN:
        switch (wp) {
        case VK_UP: Scroll(SB_VERT, SB_LINEUP); break;
        case VK_DOWN: Scroll(SB_VERT, SB_LINEDOWN); break;
        case VK_LEFT: Scroll(SB_HORZ, SB_LINEUP); break;
        case VK_RIGHT: Scroll(SB_HORZ, SB_LINEDOWN); break;
        }
        return 0;
    case WM_LBUTTONDOWN: {
        if (!m_bEnabled) return 0;
        ::SetFocus(m_hwnd);
        const long pos = PosAt(static_cast<short>(LOWORD(lp)));
        // A press beside the marks sets one; either way the mark under the
        // mouse follows it until the button is released.
        SetMark(pos);
        if (IsMark(pos)) {
            m_dragging = pos;
            ::SetCapture(m_hwnd);
        }
        return 0;
    }
    case WM_MOUSEMOVE:
        if (m_dragging >= 0 && (wp & MK_LBUTTON)) {
            const long pos = PosAt(static_cast<short>(LOWORD(lp)));
            // A mark is not dragged over another one: two marks never merge.
            if (pos != m_dragging && pos <= CQoTextFormatCtrl::MaxMarkPosition && !IsMark(pos)) {
                m_marks.erase(m_dragging);
                m_marks.insert(pos);
                m_dragging = pos;
                Invalidate();
            }
        }
        return 0;
    case WM_LBUTTONUP:
        m_dragging = -1;
        if (::GetCapture() == m_hwnd) ::ReleaseCapture();
        return 0;
    case WM_CAPTURECHANGED: m_dragging = -1; return 0;
    case WM_LBUTTONDBLCLK:
        if (!m_bEnabled) return 0;
        RemoveMark(PosAt(static_cast<short>(LOWORD(lp))));
        return 0;
    }
    static const UINT unknownMsg = ::RegisterWindowMessageA(AFX_CONTROL_UNKNOWN_MESSAGE);
    if (msg == unknownMsg) return reinterpret_cast<LRESULT>(static_cast<IUnknown*>(this));
    return ::DefWindowProcA(m_hwnd, msg, wp, lp);
}

LRESULT CALLBACK TextFormatProc(HWND hwnd, UINT msg, WPARAM wp, LPARAM lp)
{
    if (msg == WM_NCCREATE) ::SetWindowLongPtrA(hwnd, GWLP_USERDATA, reinterpret_cast<LONG_PTR>(new TextFormat(hwnd)));
    TextFormat* p = Of(hwnd);
    if (p == NULL) return ::DefWindowProcA(hwnd, msg, wp, lp);
    if (msg == WM_NCDESTROY) {
        ::SetWindowLongPtrA(hwnd, GWLP_USERDATA, 0);
        p->Detach();
        p->Release();  // a caller that still holds the interface keeps it alive
        return ::DefWindowProcA(hwnd, msg, wp, lp);
    }
    return p->Handle(msg, wp, lp);
}

}  // namespace

bool CQoTextFormatCtrl::Register()
{
    static const bool registered = [] {
        WNDCLASSA wc = {};
        wc.style = CS_GLOBALCLASS | CS_DBLCLKS;
        wc.lpfnWndProc = TextFormatProc;
        wc.hInstance = AfxGetInstanceHandle();
        wc.hCursor = ::LoadCursor(NULL, IDC_IBEAM);
        wc.lpszClassName = ClassName;
        return ::RegisterClassA(&wc) != 0 || ::GetLastError() == ERROR_CLASS_ALREADY_EXISTS;
    }();
    return registered;
}
