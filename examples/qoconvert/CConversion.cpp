#include "CConversion.h"

#include <CQoException.h>
#include <CQoFile.h>

namespace {
const char kInput[] = "Eingabe";
const char kOutput[] = "Ausgabe";
}

CConversion::CConversion()
    : m_inputCharset(charsetAnsi), m_outputCharset(charsetAnsi)
{
}

void CConversion::ReadConfig(CQoConfigFile& config)
{
    config.GetValue(kInput, "Datei", m_inputFile);
    ReadCharset(config, kInput, m_inputCharset);
    config.GetValue(kOutput, "Datei", m_outputFile);
    ReadCharset(config, kOutput, m_outputCharset);
}

void CConversion::ReadCharset(CQoConfigFile& config, const char* section, int& charset)
{
    CQoString text;
    if (!config.GetValue(section, "Zeichensatz", text))
        return;
    // A value the program does not know must not turn into Windows Ansi
    // silently: the converted file would be wrong without a word.
    int value = -1;
    if (!config.GetValue(section, "Zeichensatz", value) || value < charsetAnsi || value > charsetMixed) {
        CQoString message;
        message.Format("Unbekannter Zeichensatz '%s' in [%s] (erlaubt: 0 Windows Ansi, 1 DOS Ascii, 2 Ansi/Ascii).",
                       (const char*)text, section);
        CQoException::Throw(message, "Zeichensatz");
    }
    charset = value;
}

void CConversion::WriteConfig(CQoConfigFile& config) const
{
    config.SetValue(kInput, "Datei", m_inputFile);
    config.SetValue(kInput, "Zeichensatz", m_inputCharset);
    config.SetValue(kOutput, "Datei", m_outputFile);
    config.SetValue(kOutput, "Zeichensatz", m_outputCharset);
}

int CConversion::FileMode(int charset)
{
    switch (charset) {
    case charsetAscii: return CQoFile::ascii;
    case charsetMixed: return CQoFile::ansimix;
    default:           return CQoFile::ansi;
    }
}

long CConversion::Run()
{
    // Writing over the input would destroy it before it is read: the same
    // file under another spelling (case, "..", "./") counts as the same.
    if (CQoFile::SameFile(m_inputFile, m_outputFile)) {
        CQoString text;
        text.Format("Die Ausgabedatei '%s' ist die Eingabedatei '%s'; sie w\xFCrde \xFC" "berschrieben.",
                    (const char*)m_outputFile, (const char*)m_inputFile);
        CQoException::Throw(text, "CConversion::Run");
    }
    CQoFile input;
    if (!input.Open(m_inputFile, CQoFile::read | FileMode(m_inputCharset))) {
        CQoString text;
        text.Format("Die Eingabedatei '%s' kann nicht ge\xF6" "ffnet werden.", (const char*)m_inputFile);
        CQoException::Throw(text, "CConversion::Run");
    }

    // The output is written beside the target and takes its place only when
    // complete: a stopped run or a full disk leaves the previous output.
    std::string temp = CQoFile::NewTempFileBeside(m_outputFile);
    CQoFile output;
    if (temp.empty() || !output.Open(temp.c_str(), CQoFile::write | CQoFile::create | FileMode(m_outputCharset))) {
        if (!temp.empty())
            CQoFile::Remove(temp.c_str());
        CQoString text;
        text.Format("Die Ausgabedatei '%s' kann nicht angelegt werden.", (const char*)m_outputFile);
        CQoException::Throw(text, "CConversion::Run");
    }

    long records = 0;
    try {
        CQoString line;
        while (input.ReadString(line)) {
            line += "\r\n";
            output.Write(line);
            ++records;
        }
        output.Flush(true);
        output.Close();
    } catch (...) {
        try {
            output.Close();
        } catch (const CQoException&) {
            // the write already failed; that error is the one to report
        }
        CQoFile::Remove(temp.c_str());
        throw;
    }
    input.Close();
    if (!CQoFile::MoveOver(temp.c_str(), m_outputFile)) {
        CQoFile::Remove(temp.c_str());
        CQoString text;
        text.Format("Die Ausgabedatei '%s' kann nicht ersetzt werden.", (const char*)m_outputFile);
        CQoException::Throw(text, "CConversion::Run");
    }
    return records;
}
