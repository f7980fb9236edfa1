// CMainDlg - the sample program's main window. The user picks the input file
// and configures how it is read on the delimited-text page with its live
// preview, picks the output file and its format (delimited or fixed-length
// text) and configures it on its output page, whose preview shows the records
// as they will be written, and converts. "Spalten..." opens the output
// columns: composed of the input's columns (combinations such as street and
// town in one column), chosen and ordered. The project keeps the filters'
// settings, so that the same project converts from the command line.
// A file database (Access-type, .mdb, .xlsx) and its table may be named
// instead of a file; a project's ODBC settings are kept and used, though not
// shown.
#pragma once

#include <afxwin.h>

#include <CModifiedListener.h>
#include <CQoInputFilterTextVar.h>
#include <CQoOutputFilter.h>

#include <algorithm>
#include <memory>

#include "CConversion.h"
#include "CInputRecords.h"
#include "resource.h"

class CInputFilterConfigTextVar;
class COutputFilterConfig;

class CMainDlg : public CDialog, public CModifiedListener
{
public:
    enum { IDD = IDD_MAIN };
    // The notifier ids of the two pages.
    enum { idInputPage = 1, idOutputPage = 2 };

    CMainDlg(CWnd* pParent = NULL);
    ~CMainDlg() override;

    // A page changed its filter: the output side follows the input's settings.
    int ModifiedListenerSetModified(int bModified, int nNotifierId) override;
    // The conversion started by "Konvertieren" is over (the module's result code).
    void ConversionDone(int code);
    bool IsConverting() const { return m_hCancel != NULL; }

protected:
    virtual BOOL OnInitDialog();
    virtual void DoDataExchange(CDataExchange* pDX);
    virtual void OnOK();
    afx_msg void OnConvert();
    afx_msg void OnBrowseInput();
    afx_msg void OnBrowseOutput();
    afx_msg void OnInputFileChanged();
    afx_msg void OnFormatChanged();
    afx_msg void OnColumns();
    afx_msg void OnDestroy();
    afx_msg void OnAbort();
    virtual void OnCancel();
    afx_msg LRESULT OnRunStart(WPARAM wParam, LPARAM lParam);
    afx_msg LRESULT OnRunProgress(WPARAM wParam, LPARAM lParam);
    DECLARE_MESSAGE_MAP()

private:
    // Opens the input file with the page's settings and shows it; a file
    // that cannot be read is named in the status line.
    void OpenInput();
    // The output side reads its own copy of the input filter.
    void FollowInput();
    void MakeOutputPage();
    // Places the pages below their file rows and fits the window around them.
    void Arrange();
    bool Browse(CString& file, bool open);
    void Status(const CString& text);
    // While a conversion runs only "Abbrechen" takes input.
    void EnableForRun(bool running);

    HANDLE m_hCancel;            // the running conversion's cancel event, else NULL
    long long m_llInputSize;     // of the running conversion's input; -1 unknown
    bool m_bCloseWhenDone;

    CConversion m_job;
    CString m_project;
    CString m_inputFile;
    CString m_outputFile;
    int m_outputFormat;
    CString m_inputDatabase;
    CString m_inputTable;
    CString m_outputDatabase;
    CString m_outputTable;

    CQoInputFilterTextVar m_input;        // configured on the input page
    CQoInputFilterTextVar m_outputRows;   // the same records for the output side
    CInputRecords m_records;
    std::unique_ptr<CQoOutputFilter> m_output;
    std::unique_ptr<CInputFilterConfigTextVar> m_inputPage;
    std::unique_ptr<COutputFilterConfig> m_outputPage;
};
