// CQoErrorDlg - the modal error dialog of the application family.
//
// Applications register the text of each of their error numbers once
// (AddMessage); ShowError then shows "Es ist der Fehler <n> aufgetreten." with
// the registered text and an additional information text, and writes two log
// lines beginning "ERR: ". The dialog is shown in batch mode too.
//
//     CQoErrorDlg::AddMessage(2107, "Die Eingabedatei fehlt.");
//     CQoErrorDlg::ShowError(2107, "Datei: C:\\daten\\kunden.txt");
#pragma once

#include <afxwin.h>
#include <map>

#include "QoMfcExtApi.h"

class QOMFCEXT_API CQoErrorDlg : public CDialog
{
public:
    enum { IDD = 4037 };

    CQoErrorDlg(CWnd* pParent = NULL);
    virtual ~CQoErrorDlg();

    // Registers the text for the number, replacing an earlier one.
    static void AddMessage(int code, const CString& text);
    // Makes the number's text empty.
    static void ClearMessage(int code);
    // Removes every registration, the library's own included.
    static void ClearAllMessages();

    // Shows the dialog modally for the error number and logs it.
    static void ShowError(int code, const char* info);
    // The same with the information text loaded from the string table.
    static void ShowError(int code, UINT infoId);

    CString m_strInfo;     // additional information, edit 4131
    CString m_strMessage;  // "Es ist der Fehler ...", static 4130

protected:
    virtual void DoDataExchange(CDataExchange* pDX);

    DECLARE_MESSAGE_MAP()

private:
    static std::map<int, CString> m_mapMessages;
};
