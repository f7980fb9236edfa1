// CConversion - one conversion job of the sample program: read the records
// of a text file in one character set and write them in another.
//
// The job's settings live in the project's configuration file (section
// "Eingabe" and "Ausgabe"), so that a project converts the same way
// interactively and from the command line.
#pragma once

#include <CQoConfigFile.h>
#include <CQoString.h>

class CConversion
{
public:
    // The character sets as the pages offer them: Windows Ansi, DOS Ascii, Ansi/Ascii.
    enum { charsetAnsi = 0, charsetAscii = 1, charsetMixed = 2 };

    CConversion();

    // Raises CQoException for a character set the program does not know.
    void ReadConfig(CQoConfigFile& config);
    void WriteConfig(CQoConfigFile& config) const;

    // Converts every record; returns the number of records written. Raises
    // CQoException when a file cannot be opened, read or written, or when
    // the output is the input. The target is replaced only by a complete
    // output.
    long Run();

    CQoString m_inputFile;
    int m_inputCharset;
    CQoString m_outputFile;
    int m_outputCharset;

private:
    static int FileMode(int charset);
    static void ReadCharset(CQoConfigFile& config, const char* section, int& charset);
};
