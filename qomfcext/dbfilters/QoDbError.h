// How the database filters pass on errors of the platform's ODBC classes
// (internal): the platform exception is ended here and its message goes on as
// a CQoException text, or, where a filter shows errors instead, as the
// exception's own message box.
#pragma once

#include <afxdb.h>

#include <CQoString.h>

// The message of a platform database exception, which is deleted.
CQoString QoDbTakeMessage(CDBException* e);

// Ends the exception and raises its message as CQoException.
[[noreturn]] void QoDbRaise(CDBException* e);

// The output filters' rule: with `show` set the exception's message box is
// shown and false is answered; otherwise the message is raised.
bool QoDbShowOrRaise(CDBException* e, bool show);
