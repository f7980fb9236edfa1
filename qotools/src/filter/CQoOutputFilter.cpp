// The output filter's column names, current row and file handling.
#include "CQoOutputFilter.h"

#include "CQoConfigFile.h"
#include "CQoException.h"
#include "CQoFile.h"
#include "QoLimits.h"

CQoOutputFilter::CQoOutputFilter()
    : m_nFileCharSet(CQoFile::ansi)
{
}

CQoOutputFilter::~CQoOutputFilter()
{
    // A derived filter has released its file already; closing here only
    // guards against a filter destroyed in the middle of writing. Errors
    // cannot leave a destructor.
    if (m_pFile && m_bCloseOnRelease) {
        try {
            m_pFile->Close();
        } catch (CQoException const &) {
        }
    }
}

void CQoOutputFilter::CheckColumn(int col) const
{
    if (col < 0 || col >= static_cast<int>(m_columnNames.size())) {
        CQoString where;
        where.Format("Spalte %d", col);
        CQoException::Throw(CQoException::indexError, where);
    }
}

bool CQoOutputFilter::WriteHeader(CQoString *text)
{
    if (text)
        text->Empty();
    return true;
}

void CQoOutputFilter::ColumnName(int col, CQoString const &name)
{
    CheckColumn(col);
    m_columnNames[col] = name;
}

void CQoOutputFilter::GetColumnName(int col, CQoString &name)
{
    CheckColumn(col);
    name = m_columnNames[col];
}

void CQoOutputFilter::Value(int col, CQoString const &value)
{
    CheckColumn(col);
    m_values[col] = value;
}

void CQoOutputFilter::InitRow()
{
    for (CQoString &value : m_values)
        value.Empty();
}

void CQoOutputFilter::NumCols(int cols)
{
    if (cols < 0)
        cols = 0;
    qolimits::Checked("columns", cols, 0, qolimits::maxColumns);
    m_columnNames.resize(cols);
    m_values.resize(cols);
}

int CQoOutputFilter::NumCols() const
{
    return static_cast<int>(m_columnNames.size());
}

void CQoOutputFilter::UseFile(CQoFile *file, bool closeOnRelease)
{
    if (m_pFile && m_pFile != file)
        ReleaseFile();
    m_pFile = file;
    m_bCloseOnRelease = closeOnRelease;
    m_llWroteBytes = 0;
    if (m_pFile)
        m_pFile->FileCharSet(m_nFileCharSet);
}

void CQoOutputFilter::ReleaseFile()
{
    CQoFile *file = m_pFile;
    bool close = m_bCloseOnRelease;
    m_pFile = nullptr;
    m_bCloseOnRelease = false;
    if (!file || !file->IsOpen())
        return;
    if (close)
        file->Close();
    else
        file->Flush();
}

int CQoOutputFilter::FileCharSet() const
{
    return m_nFileCharSet;
}

void CQoOutputFilter::FileCharSet(int charSet)
{
    if (charSet != CQoFile::ansi && charSet != CQoFile::ascii && charSet != CQoFile::ansimix)
        return;
    m_nFileCharSet = charSet;
    if (m_pFile)
        m_pFile->FileCharSet(charSet);
}

void CQoOutputFilter::WriteConfig(CQoConfigFile &cfg, CQoString const &section)
{
    cfg.SetValue(section, "charset", m_nFileCharSet);
    cfg.SetValue(section, "columns", NumCols());
    CQoString key;
    for (int c = 0; c < NumCols(); ++c) {
        key.Format("column%d_name", c);
        cfg.SetValue(section, key, m_columnNames[c]);
    }
}

void CQoOutputFilter::ReadConfig(CQoConfigFile &cfg, CQoString const &section)
{
    int charSet = m_nFileCharSet;
    if (cfg.GetValue(section, "charset", charSet))
        FileCharSet(charSet);
    int cols = NumCols();
    if (cfg.GetValue(section, "columns", cols, 0, qolimits::maxColumns))
        NumCols(cols);
    CQoString key;
    for (int c = 0; c < NumCols(); ++c) {
        key.Format("column%d_name", c);
        cfg.GetValue(section, key, m_columnNames[c]);
    }
}

long long CQoOutputFilter::wroteBytes() const
{
    return m_llWroteBytes;
}

void CQoOutputFilter::WriteToFile(char const *data, std::size_t length)
{
    if (!m_pFile || !m_pFile->IsOpen())
        CQoException::Throw(CQoException::notOpen, nullptr);
    m_pFile->Write(data, length);
    m_llWroteBytes += static_cast<long long>(length);
}
