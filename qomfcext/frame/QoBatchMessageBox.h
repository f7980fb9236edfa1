// Message boxes that stay silent in batch mode.
//
// An application of the family runs either interactively or unattended. In
// batch mode QoBatchMessageBox shows nothing and returns the preset answer at
// once; in either mode it leaves one line in _theLog with the message's
// number, its text (line breaks flattened) and the answer:
//
//     "E:2001 Datei fehlt, Return: yes"      (numbers 2000-2999: E:, 1000-1999: H:)
//     " Fertig, Autoreturn: ok"             (batch mode, other numbers: no prefix)
#pragma once

#include <afxwin.h>

#include "QoMfcExtApi.h"

// Shows (or, in batch mode, skips) a message box with the text; type and
// helpId are those of AfxMessageBox. Returns the answer.
QOMFCEXT_API int QoBatchMessageBox(int number, UINT autoAnswer, const char* text,
                                   UINT type = MB_OK, UINT helpId = 0);
// The same with the text loaded from the string table by id.
QOMFCEXT_API int QoBatchMessageBox(int number, UINT autoAnswer, UINT textId,
                                   UINT type = MB_OK, UINT helpId = 0);
// Switches batch mode on or off; it is off when the library is loaded.
QOMFCEXT_API void QoBatchMessageBoxSetMode(bool batch);
// Whether batch mode is on: nothing may then wait for a user (the library's
// own prompts answer as a cancel does).
QOMFCEXT_API bool QoBatchMessageBoxGetMode();
