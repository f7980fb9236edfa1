// How the file-database filters pass on errors of the DAO engine (internal):
// the engine's exception is ended here and its description goes on as a
// CQoException text, or, where a filter shows errors, as its message box.
#pragma once

#include <afxdao.h>

#include <CQoString.h>

// DAO's number of the error (0 when the exception carries none).
long QoDaoCode(CDaoException* e);
// The description of the engine's exception, which is deleted.
CQoString QoDaoTakeMessage(CDaoException* e);
// The description, the exception kept.
CQoString QoDaoMessage(CDaoException* e);
// Puts `prefix` before the description, so that what is shown or raised
// says where the error happened.
void QoDaoPrefix(CDaoException* e, const CQoString& prefix);
[[noreturn]] void QoDaoRaise(CDaoException* e);
// With `show`: the exception's message box, false; otherwise raised.
bool QoDaoShowOrRaise(CDaoException* e, bool show);
