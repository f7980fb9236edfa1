// The delimited record parser. The common case (plain fields, enclosed fields
// without doubled enclosers or escapes) is cut without copying; everything
// else goes through the full state machine into the scratch text.
#include "CQoInputFilterTextVar.h"

#include "CQoConfigFile.h"
#include "CQoException.h"

#include <cstring>

namespace {
enum fieldEnd { endDelimiter, endRecord, endEof, endMore, endOpen };

inline bool IsLineEnd(unsigned char c)
{
    return c == '\r' || c == '\n';
}
}

CQoInputFilterTextVar::CQoInputFilterTextVar()
{
    m_fileType = filterTextVar;
    BuildTables();
}

void CQoInputFilterTextVar::BuildTables()
{
    std::memset(m_stopPlain, 0, sizeof m_stopPlain);
    std::memset(m_stopQuoted, 0, sizeof m_stopQuoted);
    m_stopPlain[static_cast<unsigned char>(m_cDelimiter)] = true;
    m_stopPlain[static_cast<unsigned char>('\r')] = true;
    m_stopPlain[static_cast<unsigned char>('\n')] = true;
    if (m_cEscape) {
        m_stopPlain[static_cast<unsigned char>(m_cEscape)] = true;
        m_stopQuoted[static_cast<unsigned char>(m_cEscape)] = true;
    }
    if (m_cEncloser)
        m_stopQuoted[static_cast<unsigned char>(m_cEncloser)] = true;
}

void CQoInputFilterTextVar::Delimiter(char delimiter)
{
    if (delimiter == 0 || delimiter == '\r' || delimiter == '\n')
        CQoException::Throw(CQoException::invalidArgument, "Trennzeichen");
    if (delimiter != m_cDelimiter) {
        m_cDelimiter = delimiter;
        m_bModified = true;
        BuildTables();
    }
}

void CQoInputFilterTextVar::Encloser(char encloser)
{
    if (encloser == '\r' || encloser == '\n')
        encloser = 0;
    if (encloser != m_cEncloser) {
        m_cEncloser = encloser;
        m_bModified = true;
        BuildTables();
    }
}

void CQoInputFilterTextVar::Escape(char escape)
{
    if (escape == '\r' || escape == '\n')
        escape = 0;
    if (escape != m_cEscape) {
        m_cEscape = escape;
        m_bModified = true;
        BuildTables();
    }
}

// The full state machine for one field, from its first character (the opening
// encloser when `quoted`); the field goes into the scratch text.
int CQoInputFilterTextVar::SlowField(char const *&p, char const *end, bool eof, bool quoted)
{
    enum { plain, escaped, inQuotes, escapedInQuotes, quoteInQuotes } state = plain;
    unsigned char const delimiter = static_cast<unsigned char>(m_cDelimiter);
    int const encloser = m_cEncloser ? static_cast<unsigned char>(m_cEncloser) : -1;
    int const escape = m_cEscape && m_cEscape != m_cEncloser ? static_cast<unsigned char>(m_cEscape) : -1;
    BeginScratchField();
    if (quoted) {
        state = inQuotes;
        ++p;
    }
    for (; p < end; ++p) {
        unsigned char c = static_cast<unsigned char>(*p);
        switch (state) {
        case plain:
            if (c == delimiter) {
                EndScratchField();
                ++p;
                return endDelimiter;
            }
            if (IsLineEnd(c)) {
                EndScratchField();
                return endRecord;
            }
            if (c == escape)
                state = escaped;
            else
                AppendScratch(static_cast<char>(c));
            break;
        case escaped:
            AppendScratch(static_cast<char>(c));
            state = plain;
            break;
        case inQuotes:
            if (c == escape)
                state = escapedInQuotes;
            else if (c == encloser)
                state = quoteInQuotes;
            else
                AppendScratch(static_cast<char>(c));
            break;
        case escapedInQuotes:
            AppendScratch(static_cast<char>(c));
            state = inQuotes;
            break;
        case quoteInQuotes:
            if (c == encloser) {
                AppendScratch(static_cast<char>(c));
                state = inQuotes;
            } else if (c == delimiter) {
                EndScratchField();
                ++p;
                return endDelimiter;
            } else if (IsLineEnd(c)) {
                EndScratchField();
                return endRecord;
            } else {
                AppendScratch(static_cast<char>(c));
                state = plain;
            }
            break;
        }
    }
    if (!eof)
        return endMore;
    if (state == inQuotes || state == escapedInQuotes)
        return endOpen;
    EndScratchField();
    return endEof;
}

int CQoInputFilterTextVar::ParseRecord(char const *begin, char const *end, bool eof, std::size_t &used)
{
    char const *p = begin;
    if (p == end)
        return eof ? parseEnd : parseMore;
    int const encloser = m_cEncloser ? static_cast<unsigned char>(m_cEncloser) : -1;
    char const delimiter = m_cDelimiter;
    // An empty line is a row without fields.
    if (!IsLineEnd(static_cast<unsigned char>(*p))) {
        for (;;) {
            if (p == end) {
                if (!eof)
                    return parseMore;
                AddField(p, 0); // after a delimiter at the end of the file
                used = static_cast<std::size_t>(p - begin);
                return parseRecord;
            }
            char const *start = p;
            int result;
            if (static_cast<unsigned char>(*p) == encloser) {
                char const *content = ++p;
                while (p < end && !m_stopQuoted[static_cast<unsigned char>(*p)])
                    ++p;
                if (p + 1 < end && static_cast<unsigned char>(*p) == encloser &&
                    (p[1] == delimiter || IsLineEnd(static_cast<unsigned char>(p[1])))) {
                    AddField(content, static_cast<std::size_t>(p - content));
                    ++p;
                    result = *p == delimiter ? (++p, endDelimiter) : endRecord;
                } else if (p + 1 == end && eof && static_cast<unsigned char>(*p) == encloser) {
                    AddField(content, static_cast<std::size_t>(p - content));
                    ++p;
                    result = endEof;
                } else {
                    p = start;
                    result = SlowField(p, end, eof, true);
                }
            } else {
                while (p < end && !m_stopPlain[static_cast<unsigned char>(*p)])
                    ++p;
                if (p == end) {
                    if (!eof)
                        return parseMore;
                    AddField(start, static_cast<std::size_t>(p - start));
                    result = endEof;
                } else if (*p == delimiter) {
                    AddField(start, static_cast<std::size_t>(p - start));
                    ++p;
                    result = endDelimiter;
                } else if (IsLineEnd(static_cast<unsigned char>(*p))) {
                    AddField(start, static_cast<std::size_t>(p - start));
                    result = endRecord;
                } else {
                    p = start;
                    result = SlowField(p, end, eof, false);
                }
            }
            if (result == endDelimiter)
                continue;
            if (result == endMore)
                return parseMore;
            if (result == endOpen)
                return parseUnterminated;
            if (result == endEof) {
                used = static_cast<std::size_t>(p - begin);
                return parseRecord;
            }
            break; // endRecord: p stands on the line end
        }
    }
    // The line end: CR LF, LF or CR.
    if (*p == '\r') {
        if (p + 1 == end && !eof)
            return parseMore;
        ++p;
        if (p < end && *p == '\n')
            ++p;
    } else {
        ++p;
    }
    used = static_cast<std::size_t>(p - begin);
    return parseRecord;
}

CQoString CQoInputFilterTextVar::CheckRecord()
{
    if (NumFields() <= m_nNumCols)
        return CQoString();
    CQoString why;
    why.Format("%d Felder statt %d", NumFields(), m_nNumCols);
    return why;
}

static CQoString CharText(char c)
{
    if (c == 0)
        return "keines";
    if (c == '\t')
        return "[TAB]";
    return CQoString(c);
}

bool CQoInputFilterTextVar::StartDescription(CQoString &line)
{
    BeginDescription();
    AddDescription("Trennzeichen: " + CharText(m_cDelimiter));
    AddDescription("Begrenzer: " + CharText(m_cEncloser));
    AddDescription("Escape: " + CharText(m_cEscape));
    CQoString skip;
    skip.Format("\xDC" "berlesen: %d", m_nSkip);
    AddDescription(skip);
    return NextDescription(line);
}

void CQoInputFilterTextVar::CopyFrom(CQoInputFilter const &other)
{
    CQoInputFilterText::CopyFrom(other);
    if (auto const *var = dynamic_cast<CQoInputFilterTextVar const *>(&other)) {
        m_cDelimiter = var->m_cDelimiter;
        m_cEncloser = var->m_cEncloser;
        m_cEscape = var->m_cEscape;
        BuildTables();
    }
}

// The characters are stored as their codes, so that a blank, a tab or a
// semicolon survive any editor.
void CQoInputFilterTextVar::WriteConfig(CQoConfigFile &cfg, CQoString const &section)
{
    CQoInputFilterText::WriteConfig(cfg, section);
    cfg.SetValue(section, "delimiter", static_cast<int>(static_cast<unsigned char>(m_cDelimiter)));
    cfg.SetValue(section, "encloser", static_cast<int>(static_cast<unsigned char>(m_cEncloser)));
    cfg.SetValue(section, "escape", static_cast<int>(static_cast<unsigned char>(m_cEscape)));
}

void CQoInputFilterTextVar::ReadConfig(CQoConfigFile &cfg, CQoString const &section)
{
    CQoInputFilterText::ReadConfig(cfg, section);
    int value = 0;
    if (cfg.GetValue(section, "delimiter", value) && value > 0 && value < 256 && value != '\r' &&
        value != '\n')
        Delimiter(static_cast<char>(value));
    if (cfg.GetValue(section, "encloser", value) && value >= 0 && value < 256)
        Encloser(static_cast<char>(value));
    if (cfg.GetValue(section, "escape", value) && value >= 0 && value < 256)
        Escape(static_cast<char>(value));
}
