#include "QoDaoError.h"

#include <CQoException.h>

long QoDaoCode(CDaoException* e)
{
    return e && e->m_pErrorInfo ? e->m_pErrorInfo->m_lErrorCode : 0;
}

CQoString QoDaoMessage(CDaoException* e)
{
    CQoString text;
    if (e->m_pErrorInfo)
        text = (const char*)e->m_pErrorInfo->m_strDescription;
    if (text.IsEmpty()) {
        char buffer[512] = "";
        e->GetErrorMessage(buffer, sizeof buffer);
        text = buffer;
    }
    if (text.IsEmpty())
        text = "DAO-Fehler";
    return text;
}

CQoString QoDaoTakeMessage(CDaoException* e)
{
    CQoString text = QoDaoMessage(e);
    e->Delete();
    return text;
}

void QoDaoPrefix(CDaoException* e, const CQoString& prefix)
{
    CQoString text = QoDaoMessage(e);
    if (!e->m_pErrorInfo) {
        e->m_pErrorInfo = new CDaoErrorInfo;
        e->m_pErrorInfo->m_lErrorCode = 0;
        e->m_pErrorInfo->m_lHelpContext = 0;
    }
    e->m_pErrorInfo->m_strDescription = (prefix + text).GetString();
}

void QoDaoRaise(CDaoException* e)
{
    CQoString text = QoDaoTakeMessage(e);
    CQoException::Throw(text, nullptr);
}

bool QoDaoShowOrRaise(CDaoException* e, bool show)
{
    if (!show)
        QoDaoRaise(e);
    e->ReportError();
    e->Delete();
    return false;
}
