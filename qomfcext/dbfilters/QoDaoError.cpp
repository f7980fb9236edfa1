#include "QoDaoError.h"

#include <CQoException.h>

long QoDaoCode(CDaoException* e)
{
    return e && e->m_pErrorInfo ? e->m_pErrorInfo->m_lErrorCode : 0;
}

CQoString QoDaoTakeMessage(CDaoException* e)
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
    e->Delete();
    return text;
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
