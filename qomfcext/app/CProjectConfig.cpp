#include "CProjectConfig.h"

namespace {

CString Safe(const char* psz) { return CString(psz != nullptr ? psz : ""); }

// Appends a backslash unless the text already ends in one (an empty text
// stays empty: an empty project name adds no folder).
void EndWithBackslash(CString& str)
{
    if (!str.IsEmpty() && str[str.GetLength() - 1] != '\\')
        str += '\\';
}

}  // namespace

CProjectConfig::CProjectConfig(const char* pszDirectory, const char* pszName, const char* pszFileName)
    : m_strName(Safe(pszName)), m_strFileName(Safe(pszFileName)), m_strDirectory(Safe(pszDirectory))
{
}

CProjectConfig::~CProjectConfig() {}

void CProjectConfig::SetName(const CString& strName) { m_strName = strName; }

void CProjectConfig::SetDirectory(const CString& strDirectory) { m_strDirectory = strDirectory; }

CString CProjectConfig::GetConfigFilePath() const
{
    if (m_strDirectory.IsEmpty())
        return CString();
    CString strPath = m_strDirectory;
    EndWithBackslash(strPath);
    strPath += m_strName;
    EndWithBackslash(strPath);
    strPath += m_strFileName;
    return strPath;
}

bool CProjectConfig::ReadConfigFile()
{
    CString strPath = GetConfigFilePath();
    return !strPath.IsEmpty() && m_config.Open(strPath);
}

bool CProjectConfig::WriteConfigFile()
{
    CString strPath = GetConfigFilePath();
    return !strPath.IsEmpty() && m_config.Write(strPath);
}

void CProjectConfig::GetValue(const char* pszSection, const char* pszKey, CString& value) const
{
    CQoString text;
    m_config.GetValue(pszSection, pszKey, text);
    value = CString(text.GetString(), text.GetLength());
}

void CProjectConfig::GetValue(const char* pszSection, const char* pszKey, int& value) const
{
    m_config.GetValue(pszSection, pszKey, value);
}

void CProjectConfig::SetValue(const char* pszSection, const char* pszKey, const char* pszValue)
{
    m_config.SetValue(pszSection, pszKey, pszValue != nullptr ? pszValue : "");
}

void CProjectConfig::SetValue(const char* pszSection, const char* pszKey, int nValue)
{
    m_config.SetValue(pszSection, pszKey, nValue);
}

void CProjectConfig::DeleteKey(const char* pszSection, const char* pszKey) { m_config.DeleteKey(pszSection, pszKey); }

void CProjectConfig::DeleteSection(const char* pszSection) { m_config.DeleteSection(pszSection); }

void CProjectConfig::Clear() { m_config.Clear(); }

void CProjectConfig::CopySection(const CProjectConfig* pOther, const char* pszSection)
{
    if (pOther != nullptr)
        m_config.CopySection(pOther->m_config, pszSection);
}
