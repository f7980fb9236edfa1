#include "CQoInputFilterTextVF.h"

#include "CQoConfigFile.h"

#include <cstring>

CQoInputFilterTextVF::CQoInputFilterTextVF()
{
    m_fileType = filterTextVF;
}

void CQoInputFilterTextVF::SetNumCols(int cols)
{
    if (m_widths.SetCount(cols))
        m_bModified = true;
    SetNumColsInternal(m_widths.Count());
}

int CQoInputFilterTextVF::ColLen(int col) const
{
    return m_widths.Get(col);
}

void CQoInputFilterTextVF::ColLen(int col, int length)
{
    if (m_widths.Set(col, length))
        m_bModified = true;
}

int CQoInputFilterTextVF::RecordWidth() const
{
    return m_widths.Total();
}

void CQoInputFilterTextVF::DetermineColumns()
{
    m_nNumCols = m_widths.Count();
}

int CQoInputFilterTextVF::ParseRecord(char const *begin, char const *end, bool eof, std::size_t &used)
{
    if (begin == end)
        return eof ? parseEnd : parseMore;
    std::size_t avail = static_cast<std::size_t>(end - begin);
    char const *nl = static_cast<char const *>(std::memchr(begin, '\n', avail));
    char const *cr = static_cast<char const *>(std::memchr(begin, '\r', nl ? nl - begin : avail));
    char const *lineEnd = cr ? cr : nl;
    if (!lineEnd) {
        if (!eof)
            return parseMore;
        lineEnd = end;
        used = avail;
    } else if (*lineEnd == '\r') {
        if (lineEnd + 1 == end && !eof)
            return parseMore;
        used = static_cast<std::size_t>(lineEnd - begin) + (lineEnd + 1 < end && lineEnd[1] == '\n' ? 2 : 1);
    } else {
        used = static_cast<std::size_t>(lineEnd - begin) + 1;
    }
    std::size_t lineLength = static_cast<std::size_t>(lineEnd - begin);
    std::size_t start = 0;
    for (int length : m_widths.Widths()) {
        std::size_t from = start < lineLength ? start : lineLength;
        std::size_t to = start + static_cast<std::size_t>(length);
        if (to > lineLength)
            to = lineLength;
        while (to > from && begin[to - 1] == ' ')
            --to;
        AddField(begin + from, to - from);
        start += static_cast<std::size_t>(length);
    }
    m_beyond = 0;
    if (m_widths.Count() > 0 && start < lineLength) {
        std::size_t to = lineLength;
        while (to > start && begin[to - 1] == ' ')
            --to;
        m_beyond = to - start;
    }
    return parseRecord;
}

CQoString CQoInputFilterTextVF::CheckRecord()
{
    if (m_beyond == 0)
        return CQoString();
    CQoString why;
    why.Format("%d Zeichen nach der letzten Spalte", static_cast<int>(m_beyond));
    return why;
}

bool CQoInputFilterTextVF::StartDescription(CQoString &line)
{
    BeginDescription();
    for (int i = 0; i < m_widths.Count(); ++i)
        AddDescription(m_widths.Description(i));
    return NextDescription(line);
}

void CQoInputFilterTextVF::CopyFrom(CQoInputFilter const &other)
{
    CQoInputFilterText::CopyFrom(other);
    if (auto const *vf = dynamic_cast<CQoInputFilterTextVF const *>(&other)) {
        m_widths = vf->m_widths;
        SetNumColsInternal(m_widths.Count());
    }
}

void CQoInputFilterTextVF::WriteConfig(CQoConfigFile &cfg, CQoString const &section)
{
    CQoInputFilterText::WriteConfig(cfg, section);
    m_widths.WriteConfig(cfg, section);
}

void CQoInputFilterTextVF::ReadConfig(CQoConfigFile &cfg, CQoString const &section)
{
    CQoInputFilterText::ReadConfig(cfg, section);
    if (m_widths.ReadConfig(cfg, section))
        m_bModified = true;
    SetNumColsInternal(m_widths.Count());
}
