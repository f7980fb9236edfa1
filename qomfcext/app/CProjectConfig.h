// CProjectConfig - the configuration file of one project, held in memory.
//
// An application keeps each conversion set-up as a project: a folder named
// after the project below a projects directory, with one configuration file in
// it. This class knows where that file lives (directory\name\file) and forwards
// reading, writing and key access to the base library's CQoConfigFile. Keys
// change in memory only; nothing reaches the disk before WriteConfigFile, which
// replaces the file in one step (a failed write leaves the old file whole and
// answers false).
//
//     CProjectConfig project("C:\\Projekte", "Kunden", "projekt.cfg");
//     project.ReadConfigFile();                       // a missing file is empty
//     project.SetValue("Eingabe", "Datei", "kunden.txt");
//     if (!project.WriteConfigFile()) ReportNotSaved();
//
// An empty projects directory names no place: the file path is then empty, and
// reading and writing answer false instead of guessing a folder (the current
// folder changes with every file dialog). Nothing creates the project folder;
// writing into a missing folder answers false.
#pragma once

#include <afx.h>

#include "CQoConfigFile.h"
#include "QoMfcExtApi.h"

class QOMFCEXT_API CProjectConfig
{
public:
    CProjectConfig(const char* pszDirectory, const char* pszName, const char* pszFileName);
    virtual ~CProjectConfig();

    CProjectConfig(const CProjectConfig&) = default;
    CProjectConfig& operator=(const CProjectConfig&) = default;

    const CString& GetName() const { return m_strName; }
    void SetName(const CString& strName);
    const CString& GetDirectory() const { return m_strDirectory; }
    void SetDirectory(const CString& strDirectory);

    // For callers that read or write the configuration themselves (filters).
    CQoConfigFile& ConfigFile() { return m_config; }

    // Replaces the contents by the file's (a missing file gives an empty
    // configuration); false when the file cannot be read or has no path.
    bool ReadConfigFile();
    // Stores the contents; false when the file could not be written.
    bool WriteConfigFile();

    // A missing text key empties `value`; a missing (or not numeric) int key
    // leaves `value` as it was.
    void GetValue(const char* pszSection, const char* pszKey, CString& value) const;
    void GetValue(const char* pszSection, const char* pszKey, int& value) const;
    void SetValue(const char* pszSection, const char* pszKey, const char* pszValue);
    void SetValue(const char* pszSection, const char* pszKey, int nValue);
    void DeleteKey(const char* pszSection, const char* pszKey);
    void DeleteSection(const char* pszSection);
    void Clear();
    // Makes this project's section a copy of the other's; null does nothing.
    void CopySection(const CProjectConfig* pOther, const char* pszSection);

protected:
    // directory\name\file, built anew on each call; empty without a directory.
    CString GetConfigFilePath() const;

private:
    CString m_strName;
    CQoConfigFile m_config;
    CString m_strFileName;
    CString m_strDirectory;
};
