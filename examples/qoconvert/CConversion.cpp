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
    config.GetValue(kInput, "Zeichensatz", m_inputCharset);
    config.GetValue(kOutput, "Datei", m_outputFile);
    config.GetValue(kOutput, "Zeichensatz", m_outputCharset);
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
    CQoFile input;
    if (!input.Open(m_inputFile, CQoFile::read | FileMode(m_inputCharset))) {
        CQoString text;
        text.Format("Die Eingabedatei '%s' kann nicht ge\xF6" "ffnet werden.", (const char*)m_inputFile);
        CQoException::Throw(text, "CConversion::Run");
    }
    CQoFile output;
    if (!output.Open(m_outputFile, CQoFile::write | CQoFile::create | FileMode(m_outputCharset))) {
        CQoString text;
        text.Format("Die Ausgabedatei '%s' kann nicht angelegt werden.", (const char*)m_outputFile);
        CQoException::Throw(text, "CConversion::Run");
    }

    long records = 0;
    CQoString line;
    while (input.ReadString(line)) {
        line += "\r\n";
        output.Write(line);
        ++records;
    }
    output.Close();
    input.Close();
    return records;
}
