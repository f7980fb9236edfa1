// The host of an output page: its output source is a real delimited input file.
#pragma once

#include <COutputFilterConfig.h>
#include <COutputFilterSource.h>
#include <CQoInputFilterTextVar.h>

#include <string>

#include "MfcTestHost.h"

namespace qotest {

class FileSource : public COutputFilterSource {
public:
    explicit FileSource(CQoInputFilterTextVar& in) : m_in(in) {}
    void GetSourceValue(long row, int column, CString& value) override
    {
        CQoString text;
        if (m_in.AbsoluteRow(row)) m_in.Value(column, text);
        value = text.GetString();
    }
    void GetSourceName(int column, CString& name, int) override
    {
        CQoString text;
        m_in.ColName(column, text);
        name = text.GetString();
    }
    int NumSourceColumns() override { return m_in.NumCols(); }
    long NumSourceRows() override { return m_in.NumRows(); }

private:
    CQoInputFilterTextVar& m_in;
};

class OutputPageTest : public HostFrameTest {
protected:
    OutputPageTest() : HostFrameTest("Ausgabe", 720, 460) {}
    void TearDown() override
    {
        DestroyPage();
        HostFrameTest::TearDown();
    }
    // The input file the source reads; the source takes its columns anew.
    void Input(const std::string& content)
    {
        m_in.Delimiter(';');
        m_in.SetFirstRowHasNames(true);
        m_in.Init(WriteTempFile("qo_output_pages.csv", content).c_str());
        m_source.InitArray();
    }
    // The host's steps: filter and source, window, settings, columns; then shown.
    void Show(COutputFilterConfig* page, CQoOutputFilter* filter)
    {
        m_pPage = page;
        page->SetSourceAndFilter(&m_source, filter);
        ASSERT_TRUE(page->Create(m_pFrame));
        ASSERT_FALSE(page->IsWindowVisible());
        page->UpdateOutputFilter(0);
        page->RefreshDisplay();
        ShowChild(*page, 8, 8);
    }
    void DestroyPage()
    {
        if (m_pPage != NULL && ::IsWindow(m_pPage->m_hWnd)) m_pPage->DestroyWindow();
        delete m_pPage;
        m_pPage = NULL;
    }
    HWND Item(int id) const { return ::GetDlgItem(m_pPage->m_hWnd, id); }
    std::string Text(int id) const { return WindowText(Item(id)); }
    void ClickButton(int id) { ClickMiddle(Item(id)); }
    void TypeInto(int id, const std::string& text) { TypeOver(Item(id), text); }

    CQoInputFilterTextVar m_in;
    FileSource m_source{m_in};
    COutputFilterConfig* m_pPage = nullptr;
};

}  // namespace qotest
