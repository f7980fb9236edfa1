#include "CQoException.h"

#include <cstdio>

namespace {

// German texts in Windows-1252 (octal escapes keep the source file plain ASCII).
struct CodeEntry {
    int code;
    char const *text;
};

CodeEntry const kCodeTexts[] = {
    {CQoException::textError, "Unbekannter Fehler"},
    {CQoException::fileNotFound, "Datei nicht gefunden"},
    {CQoException::cannotOpen, "Datei kann nicht ge\366ffnet werden"},
    {CQoException::readError, "Fehler beim Lesen der Datei"},
    {CQoException::writeError, "Fehler beim Schreiben der Datei"},
    {CQoException::formatError, "Das Format der Daten ist ung\374ltig"},
    {CQoException::notOpen, "Die Datei ist nicht ge\366ffnet"},
    {CQoException::outOfMemory, "Nicht gen\374gend Speicher"},
    {CQoException::invalidArgument, "Ung\374ltiger Parameter"},
    {CQoException::seekError, "Fehler beim Positionieren in der Datei"},
    {CQoException::replaceError, "Die Datei kann nicht ersetzt werden"},
    {CQoException::indexError, "Index au\337erhalb des g\374ltigen Bereichs"},
};

} // namespace

CQoException::CQoException(int code, char const *text, char const *where)
    : m_code(code), m_text(text ? text : ""), m_where(where ? where : "")
{
    m_message = m_text;
    if (!m_where.empty()) {
        m_message += " (";
        m_message += m_where;
        m_message += ')';
    }
}

char const *CQoException::CodeText(int code)
{
    for (CodeEntry const &entry : kCodeTexts)
        if (entry.code == code)
            return entry.text;
    return nullptr;
}

void CQoException::Throw(int code, char const *where)
{
    char const *text = CodeText(code);
    if (text)
        throw CQoException(code, text, where);
    char buffer[32];
    std::snprintf(buffer, sizeof buffer, "Fehler %d", code);
    throw CQoException(code, buffer, where);
}

void CQoException::Throw(char const *text, char const *where)
{
    throw CQoException(textError, text, where);
}
