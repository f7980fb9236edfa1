#include "QoBatchMessageBox.h"

#include <CQoString.h>

#include "CQoLog.h"

namespace {

bool g_batchMode = false;

const char* AnswerName(int answer)
{
    switch (answer) {
    case IDOK:     return "ok";
    case IDCANCEL: return "cancel";
    case IDABORT:  return "abort";
    case IDRETRY:  return "retry";
    case IDIGNORE: return "ignore";
    case IDYES:    return "yes";
    case IDNO:     return "no";
    default:       return "unknown";
    }
}

} // namespace

void QoBatchMessageBoxSetMode(bool batch)
{
    g_batchMode = batch;
}

bool QoBatchMessageBoxGetMode()
{
    return g_batchMode;
}

int QoBatchMessageBox(int number, UINT autoAnswer, const char* text, UINT type, UINT helpId)
{
    if (!text)
        text = "";

    if (number >= 1000 && number <= 1999)
        _theLog << "H:" << (long)number;
    else if (number >= 2000 && number <= 2999)
        _theLog << "E:" << (long)number;

    // The log keeps each entry on one line.
    CQoString flat(text);
    flat.Replace("\r", "");
    flat.Replace("\n", " ");
    _theLog << " " << (const char*)flat;

    int answer;
    if (g_batchMode) {
        _theLog << ", Autoreturn: ";
        answer = (int)autoAnswer;
    } else {
        _theLog << ", Return: ";
        answer = AfxMessageBox(text, type, helpId);
    }
    _theLog << AnswerName(answer) << CQoLog::endl;
    return answer;
}

int QoBatchMessageBox(int number, UINT autoAnswer, UINT textId, UINT type, UINT helpId)
{
    // Loaded in batch mode too: the log needs the text.
    CString text;
    if (!text.LoadString(textId))
        text.Empty();
    return QoBatchMessageBox(number, autoAnswer, (const char*)text, type, helpId);
}
