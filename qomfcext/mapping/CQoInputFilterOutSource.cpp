#include "CQoInputFilterOutSource.h"

#include "COutputFilterSource.h"

CQoInputFilterOutSource::CQoInputFilterOutSource()
    : m_lRow(0), m_pSource(nullptr)
{
    FirstRow();
}

CQoInputFilterOutSource::CQoInputFilterOutSource(const CQoInputFilterOutSource& other)
    : CQoInputFilter(other), m_lRow(other.m_lRow), m_pSource(other.m_pSource)
{
}

CQoInputFilterOutSource& CQoInputFilterOutSource::operator=(const CQoInputFilterOutSource& other)
{
    if (this != &other) {
        CQoInputFilter::operator=(other);
        m_lRow = other.m_lRow;
        m_pSource = other.m_pSource;
    }
    return *this;
}

CQoInputFilterOutSource::~CQoInputFilterOutSource()
{
    m_pSource = nullptr;   // the source belongs to the host
}

void CQoInputFilterOutSource::SetOutputSource(COutputFilterSource* source)
{
    m_pSource = source;
    FirstRow();
}

void CQoInputFilterOutSource::ColName(int col, CQoString& name)
{
    if (!m_pSource)
        return;
    CString text;
    m_pSource->GetName(col, text, 0);
    name.Assign(text.GetString(), static_cast<std::size_t>(text.GetLength()));
}

int CQoInputFilterOutSource::NumCols()
{
    return m_pSource ? m_pSource->NumColumns() : 0;
}

long CQoInputFilterOutSource::NumRows()
{
    return m_pSource ? m_pSource->NumRows() : 0;
}

// Row 0 is the first row: the rows visited through FirstRow/NextRow are
// 0 .. NumRows()-1, the same rows an output filter writes from the source.
bool CQoInputFilterOutSource::FirstRow()
{
    if (!m_pSource) {
        m_lCurrentRow = -1;
        return false;
    }
    SetRow(0);
    if (NumRows() > 0)
        return true;
    m_lCurrentRow = -1;
    return false;
}

bool CQoInputFilterOutSource::NextRow()
{
    if (!m_pSource)
        return false;
    // Not on a row (FirstRow found none, the source has grown since): the
    // next row is the first one, not the second.
    if (m_lCurrentRow < 0)
        return FirstRow();
    if (m_lRow >= NumRows() - 1)
        return false;
    SetRow(m_lRow + 1);
    return true;
}

void CQoInputFilterOutSource::Value(int col, CQoString& value)
{
    if (!m_pSource)
        return;
    if (m_lCurrentRow < 0) {
        value.Empty();   // a source without rows is not asked for one
        return;
    }
    CString text;
    m_pSource->GetValue(m_lRow, col, text);
    value.Assign(text.GetString(), static_cast<std::size_t>(text.GetLength()));
}

void CQoInputFilterOutSource::SetRow(long row)
{
    m_lRow = row;
    m_lCurrentRow = row;   // the base's notion of the current row, for EmptyRow and friends
}
