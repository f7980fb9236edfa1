// CMainDlg - the sample program's main window. The user picks what is read
// (delimited or fixed-length text, fixed-column lines, a dBase file, a file
// database - Access-type, .mdb, .xlsx - or an ODBC source) and configures it
// on the library's page for its filter, with a live preview; picks what is
// written (delimited or fixed-length text, a dBase file, a table of a file
// database or an ODBC source) and configures it on its output page, whose
// preview shows the records as they will be written; and converts.
// "Spalten..." opens the output columns: composed of the input's columns
// (combinations such as street and town in one column), chosen and ordered.
// The project (a folder, chosen with "...") keeps the filters' settings, so
// that the same project converts from the command line.
#pragma once

#include <afxwin.h>

#include <CModifiedListener.h>
#include <CQoInputFilter.h>
#include <CQoOutputFilter.h>

#include <algorithm>
#include <memory>

#include "../conversion/CConversion.h"
#include "../columns/CInputRecords.h"
#include "resource.h"

class CInputFilterConfig;
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

protected:
    virtual BOOL OnInitDialog();
    virtual void DoDataExchange(CDataExchange* pDX);
    virtual void OnOK();
    afx_msg void OnConvert();
    afx_msg void OnBrowseInput();
    afx_msg void OnBrowseOutput();
    afx_msg void OnBrowseProject();
    afx_msg void OnInputPlaceChanged();
    afx_msg void OnInputKindChanged();
    afx_msg void OnOutputFileChanged();
    afx_msg void OnFormatChanged();
    afx_msg void OnColumns();
    afx_msg void OnDestroy();
    afx_msg void OnAbort();
    virtual void OnCancel();
    afx_msg LRESULT OnRunStart(WPARAM wParam, LPARAM lParam);
    afx_msg LRESULT OnRunProgress(WPARAM wParam, LPARAM lParam);
    DECLARE_MESSAGE_MAP()

private:
    // Reads the project of the program's folder into the job and shows it;
    // a folder without a project keeps what is shown.
    void LoadProject();
    void ShowJob();
    // A new input filter of the job's kind on its file or source, with its
    // page; what cannot be read is named in the status line.
    void MakeInputPage();
    // The output side reads its own filter of the same kind and settings.
    void FollowInput();
    void MakeOutputPage();
    // Takes what the input page shows into the job, as its own apply would.
    void ApplyInputPage();
    // The window's fields into the job.
    void TakeInputChoice();
    void TakeOutputChoice();
    // The labels and fields that the kinds of input and output need.
    void ShowKinds();
    // Places the pages below their file rows and fits the window around them.
    void Arrange();
    bool Browse(CString& file, bool open, int kind, bool output);
    void Status(const CString& text);
    // While a conversion runs only "Abbrechen" takes input.
    void EnableForRun(bool running);

    HANDLE m_hCancel;            // the running conversion's cancel event, else NULL
    long long m_llInputSize;     // of the running conversion's input; -1 unknown
    bool m_bCloseWhenDone;

    CConversion m_job;
    CString m_project;
    int m_inputKind;
    CString m_inputFile;     // a file, a database file or a connect string
    CString m_inputTable;    // of an ODBC source: a table or a SELECT
    int m_outputKind;
    CString m_outputFile;    // a file, a database file or a connect string
    bool m_bRebuilding;      // the pages' notifications are not followed

    std::unique_ptr<CQoInputFilter> m_input;        // configured on the input page
    std::unique_ptr<CQoInputFilter> m_outputRows;   // the same records for the output side
    CInputRecords m_records;
    std::unique_ptr<CQoOutputFilter> m_output;
    std::unique_ptr<CInputFilterConfig> m_inputPage;
    std::unique_ptr<COutputFilterConfig> m_outputPage;
};
