// qoconvert - the sample conversion program of the application family.
//
//     qoconvert.exe [/batch] [project folder]
//
// The project folder (the current folder when none is given) holds the
// project's configuration file qoconvert.ini and the log qoconvert.log.
// Interactively the main dialog lets the user choose files and character sets
// and start the conversion; with /batch the project is converted without any
// window, message boxes answer with their preset and the exit code tells the
// result (0 converted, 1 failed).
#pragma once

#include <afxwin.h>

#include <CQoString.h>

class CQoConvertApp : public CWinApp
{
public:
    CQoConvertApp();

    virtual BOOL InitInstance();
    virtual int ExitInstance();

    // Converts the project and reports the result (box or log). True on success.
    bool Convert();
    // A file name of the project, relative to its folder unless absolute.
    CQoString InProject(const CQoString& file) const;

    CQoString m_projectFolder;
    CQoString m_projectFile;
    bool m_batch;

private:
    void ParseArguments();
    // Reports why the project cannot be converted: a message box, or in
    // batch mode the log and the console.
    void Refuse(int number, const char* text);
    int m_exitCode;
};

extern CQoConvertApp theApp;
