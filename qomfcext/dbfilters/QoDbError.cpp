#include "QoDbError.h"

#include <CQoException.h>

CQoString QoDbTakeMessage(CDBException* e)
{
    CQoString text = (const char*)e->m_strError;
    text.TrimNewline();
    if (text.IsEmpty())
        text = "ODBC-Fehler";
    e->Delete();
    return text;
}

void QoDbRaise(CDBException* e)
{
    CQoString text = QoDbTakeMessage(e);
    CQoException::Throw(text, nullptr);
}

bool QoDbShowOrRaise(CDBException* e, bool show)
{
    if (!show)
        QoDbRaise(e);
    e->ReportError();
    e->Delete();
    return false;
}
