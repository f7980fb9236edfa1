// CQoLog - the process log of the application family.
//
// One line per entry, each beginning with the local time of the moment the
// entry is finished ("Dec 06 2026, 07:21:03 > "). An entry is built from
// pieces and finished by streaming CQoLog::endl:
//
//     _theLog << "E:" << 2001L << " Datei fehlt" << CQoLog::endl;
//
// The host application names the file with Open and clears it with Close; the
// library itself never does. Between entries the file is closed, so that other
// programs may read, copy or delete it; the next entry opens (or recreates) it.
// The log never throws and never reports a failure: an entry that cannot be
// written is lost, later entries are not affected.
//
// The log is process-wide and unlocked: use it from one thread at a time and
// build each entry without another caller's pieces in between.
#pragma once

#include <afx.h>
#include <fstream>
#include <sstream>

#include "QoMfcExtApi.h"

class QOMFCEXT_API CQoLog
{
public:
    enum specials { endl = 0 };

    CQoLog();
    virtual ~CQoLog();

    CQoLog(const CQoLog&) = delete;
    CQoLog& operator=(const CQoLog&) = delete;

    // Names the log file; opens nothing. A later Open replaces the name, and a
    // pending entry goes to the new file when it is finished.
    void Open(const char* name);
    // Forgets the file name and discards the pending entry.
    void Close();

    CQoLog& operator<<(const char* text);
    CQoLog& operator<<(long value);
    // endl finishes and writes the pending entry; any other value does nothing.
    CQoLog& operator<<(const specials& s);

private:
    void WriteEntry();

    CString m_strFileName;       // empty: no log file, finished entries are dropped
    std::ofstream m_file;        // open only while one entry is written
    std::ostringstream m_pending;
};

// The one log of the process.
extern QOMFCEXT_API CQoLog _theLog;
