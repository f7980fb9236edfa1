#include "CQoLog.h"

#include <ctime>

QOMFCEXT_API CQoLog _theLog;

CQoLog::CQoLog() {}

CQoLog::~CQoLog() {}

void CQoLog::Open(const char* name)
{
    m_strFileName = name ? name : "";
}

void CQoLog::Close()
{
    m_strFileName.Empty();
    m_pending.str(std::string());
    m_pending.clear();
}

CQoLog& CQoLog::operator<<(const char* text)
{
    if (text)
        m_pending << text;
    return *this;
}

CQoLog& CQoLog::operator<<(long value)
{
    m_pending << value;
    return *this;
}

CQoLog& CQoLog::operator<<(const specials& s)
{
    if (s == endl)
        WriteEntry();
    return *this;
}

void CQoLog::WriteEntry()
{
    // The time is that of the moment the entry is finished.
    char prefix[128] = "";
    __time64_t now = _time64(nullptr);
    struct tm local;
    if (now == -1 || _localtime64_s(&local, &now) != 0
        || strftime(prefix, sizeof prefix, "%b %d %Y, %H:%M:%S > ", &local) == 0)
        prefix[0] = '\0';

    if (!m_strFileName.IsEmpty()) {
        // Text mode: the line ends with carriage return and line feed. The file is
        // opened for this one entry only, so a deleted log is simply recreated.
        try {
            m_file.clear();
            m_file.open((const char*)m_strFileName, std::ios::out | std::ios::app);
            if (m_file.is_open()) {
                m_file << prefix << m_pending.str() << '\n';
                m_file.flush();
                m_file.close();
            }
        } catch (...) {
            // A log entry that cannot be written is lost; the log never throws.
        }
        m_file.clear();
    }
    m_pending.str(std::string());
    m_pending.clear();
}
