#include "CQoOutputSourceInputFilter.h"

#include "CQoOutputSource.h"

CQoOutputSourceInputFilter::CQoOutputSourceInputFilter(CQoOutputSource *source)
    : m_pSource(source)
{
}

CQoOutputSourceInputFilter::~CQoOutputSourceInputFilter()
{
    m_pSource = nullptr;
}

void CQoOutputSourceInputFilter::SetOutputSource(CQoOutputSource *source)
{
    m_pSource = source;
    m_lCurrentRow = -1;
}

char const *CQoOutputSourceInputFilter::FileName() const
{
    return "";
}

void CQoOutputSourceInputFilter::ColName(int col, CQoString &name)
{
    name.Empty();
    if (m_pSource && col >= 0 && col < NumCols())
        m_pSource->GetColumnName(col, name);
}

int CQoOutputSourceInputFilter::NumCols()
{
    return m_pSource ? m_pSource->GetNumColumns() : 0;
}

long CQoOutputSourceInputFilter::NumRows()
{
    return CalculateRecordCount();
}

long CQoOutputSourceInputFilter::CalculateRecordCount()
{
    return m_pSource ? m_pSource->GetNumRows() : 0;
}

bool CQoOutputSourceInputFilter::FirstRow()
{
    return AbsoluteRow(0);
}

bool CQoOutputSourceInputFilter::NextRow()
{
    if (m_lCurrentRow < 0)
        return false;
    return AbsoluteRow(m_lCurrentRow + 1);
}

bool CQoOutputSourceInputFilter::AbsoluteRow(long row)
{
    if (!m_pSource || row < 0 || row >= m_pSource->GetNumRows())
        return false;
    m_lCurrentRow = row;
    return true;
}

void CQoOutputSourceInputFilter::Value(int col, CQoString &value)
{
    value.Empty();
    if (m_pSource && m_lCurrentRow >= 0 && col >= 0 && col < NumCols())
        m_pSource->GetValue(m_lCurrentRow, col, value);
}

void CQoOutputSourceInputFilter::Init(CQoString const &name)
{
    m_lCurrentRow = -1;
}
