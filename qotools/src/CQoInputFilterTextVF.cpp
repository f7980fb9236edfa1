#include "CQoInputFilterTextVF.h"

#include "CQoConfigFile.h"

#include <cstring>

CQoInputFilterTextVF::CQoInputFilterTextVF()
{
    m_fileType = filterTextVF;
}

void CQoInputFilterTextVF::SetNumCols(int cols)
{
    if (cols < 0)
        cols = 0;
    if (cols != static_cast<int>(m_lengths.size()))
        m_bModified = true;
    m_lengths.resize(cols, 1);
    SetNumColsInternal(cols);
}

int CQoInputFilterTextVF::ColLen(int col) const
{
    if (col < 0 || col >= static_cast<int>(m_lengths.size()))
        return 0;
    return m_lengths[col];
}

void CQoInputFilterTextVF::ColLen(int col, int length)
{
    if (col < 0 || col >= static_cast<int>(m_lengths.size()))
        return;
    if (length < 1)
        length = 1;
    if (m_lengths[col] != length) {
        m_lengths[col] = length;
        m_bModified = true;
    }
}

int CQoInputFilterTextVF::RecordWidth() const
{
    int width = 0;
    for (int length : m_lengths)
        width += length;
    return width;
}

void CQoInputFilterTextVF::DetermineColumns()
{
    m_nNumCols = static_cast<int>(m_lengths.size());
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
    for (int length : m_lengths) {
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
    if (!m_lengths.empty() && start < lineLength) {
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
    CQoString text;
    for (std::size_t i = 0; i < m_lengths.size(); ++i) {
        text.Format("Spalte %d: %d Zeichen", static_cast<int>(i + 1), m_lengths[i]);
        AddDescription(text);
    }
    return NextDescription(line);
}

void CQoInputFilterTextVF::CopyFrom(CQoInputFilter const &other)
{
    CQoInputFilterText::CopyFrom(other);
    if (auto const *vf = dynamic_cast<CQoInputFilterTextVF const *>(&other)) {
        m_lengths = vf->m_lengths;
        SetNumColsInternal(static_cast<int>(m_lengths.size()));
    }
}

void CQoInputFilterTextVF::WriteConfig(CQoConfigFile &cfg, CQoString const &section)
{
    CQoInputFilterText::WriteConfig(cfg, section);
    cfg.SetValue(section, "columns", static_cast<int>(m_lengths.size()));
    CQoString key;
    for (std::size_t i = 0; i < m_lengths.size(); ++i) {
        key.Format("collen%d", static_cast<int>(i));
        cfg.SetValue(section, key, m_lengths[i]);
    }
}

void CQoInputFilterTextVF::ReadConfig(CQoConfigFile &cfg, CQoString const &section)
{
    CQoInputFilterText::ReadConfig(cfg, section);
    int cols = static_cast<int>(m_lengths.size());
    if (cfg.GetValue(section, "columns", cols) && cols >= 0 && cols <= 100000)
        SetNumCols(cols);
    CQoString key;
    for (int i = 0; i < static_cast<int>(m_lengths.size()); ++i) {
        key.Format("collen%d", i);
        int length = m_lengths[i];
        if (cfg.GetValue(section, key, length))
            ColLen(i, length);
    }
}
