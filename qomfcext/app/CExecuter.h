// CExecuter - runs one conversion job on a thread of its own and tells a
// thread of the application when it is over.
//
// A job is either a program, started as a process with a new console and
// waited for (process mode), or a conversion module: a DLL loaded into this
// process whose exported entry `int QoMain(int argc, char** argv)` is called
// with the arguments (library mode). Argument 0 is the program or the module.
// Before a module is loaded its folder is put in front of the process's PATH,
// so that the libraries it loads are found there; PATH is not put back.
//
//     CExecuter* pJob = new CExecuter(false, AfxGetApp(), WM_JOB_DONE, 7);
//     pJob->SetArguments(args);   // module path first
//     pJob->CreateThread();       // the object deletes itself afterwards
//
// The target thread then receives WM_JOB_DONE as a thread message with the
// result in wParam and the user value (7) in lParam. The result is what
// QoMain returned, or one of these codes of the executer:
//   -1  the module could not be loaded (also: library mode without arguments)
//   -2  the module has no entry "QoMain"; in process mode: no arguments, or
//       the process could not be started
//   -3  the process was started but waiting for it failed
//   -4  QoMain ended with an exception instead of returning (logged)
// A process that was started and has ended reports 0; its exit code is not
// asked for. Without a target thread nothing is run and nothing is posted.
#pragma once

#include <afxwin.h>

#include "CQoArray.h"
#include "CQoString.h"
#include "QoMfcExtApi.h"

class QOMFCEXT_API CExecuter : public CWinThread
{
    DECLARE_DYNCREATE(CExecuter)

public:
    // The codes that the executer reports in wParam besides QoMain's result.
    enum {
        errModuleNotLoaded = -1,
        errNoEntryOrNoProcess = -2,
        errWaitFailed = -3,
        errEntryException = -4
    };

    CExecuter(bool bProcess, CWinThread* pTargetThread, UINT nCompletionMsg, long lUserValue);

    // Replaces the argument list by a copy of `args`; before CreateThread only.
    bool SetArguments(CQoArray<CQoString, CQoString&>& args);

protected:
    // Run-time creation: a process-mode job without a target, which does nothing.
    CExecuter();
    virtual ~CExecuter();

    CExecuter(const CExecuter&) = delete;
    CExecuter& operator=(const CExecuter&) = delete;

    // Runs the whole job; FALSE in every case, so the thread ends without a loop.
    BOOL InitInstance() override;
    // Posts the completion message.
    int ExitInstance() override;

    DECLARE_MESSAGE_MAP()

private:
    void RunProcess();
    void RunModule();

    bool m_bProcess;
    long m_lUserValue;
    CQoArray<CQoString, CQoString&> m_arrArgs;
    CWinThread* m_pTargetThread;   // not owned
    int m_nLaunchResult;
    int m_nEntryResult;
    UINT m_nCompletionMsg;
};
